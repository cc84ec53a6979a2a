// The export writers: exact FASTA/raw bytes, and flat files that read back field for field.

#include <gtest/gtest.h>

#include "ImportTestFiles.h"
#include "export/SequenceWriters.h"
#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/Recognise.h"

namespace {

CMolList Import(const std::string& path, int type) {
    CMolList list(type);
    CRecordingPrompt prompt;
    EXPECT_TRUE(list.AddFile(path, prompt)) << path;
    EXPECT_TRUE(prompt.Messages().empty());
    return list;
}

std::string ExportAll(const CMolList& list, int filter) {
    std::vector<const CSxMol*> molecules;
    for (int i = 0; i < list.Count(); ++i)
        molecules.push_back(list.At(i));
    return ExportMolecules(molecules, filter);
}

// Writes the list with `filter` and imports the result again.
CMolList RoundTrip(const CMolList& list, int filter, const std::string& name) {
    CScratchDir dir;
    std::string text = ExportAll(list, filter);
    return Import(dir.Write(name, text), list.MolType());
}

void ExpectSameMolecules(const CMolList& expected, const CMolList& actual, bool sameDatabase) {
    ASSERT_EQ(actual.Count(), expected.Count());
    for (int i = 0; i < expected.Count(); ++i) {
        const CSxMol& a = *expected.At(i);
        CSxMol b = *actual.At(i);
        EXPECT_EQ(b.Name(), a.Name());
        EXPECT_EQ(b.Sequence(), a.Sequence());
        EXPECT_EQ(b.IsLinear(), a.IsLinear());
        EXPECT_EQ(b.Creator(), a.Creator());
        EXPECT_EQ(b.Modifier(), a.Modifier());
        // Each reader labels the entry with its own database.
        if (!sameDatabase)
            b.Description().database = a.Description().database;
        const CSxDescription& x = a.Description();
        const CSxDescription& y = b.Description();
        EXPECT_EQ(y.definition, x.definition);
        EXPECT_EQ(y.accessions, x.accessions);
        EXPECT_EQ(y.keywords, x.keywords);
        EXPECT_EQ(y.database, x.database);
        EXPECT_EQ(y.division, x.division);
        EXPECT_EQ(y.moleculeType, x.moleculeType);
        EXPECT_EQ(y.dbDate, x.dbDate);
        EXPECT_EQ(y.sequenceSource, x.sequenceSource);
        EXPECT_EQ(y.organism, x.organism);
        EXPECT_EQ(y.taxonomy, x.taxonomy);
        EXPECT_EQ(y.dbLinks, x.dbLinks);
        EXPECT_EQ(y.comments, x.comments);
        EXPECT_EQ(y.references, x.references);
        EXPECT_EQ(y.features, x.features);
        EXPECT_TRUE(y == x) << a.Name();
    }
}

CSxMol Molecule(int kind, const std::string& name, const std::string& sequence) {
    CSxMol molecule(kind);
    molecule.SetName(name);
    molecule.SetSequence(sequence);
    return molecule;
}

TEST(ExportFasta, ExactBytes) {
    CSxMol protein = Molecule(kKindProtein, "my protein", std::string(75, 'm') + "kw");
    std::string out;
    WriteFasta(protein, out);
    EXPECT_EQ(out, ">my\\protein\r\n" + std::string(70, 'M') + "\r\nMMMMMKW\r\n\r\n");

    CSxMol nucleic = Molecule(kKindNucleic, "n", "ACGT");
    out.clear();
    WriteFasta(nucleic, out);
    WriteRaw(nucleic, out);
    WriteRaw(protein, out);
    EXPECT_EQ(out, ">n\r\nacgt\r\n\r\nacgt\r\n" + std::string(75, 'M') + "KW\r\n");
}

TEST(ExportFasta, FilterChoosesTheWriter) {
    CSxMol a = Molecule(kKindProtein, "a", "mk");
    CSxMol b = Molecule(kKindProtein, "b", "ww");
    EXPECT_EQ(ExportMolecules({&a, &b}, kExportRaw), "MK\r\nWW\r\n");
    EXPECT_EQ(ExportMolecules({&a}, kExportFasta), ">a\r\nMK\r\n\r\n");
    EXPECT_EQ(ExportMolecules({&a}, 0), "");
    EXPECT_EQ(ExportMolecules({&a}, 5), "");
    EXPECT_EQ(ExportMolecules({&a}, kExportFlatFile).substr(0, 5), "LOCUS");
    EXPECT_EQ(ExportMolecules({&a}, kExportSwissEmbl).substr(0, 5), "ID   ");
}

TEST(ExportFlatFiles, SwissProtReadsBackAsGenPeptAndSwissProt) {
    CMolList swiss = Import(SequenceFixture("swissprot_globins.txt"), kTypeProtein);
    ASSERT_EQ(swiss.Count(), 3);
    ExpectSameMolecules(swiss, RoundTrip(swiss, kExportFlatFile, "out.gp"), false);
    ExpectSameMolecules(swiss, RoundTrip(swiss, kExportSwissEmbl, "out.txt"), true);
}

TEST(ExportFlatFiles, OtherLayoutsReadBack) {
    CMolList genpept = Import(SequenceFixture("genpept_globin.gp"), kTypeProtein);
    ExpectSameMolecules(genpept, RoundTrip(genpept, kExportFlatFile, "o.gp"), true);
    CMolList old = Import(SequenceFixture("swissprot_oldstyle.txt"), kTypeProtein);
    ExpectSameMolecules(old, RoundTrip(old, kExportSwissEmbl, "o.sw"), true);
    CMolList genbank = Import(SequenceFixture("genbank_nucleic.gb"), kTypeNucleic);
    ExpectSameMolecules(genbank, RoundTrip(genbank, kExportFlatFile, "o.gb"), true);
    CMolList embl = Import(SequenceFixture("embl_nucleic.embl"), kTypeNucleic);
    ExpectSameMolecules(embl, RoundTrip(embl, kExportSwissEmbl, "o.embl"), true);
}

TEST(ExportFlatFiles, StampsAndAwkwardTextsSurvive) {
    CSxMol molecule = Molecule(kKindProtein, "odd name", "mkvl");
    molecule.Creator() = {"Alice", "01/02/2003 10:00"};
    molecule.Modifier() = {"Bob|\"quoted\"", ""};
    CSxDescription& desc = molecule.Description();
    desc.definition = std::string(300, 'x') + " short words after a long one";
    desc.comments = {"", "  indented", "@not data"};
    CSxFeature feature;
    feature.key = "VERYLONGFEATUREKEY";
    feature.SetLocation("join(" + std::string(70, '1') + "..2,3..4)");
    feature.qualifiers = {{"note", "/starts with a slash \"and\" quotes", true, true},
                          {"translation", std::string(130, 'M'), true, true},
                          {"flag", "", false, false}};
    desc.features = {feature};
    CSxReference reference;
    reference.number = 3;
    reference.title = "Title";
    desc.references = {reference};

    for (int filter : {kExportFlatFile, kExportSwissEmbl}) {
        std::string text = ExportMolecules({&molecule}, filter);
        CSxStream stream(text);
        CRecognition recognition = Recognise(stream);
        EXPECT_EQ(recognition.type, kTypeProtein);
        stream.Rewind();
        CSxMol read(kKindProtein);
        ASSERT_EQ(ReadMolecule(recognition.format, read, stream), kReadOne) << text;
        EXPECT_EQ(read.Name(), "odd name");
        EXPECT_EQ(read.Creator(), molecule.Creator());
        EXPECT_EQ(read.Modifier(), molecule.Modifier());
        EXPECT_EQ(read.Description().definition, desc.definition);
        EXPECT_EQ(read.Description().comments, desc.comments);
        EXPECT_EQ(read.Description().features, desc.features) << text;
        EXPECT_EQ(read.Description().references, desc.references);
    }
}

}  // namespace
