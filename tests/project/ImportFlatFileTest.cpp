// The GenBank/GenPept and EMBL/SWISS-PROT readers on entries in the databases' layouts.

#include <gtest/gtest.h>

#include "ImportTestFiles.h"
#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/Recognise.h"
#include "import/SuiteData.h"

namespace {

using Strings = std::vector<std::string>;

std::vector<CSxMol> ReadFile(int format, int kind, const std::string& path, int* lastResult) {
    CSxStream stream = CSxStream::FromFile(path);
    std::vector<CSxMol> molecules;
    for (;;) {
        CSxMol molecule(kind);
        int result = ReadMolecule(format, molecule, stream);
        if (result != kReadOne) {
            *lastResult = result;
            return molecules;
        }
        molecules.push_back(molecule);
    }
}

int ReadText(int format, int kind, const std::string& text, CSxMol* molecule = nullptr) {
    CSxStream stream(text);
    CSxMol scratch(kind);
    CSxMol& target = molecule ? *molecule : scratch;
    return ReadMolecule(format, target, stream);
}

TEST(ImportGenBankReader, ReadsEveryAnnotationSection) {
    int last = 0;
    std::vector<CSxMol> molecules =
        ReadFile(kFormatGenBank, kKindNucleic, SequenceFixture("genbank_nucleic.gb"), &last);
    EXPECT_EQ(last, kNoMoreRecords);
    ASSERT_EQ(molecules.size(), 2u);

    const CSxMol& first = molecules[0];
    const CSxDescription& desc = first.Description();
    EXPECT_EQ(first.Name(), "SYNGLOB1");
    EXPECT_EQ(first.SequenceLength(), 126);
    EXPECT_EQ(first.Sequence().substr(0, 12), "atggtgctgtct");
    EXPECT_TRUE(first.IsLinear());
    EXPECT_EQ(desc.database, "GenBank");
    EXPECT_EQ(desc.moleculeType, "mRNA");
    EXPECT_EQ(desc.division, "SYN");
    EXPECT_EQ(desc.dbDate, "15-MAR-2021");
    EXPECT_EQ(desc.definition,
              "Synthetic construct globin fragment mRNA, partial cds, made for reader tests.");
    EXPECT_EQ(desc.accessions, (Strings{"TB000001", "TB000002"}));
    EXPECT_EQ(desc.keywords, (Strings{"globin", "test construct"}));
    EXPECT_EQ(desc.sequenceSource, "synthetic construct");
    EXPECT_EQ(desc.organism, "synthetic construct");
    EXPECT_EQ(desc.taxonomy, (Strings{"other sequences", "artificial sequences"}));
    EXPECT_EQ(desc.comments,
              (Strings{"First comment line.", "", "Third comment line after an empty one."}));

    ASSERT_EQ(desc.references.size(), 2u);
    EXPECT_EQ(desc.references[0].number, 1);
    EXPECT_EQ(desc.references[0].positions, "(bases 1 to 126)");
    EXPECT_EQ(desc.references[0].authors, "Doe,J., Roe,R. and Moe,M.");
    EXPECT_EQ(desc.references[0].title,
              "A hand-made entry for testing flat file readers with a title that runs over two "
              "lines");
    EXPECT_EQ(desc.references[0].journal, "Unpublished");
    EXPECT_EQ(desc.references[1].pubmed, "12345678");
    EXPECT_EQ(desc.references[1].comment, "Second reference with a remark.");

    ASSERT_EQ(desc.features.size(), 3u);
    const CSxFeature& cds = desc.features[1];
    EXPECT_EQ(cds.key, "CDS");
    EXPECT_EQ(cds.location, "join(1..30,41..70,81..126)");
    EXPECT_EQ(cds.start, 1);
    EXPECT_EQ(cds.end, 126);
    EXPECT_FALSE(cds.complement);
    ASSERT_EQ(cds.qualifiers.size(), 4u);
    EXPECT_EQ(cds.qualifiers[0].name, "codon_start");
    EXPECT_EQ(cds.qualifiers[0].value, "1");
    EXPECT_FALSE(cds.qualifiers[0].quoted);
    EXPECT_EQ(cds.qualifiers[1].value,
              "globin fragment with a \"quoted\" word in a long product name");
    EXPECT_FALSE(cds.qualifiers[2].hasValue);
    EXPECT_EQ(cds.qualifiers[3].value, "MVLSPADKTNVKAAWGKVGAHAGEYGAEALERMFLSFPTTKTYFPHF");
    const CSxFeature& misc = desc.features[2];
    EXPECT_TRUE(misc.complement);
    EXPECT_EQ(misc.start, 5);
    EXPECT_EQ(misc.end, 20);

    EXPECT_FALSE(molecules[1].IsLinear());
    EXPECT_TRUE(molecules[1].Description().keywords.empty());
    EXPECT_EQ(molecules[1].SequenceLength(), 40);
}

TEST(ImportGenBankReader, GenPeptEntry) {
    int last = 0;
    std::vector<CSxMol> molecules =
        ReadFile(kFormatGenBank, kKindProtein, SequenceFixture("genpept_globin.gp"), &last);
    ASSERT_EQ(molecules.size(), 1u);
    const CSxDescription& desc = molecules[0].Description();
    EXPECT_EQ(desc.database, "GenPept");
    EXPECT_EQ(molecules[0].ProteinClass(), 2);
    EXPECT_EQ(molecules[0].SequenceLength(), 153);
    EXPECT_EQ(desc.dbLinks,
              (Strings{"UniProtKB: locus MYG_PROGU, accession P02170;", "class: standard."}));
    EXPECT_EQ(desc.organism, "Procavia capensis");
    EXPECT_EQ(desc.taxonomy.back(), "Procavia");
    EXPECT_EQ(desc.taxonomy.size(), 12u);
    EXPECT_EQ(desc.references[0].journal,
              "Philos. Trans. R. Soc. Lond., B, Biol. Sci. 283 (995), 61-163 (1978)");
    EXPECT_EQ(desc.references[0].medline, "78221372");
    EXPECT_EQ(desc.references[0].pubmed, "27799");
    EXPECT_EQ(desc.features[2].qualifiers[1].value, "Globin; pfam00042");
}

TEST(ImportGenBankReader, ResultCodes) {
    // The LOCUS line's words against the molecule's kind.
    EXPECT_EQ(ReadText(kFormatGenBank, kKindNucleic, "LOCUS  X  5 aa\nORIGIN\n 1 mkvla\n//\n"),
              kProteinNotNucleic);
    EXPECT_EQ(ReadText(kFormatGenBank, kKindProtein, "LOCUS  X  5 bp\nORIGIN\n 1 acgta\n//\n"),
              kNucleicNotProtein);
    EXPECT_EQ(ReadText(kFormatGenBank, kKindProtein, "LOCUS\nORIGIN\n 1 mkvla\n//\n"), kNoName);
    EXPECT_EQ(ReadText(kFormatGenBank, kKindProtein, "LOCUS  X  5 aa\nDEFINITION x.\n//\n"),
              kNoSequence);
    EXPECT_EQ(ReadText(kFormatGenBank, kKindProtein, "DEFINITION x.\n"), kNoMoreRecords);
    // Sequence lines: numbers and blanks are left out, wherever they stand.
    CSxMol molecule(kKindProtein);
    EXPECT_EQ(ReadText(kFormatGenBank, kKindProtein,
                       "LOCUS  X\\Y  5 aa\nORIGIN\n 1 mkv la 7 ww\n 9 GG\n", &molecule),
              kReadOne);
    EXPECT_EQ(molecule.Sequence(), "mkvlawwgg");
    EXPECT_EQ(molecule.Name(), "X Y");
}

TEST(ImportGenBankReader, EntriesWithoutSeparatorAndDamagedSuiteData) {
    CSxStream stream("LOCUS  A 2 aa\nORIGIN\n 1 mk\nLOCUS  B 2 aa\nORIGIN\n 1 ww\n//\n");
    CSxMol a(kKindProtein), b(kKindProtein);
    EXPECT_EQ(ReadGenBank(a, stream), kReadOne);
    EXPECT_EQ(ReadGenBank(b, stream), kReadOne);
    EXPECT_EQ(b.Name(), "B");
    EXPECT_EQ(b.Sequence(), "ww");

    std::string damaged = "LOCUS  A 2 aa\nCOMMENT     " + std::string(kSuiteDataMarker) +
                          " 07ZZ\nORIGIN\n 1 mk\n//\n";
    EXPECT_EQ(ReadText(kFormatGenBank, kKindProtein, damaged), kBadSuiteData);
    std::string truncated = "LOCUS  A 2 aa\nCOMMENT     " + std::string(kSuiteDataMarker) +
                            " 0700\nORIGIN\n 1 mk\n//\n";
    EXPECT_EQ(ReadText(kFormatGenBank, kKindProtein, truncated), kBadSuiteData);
}

TEST(ImportEmblReader, SwissProtEntries) {
    int last = 0;
    std::vector<CSxMol> molecules =
        ReadFile(kFormatEmbl, kKindProtein, SequenceFixture("swissprot_globins.txt"), &last);
    EXPECT_EQ(last, kNoMoreRecords);
    ASSERT_EQ(molecules.size(), 3u);
    const CSxDescription& desc = molecules[0].Description();
    EXPECT_EQ(desc.database, "SWISS-PROT");
    EXPECT_EQ(desc.accessions, (Strings{"P68082", "P02188", "Q9TRK7"}));
    EXPECT_EQ(desc.dbDate, "08-NOV-2023");
    EXPECT_EQ(desc.definition,
              "RecName: Full=Myoglobin; AltName: Full=Nitrite reductase MB; EC=1.7.-.-;");
    EXPECT_EQ(desc.organism, "Equus caballus (Horse)");
    EXPECT_EQ(desc.taxonomy.size(), 12u);
    EXPECT_EQ(desc.taxonomy.front(), "Eukaryota");
    EXPECT_EQ(desc.taxonomy.back(), "Equus");
    EXPECT_EQ(desc.keywords.size(), 9u);
    EXPECT_EQ(desc.keywords.back(), "Transport");
    EXPECT_EQ(desc.dbLinks.front(), "EMBL; X00371; CAA25099.1; -; mRNA.");
    EXPECT_EQ(desc.comments[1], "    oxygen and deliver it to muscle cells.");

    ASSERT_EQ(desc.references.size(), 2u);
    EXPECT_EQ(desc.references[0].positions, "PROTEIN SEQUENCE OF 2-154.");
    EXPECT_EQ(desc.references[0].comment, "TISSUE=Skeletal muscle;");
    EXPECT_EQ(desc.references[0].pubmed, "5820667");
    EXPECT_EQ(desc.references[0].authors, "Dautrevaux M., Boulanger Y., Han K., Biserte G.");
    EXPECT_EQ(desc.references[0].title, "Covalent structure of horse myoglobin.");
    EXPECT_EQ(desc.references[1].medline, "90318245");
    EXPECT_EQ(desc.references[1].pubmed, "2372837");
    EXPECT_EQ(desc.references[1].title,
              "High-resolution study of the three-dimensional structure of horse heart "
              "metmyoglobin.");

    ASSERT_EQ(desc.features.size(), 3u);
    EXPECT_EQ(desc.features[2].key, "BINDING");
    EXPECT_EQ(desc.features[2].start, 65);
    EXPECT_EQ(desc.features[2].end, 65);
    EXPECT_EQ(desc.features[2].qualifiers[2].value,
              "ECO:0000250|UniProtKB:P02144, ECO:0000269| PubMed:2372837");
}

TEST(ImportEmblReader, OlderSwissProtLayout) {
    int last = 0;
    std::vector<CSxMol> molecules =
        ReadFile(kFormatEmbl, kKindProtein, SequenceFixture("swissprot_oldstyle.txt"), &last);
    ASSERT_EQ(molecules.size(), 1u);
    const CSxDescription& desc = molecules[0].Description();
    EXPECT_EQ(desc.dbDate, "01-FEB-1996");
    EXPECT_EQ(desc.references[0].medline, "76107290");
    ASSERT_EQ(desc.features.size(), 2u);
    EXPECT_EQ(desc.features[0].key, "METAL");
    EXPECT_EQ(desc.features[0].location, "93..93");
    EXPECT_EQ(desc.features[0].qualifiers[0].name, "note");
    EXPECT_EQ(desc.features[0].qualifiers[0].value,
              "IRON (PROXIMAL BINDING RESIDUE), WITH A LONG \"QUOTED\" DESCRIPTION.");
    EXPECT_EQ(desc.features[1].key, "MOD_RES");
    EXPECT_EQ(desc.features[1].qualifiers[0].value, "BLOCKED.");
}

TEST(ImportEmblReader, EmblNucleicEntry) {
    int last = 0;
    std::vector<CSxMol> molecules =
        ReadFile(kFormatEmbl, kKindNucleic, SequenceFixture("embl_nucleic.embl"), &last);
    ASSERT_EQ(molecules.size(), 1u);
    const CSxMol& molecule = molecules[0];
    EXPECT_EQ(molecule.Name(), "TB000010");
    EXPECT_FALSE(molecule.IsLinear());
    EXPECT_EQ(molecule.SequenceLength(), 70);
    EXPECT_EQ(molecule.Description().database, "EMBL");
    EXPECT_EQ(molecule.Description().moleculeType, "genomic DNA");
    EXPECT_EQ(molecule.Description().division, "SYN");
    EXPECT_EQ(molecule.Description().dbDate, "10-JUN-2021");
    EXPECT_EQ(molecule.Description().references[0].pubmed, "23456789");
    EXPECT_EQ(molecule.Description().references[0].title, "");
    EXPECT_EQ(molecule.Description().features[1].location, "complement(10..60)");
}

TEST(ImportEmblReader, ResultCodes) {
    EXPECT_EQ(ReadText(kFormatEmbl, kKindNucleic, "ID   X  STANDARD; PRT; 3 AA.\nSQ\n MKV\n//\n"),
              kProteinNotNucleic);
    EXPECT_EQ(ReadText(kFormatEmbl, kKindProtein, "ID   X; SV 1; linear; DNA; 3 BP.\nSQ\n acg\n"),
              kNucleicNotProtein);
    // A name that reads like a division or a type word is only a name.
    CSxMol named(kKindNucleic);
    ASSERT_EQ(ReadText(kFormatEmbl, kKindNucleic,
                       "ID   PRT; SV 1; linear; DNA; STD; SYN; 4 BP.\nSQ\n acgt\n//\n", &named),
              kReadOne);
    EXPECT_EQ(named.Name(), "PRT");
    EXPECT_EQ(named.Description().division, "SYN");
    // A piece with control characters is no molecule type: a writer would cut it short.
    ASSERT_EQ(ReadText(kFormatEmbl, kKindNucleic,
                       "ID   X; SV 1; DNA\x01"
                       "zz; STD; SYN; 4 BP.\nSQ\n acgt\n//\n",
                       &named),
              kReadOne);
    EXPECT_EQ(named.Description().moleculeType, "");
    // A type word with no blank after its ';' counts as well.
    EXPECT_EQ(ReadText(kFormatEmbl, kKindNucleic, "ID   X  STANDARD;PRT;3 AA.\nSQ\n MKV\n//\n"),
              kProteinNotNucleic);
    EXPECT_EQ(ReadText(kFormatEmbl, kKindProtein, "ID   ;\nSQ\n MKV\n//\n"), kNoName);
    EXPECT_EQ(ReadText(kFormatEmbl, kKindProtein, "ID   X\nDE   y\n//\n"), kNoSequence);
    EXPECT_EQ(ReadText(kFormatEmbl, kKindProtein, "DE   y\n"), kNoMoreRecords);
    std::string damaged = "ID   X\nCC   " + std::string(kSuiteDataMarker) + " 0\nSQ\n MK\n//\n";
    EXPECT_EQ(ReadText(kFormatEmbl, kKindProtein, damaged), kBadSuiteData);
}

TEST(ImportEmblReader, DateLinesGiveOnlyDates) {
    CSxMol molecule(kKindProtein);
    ASSERT_EQ(
        ReadText(kFormatEmbl, kKindProtein,
                 "ID   X PRT;\nDT   01-FEB-1996 (Rel. 33)\nDT   21xx DNA; 4 BP.\nSQ\n MK\n//\n",
                 &molecule),
        kReadOne);
    // The damaged last line is no date, and no header word of a file written from it.
    EXPECT_EQ(molecule.Description().dbDate, "");
    ASSERT_EQ(
        ReadText(kFormatEmbl, kKindProtein,
                 "ID   X PRT;\nDT   1-FEB-1996\nDT   01-FEB-1996, entry version 2.\nSQ\n MK\n",
                 &molecule),
        kReadOne);
    EXPECT_EQ(molecule.Description().dbDate, "01-FEB-1996");
}

}  // namespace
