// EMBL (nucleic acids) and SWISS-PROT (proteins) flat files.

#include <algorithm>
#include <cstdio>

#include "export/FlatFileWriter.h"
#include "export/SequenceWriters.h"
#include "import/SeqText.h"
#include "import/SuiteData.h"

namespace {

constexpr std::size_t kTextColumn = 5;

std::string Joined(const std::vector<std::string>& items, const std::string& glue) {
    std::string text;
    for (const std::string& item : items)
        text += (text.empty() ? "" : glue) + item;
    return text;
}

std::string IdLine(const CSxMol& molecule) {
    const CSxDescription& desc = molecule.Description();
    std::string name = molecule.Name();
    std::replace(name.begin(), name.end(), ' ', '\\');
    char text[256];
    if (molecule.Kind() == kKindProtein) {
        std::snprintf(text, sizeof text, "ID   %-12s STANDARD;      PRT; %5d AA.", name.c_str(),
                      molecule.SequenceLength());
    } else {
        std::snprintf(text, sizeof text, "ID   %s; SV 1; %s; %s; STD; %s; %d BP.", name.c_str(),
                      molecule.IsLinear() ? "linear" : "circular",
                      desc.moleculeType.empty() ? "DNA" : desc.moleculeType.c_str(),
                      desc.division.empty() ? "UNC" : desc.division.c_str(),
                      molecule.SequenceLength());
    }
    return text;
}

void WriteReference(CFlatFileWriter& writer, const CSxReference& reference) {
    writer.Line("RN   [" + std::to_string(reference.number) + "]");
    writer.Filled("RP", "RP", reference.positions);
    writer.Filled("RC", "RC", reference.comment);
    std::string crossReferences;
    if (!reference.medline.empty())
        crossReferences += "MEDLINE=" + reference.medline + ";";
    if (!reference.pubmed.empty()) {
        crossReferences +=
            (crossReferences.empty() ? "" : " ") + ("PubMed=" + reference.pubmed + ";");
    }
    writer.Filled("RX", "RX", crossReferences);
    if (!reference.authors.empty())
        writer.Filled("RA", "RA", reference.authors + ";");
    if (!reference.title.empty())
        writer.Filled("RT", "RT", "\"" + reference.title + "\";");
    writer.Filled("RL", "RL", reference.journal);
}

void WriteSequence(CFlatFileWriter& writer, const CSxMol& molecule) {
    const std::string& sequence = molecule.Sequence();
    bool protein = molecule.Kind() == kKindProtein;
    if (protein) {
        writer.Line("SQ   SEQUENCE " + std::to_string(sequence.size()) + " AA;");
    } else {
        writer.Line("SQ   Sequence " + std::to_string(sequence.size()) + " BP;");
    }
    std::vector<std::string> lines =
        SequenceBlocks(protein ? ToUpper(sequence) : ToLower(sequence));
    char text[128];
    for (std::size_t i = 0; i < lines.size(); ++i) {
        if (protein) {
            writer.Line("     " + lines[i]);
        } else {
            std::size_t end = std::min(sequence.size(), (i + 1) * 60);
            std::snprintf(text, sizeof text, "     %-66s%9zu", lines[i].c_str(), end);
            writer.Line(text);
        }
    }
}

}  // namespace

void WriteEmbl(const CSxMol& molecule, std::string& out) {
    const CSxDescription& desc = molecule.Description();
    CFlatFileWriter writer(out, kTextColumn);
    writer.Line(IdLine(molecule));
    writer.Filled("AC", "AC", desc.accessions.empty() ? "" : Joined(desc.accessions, "; ") + ";");
    if (!desc.dbDate.empty()) {
        bool protein = molecule.Kind() == kKindProtein;
        writer.Line("DT   " + desc.dbDate +
                    (protein ? ", entry version 1." : " (Rel. 1, Last updated, Version 1)"));
    }
    writer.Filled("DE", "DE", desc.definition);
    if (!desc.organism.empty())
        writer.Filled("OS", "OS", desc.organism + ".");
    if (!desc.taxonomy.empty())
        writer.Filled("OC", "OC", Joined(desc.taxonomy, "; ") + ".");
    for (const CSxReference& reference : desc.references)
        WriteReference(writer, reference);
    std::vector<std::string> comments = desc.comments;
    for (std::string& line : SuiteDataLines(molecule))
        comments.push_back(std::move(line));
    writer.Lines("CC", "CC", comments);
    writer.Lines("DR", "DR", desc.dbLinks);
    if (!desc.keywords.empty())
        writer.Filled("KW", "KW", Joined(desc.keywords, "; ") + ".");
    writer.Features("FT   ", desc.features);
    WriteSequence(writer, molecule);
    writer.Line("//");
}
