// GenBank (nucleic acids) and GenPept (proteins) flat files.

#include <algorithm>
#include <cstdio>

#include "export/FlatFileWriter.h"
#include "export/SequenceWriters.h"
#include "export/TextWrap.h"
#include "import/SeqText.h"
#include "import/SuiteData.h"

namespace {

constexpr std::size_t kTextColumn = 12;
const std::string kBlank;

std::string Joined(const std::vector<std::string>& items, const std::string& glue) {
    std::string text;
    for (const std::string& item : items)
        text += (text.empty() ? "" : glue) + item;
    return text;
}

std::string LocusLine(const CSxMol& molecule) {
    const CSxDescription& desc = molecule.Description();
    std::string name = molecule.Name();
    std::replace(name.begin(), name.end(), ' ', '\\');
    bool protein = molecule.Kind() == kKindProtein;
    char text[256];
    std::snprintf(text, sizeof text, "LOCUS       %-16s %11d %s", name.c_str(),
                  molecule.SequenceLength(), protein ? "aa" : "bp");
    std::string line = text;
    if (protein) {
        line += "            linear  ";
    } else {
        // LOCUS holds one word: "genomic DNA" is written as "DNA".
        std::string type = desc.moleculeType.substr(desc.moleculeType.find_last_of(' ') + 1);
        if (type.empty())
            type = "DNA";
        std::snprintf(text, sizeof text, "    %-7s %-8s", type.c_str(),
                      molecule.IsLinear() ? "linear" : "circular");
        line += text;
    }
    if (!desc.division.empty())
        line += " " + desc.division;
    if (!desc.dbDate.empty())
        line += " " + desc.dbDate;
    return line;
}

void WriteReference(CFlatFileWriter& writer, const CSxReference& reference) {
    std::string head = std::to_string(reference.number);
    if (!reference.positions.empty())
        head += "  " + reference.positions;
    writer.Filled("REFERENCE", kBlank, head);
    writer.Filled("  AUTHORS", kBlank, reference.authors);
    writer.Filled("  TITLE", kBlank, reference.title);
    writer.Filled("  JOURNAL", kBlank, reference.journal);
    writer.Filled("  MEDLINE", kBlank, reference.medline);
    writer.Filled("   PUBMED", kBlank, reference.pubmed);
    writer.Filled("  REMARK", kBlank, reference.comment);
}

void WriteSource(CFlatFileWriter& writer, const CSxDescription& desc) {
    writer.Filled("SOURCE", kBlank, desc.sequenceSource.empty() ? "." : desc.sequenceSource);
    if (desc.organism.empty() && desc.taxonomy.empty())
        return;
    writer.Line(writer.Padded("  ORGANISM") + desc.organism);
    if (!desc.taxonomy.empty()) {
        writer.Lines(kBlank, kBlank,
                     WrapWords(Joined(desc.taxonomy, "; ") + ".", 79 - kTextColumn));
    }
}

void WriteComments(CFlatFileWriter& writer, const CSxMol& molecule) {
    std::vector<std::string> lines = molecule.Description().comments;
    for (std::string& line : SuiteDataLines(molecule))
        lines.push_back(std::move(line));
    writer.Lines("COMMENT", kBlank, lines);
}

}  // namespace

void WriteGenBank(const CSxMol& molecule, std::string& out) {
    const CSxDescription& desc = molecule.Description();
    CFlatFileWriter writer(out, kTextColumn);
    writer.Line(LocusLine(molecule));
    writer.Filled("DEFINITION", kBlank, desc.definition, true);
    writer.Filled("ACCESSION", kBlank, Joined(desc.accessions, " "));
    writer.Lines("DBLINK", kBlank, desc.dbLinks);
    writer.Filled("KEYWORDS", kBlank, Joined(desc.keywords, "; ") + ".");
    WriteSource(writer, desc);
    for (const CSxReference& reference : desc.references)
        WriteReference(writer, reference);
    WriteComments(writer, molecule);
    if (!desc.features.empty()) {
        writer.Line("FEATURES             Location/Qualifiers");
        writer.Features("     ", desc.features);
    }
    writer.Line("ORIGIN");
    std::vector<std::string> lines = SequenceBlocks(ToLower(molecule.Sequence()));
    char number[16];
    for (std::size_t i = 0; i < lines.size(); ++i) {
        std::snprintf(number, sizeof number, "%9zu ", i * 60 + 1);
        writer.Line(number + lines[i]);
    }
    writer.Line("//");
}
