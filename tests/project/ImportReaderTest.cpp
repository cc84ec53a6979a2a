// The line reader, recognition, the content test and the individual readers.

#include <gtest/gtest.h>

#include "import/ImportResult.h"
#include "import/Readers.h"
#include "import/Recognise.h"
#include "import/SxStream.h"

namespace {

std::vector<std::string> AllLines(const std::string& data) {
    CSxStream stream(data);
    std::vector<std::string> lines;
    std::string line;
    while (stream.ReadLine(line))
        lines.push_back(line);
    return lines;
}

CRecognition RecogniseText(const std::string& text) {
    CSxStream stream(text);
    return Recognise(stream);
}

int ContentType(const std::string& text) {
    CSxStream stream(text);
    return TypeByContent(stream, {"//", ">"});
}

struct CReadResult {
    int result;
    CSxMol molecule;
    int line;
    int recordLine;
    int problemLine;
};

// Reads every record with one reader, as the import would.
std::vector<CReadResult> ReadAll(int format, int kind, const std::string& text) {
    CSxStream stream(text);
    std::vector<CReadResult> results;
    for (;;) {
        CSxMol molecule(kind);
        int result = ReadMolecule(format, molecule, stream);
        results.push_back(
            {result, molecule, stream.LineNumber(), stream.RecordLine(), stream.ProblemLine()});
        if (result != kReadOne || results.size() > 1000)
            return results;
    }
}

TEST(ImportLineReader, AcceptsEveryLineEnd) {
    using Lines = std::vector<std::string>;
    EXPECT_EQ(AllLines("a\nb\n"), (Lines{"a", "b"}));
    EXPECT_EQ(AllLines("a\rb\r"), (Lines{"a", "b"}));
    EXPECT_EQ(AllLines("a\r\nb\r\n"), (Lines{"a", "b"}));
    EXPECT_EQ(AllLines("a\n\rb\n\r"), (Lines{"a", "b"}));
    // A last line without an end is a line; empty lines between ends are lines too.
    EXPECT_EQ(AllLines("a\n\nb"), (Lines{"a", "", "b"}));
    EXPECT_EQ(AllLines("a\r\n\r\nb"), (Lines{"a", "", "b"}));
    EXPECT_EQ(AllLines("a\n\n\r\rb"), (Lines{"a", "", "", "b"}));
    EXPECT_EQ(AllLines(""), Lines{});
    EXPECT_EQ(AllLines("\n"), Lines{""});
    EXPECT_EQ(AllLines(std::string("x\0y\n", 4)), Lines{std::string("x\0y", 3)});
}

TEST(ImportLineReader, UnreadLineCountsOnce) {
    CSxStream stream("one\ntwo\nthree");
    std::string line;
    stream.ReadLine(line);
    stream.ReadLine(line);
    EXPECT_EQ(stream.LineNumber(), 2);
    stream.UnreadLine();
    stream.UnreadLine();  // only one line can be stepped back
    EXPECT_EQ(stream.LineNumber(), 1);
    ASSERT_TRUE(stream.ReadLine(line));
    EXPECT_EQ(line, "two");
    EXPECT_EQ(stream.LineNumber(), 2);
    stream.Rewind();
    ASSERT_TRUE(stream.ReadLine(line));
    EXPECT_EQ(line, "one");
    EXPECT_EQ(stream.LineNumber(), 1);
}

TEST(ImportRecognition, FormatsAndTypesFromHeaders) {
    CRecognition genpept = RecogniseText("LOCUS       X   12 aa  linear\nORIGIN\n");
    EXPECT_EQ(genpept.format, kFormatGenBank);
    EXPECT_EQ(genpept.type, kTypeProtein);
    EXPECT_EQ(RecogniseText("LOCUS  X  12 bp\n").type, kTypeNucleic);
    EXPECT_EQ(RecogniseText("LOCUS  X  12 BP\n").type, kTypeNucleic);
    EXPECT_EQ(RecogniseText("LOCUS  X  12 mRNA\n").type, kTypeNucleic);
    EXPECT_EQ(RecogniseText("LOCUS  X  circular\n").type, kTypeNucleic);
    // The name is not a type word, however it reads.
    EXPECT_EQ(RecogniseText("LOCUS  DNA\n").type, kTypeUnknown);
    // "ID   " wins over LOCUS on the same line.
    CRecognition embl = RecogniseText("ID   LOCUS_X  STANDARD; PRT; 20 AA.\n");
    EXPECT_EQ(embl.format, kFormatEmbl);
    EXPECT_EQ(embl.type, kTypeProtein);
    EXPECT_EQ(RecogniseText("junk\nID   X; SV 1; circular; DNA; STD; 3 BP.\n").type, kTypeNucleic);

    CRecognition suite = RecogniseText("header\n100|@551656AS34@|\n");
    EXPECT_EQ(suite.format, kFormatSuite);
    EXPECT_TRUE(suite.suiteFormat);
    EXPECT_EQ(suite.type, kTypeNucleic);
    EXPECT_EQ(RecogniseText("@752656AS34@\n").type, kTypeProtein);

    EXPECT_EQ(RecogniseText("12345 678\n").format, kFormatUnknown);
    EXPECT_EQ(RecogniseText("").type, kTypeUnknown);
}

TEST(ImportRecognition, SequenceDecidesWhenHeaderDoesNot) {
    // SWISS-PROT's "AA." is not a type word; the sequence after SQ decides.
    CRecognition swiss = RecogniseText(
        "ID   X_HUMAN   Reviewed;  10 AA.\nSQ   SEQUENCE 10 AA;\n     MKVLHE ACGT\n//\n");
    EXPECT_EQ(swiss.format, kFormatEmbl);
    EXPECT_EQ(swiss.type, kTypeProtein);
    EXPECT_EQ(RecogniseText("LOCUS  X\nORIGIN\n  1 acgtn acgu\n//\n").type, kTypeNucleic);
    // The GCG single-sequence header starts the sequence too.
    EXPECT_EQ(RecogniseText("LOCUS X\n x  Length: 4  Check: 1  Type: N ..\n acgt\n").type,
              kTypeNucleic);
    // No sequence section at all leaves the type open.
    EXPECT_EQ(RecogniseText("LOCUS  X\nDEFINITION y.\n").type, kTypeUnknown);
}

TEST(ImportRecognition, ContentTestLetsProteinWin) {
    EXPECT_EQ(ContentType("acgt acgt\nACGTN\n"), kTypeNucleic);
    EXPECT_EQ(ContentType("acgt\nMKW\nacgt acgt\n"), kTypeProtein);
    EXPECT_EQ(ContentType("MKW\nacgt\n"), kTypeProtein);
    // Numbers and the GCG header line are skipped; "0acgt" is no number.
    EXPECT_EQ(ContentType("1 acgt 61\n"), kTypeNucleic);
    EXPECT_EQ(ContentType("12MKW\n"), kTypeUnknown);
    EXPECT_EQ(ContentType("Length: 12 MKW\n"), kTypeUnknown);
    // A token with both u and t is neither nucleotide nor (without 'u' in the set) protein.
    EXPECT_EQ(ContentType("acgut\n"), kTypeUnknown);
    EXPECT_EQ(ContentType("acgu\n"), kTypeNucleic);
    // Reading stops at a stop marker.
    EXPECT_EQ(ContentType("acgt\n>next\nMKW\n"), kTypeNucleic);
    CRecognition fasta = RecogniseText(">a\nacgt\n>b\nMKWL\n");
    EXPECT_EQ(fasta.format, kFormatFasta);
    EXPECT_EQ(fasta.type, kTypeNucleic);
    // Records without residues are passed over; the first record with some decides.
    EXPECT_EQ(RecogniseText(">a\n>b\n\n12\n>c\nMKWL\n>d\nacgt\n").type, kTypeProtein);
    EXPECT_EQ(RecogniseText(">a\n\n>b\n").type, kTypeUnknown);
}

TEST(ImportFastaReader, ReadsRecordsAndNames) {
    std::string text =
        "\n\n>first desc\nMKV LAA\n12 GGH 34\n>  second;x\nWWW\n\n>\nPPP\n>a\\b|c\nKK\n"
        "tail>\nLL\n";
    std::vector<CReadResult> results = ReadAll(kFormatFasta, kKindProtein, text);
    ASSERT_EQ(results.size(), 6u);
    EXPECT_EQ(results[0].molecule.Name(), "first");
    EXPECT_EQ(results[0].molecule.Sequence(), "mkvlaaggh");
    EXPECT_EQ(results[0].molecule.SequenceLength(), 9);
    EXPECT_EQ(results[1].molecule.Name(), "second");
    EXPECT_EQ(results[2].molecule.Name(), "NONAME");
    EXPECT_EQ(results[3].molecule.Name(), "a b_c");
    // '>' as the last character of the line: no name.
    EXPECT_EQ(results[4].molecule.Name(), "NONAME");
    EXPECT_EQ(results[4].molecule.Sequence(), "ll");
    EXPECT_EQ(results[5].result, kNoMoreRecords);
    // Every header line was read once: the stream ends at the last line.
    EXPECT_EQ(results[5].line, 14);
}

TEST(ImportFastaReader, SoftEndings) {
    EXPECT_EQ(ReadAll(kFormatFasta, kKindProtein, "MKV\n")[0].result, kNoMoreRecords);
    EXPECT_EQ(ReadAll(kFormatFasta, kKindProtein, ">a\n>b\nMKV\n")[0].result, kNoSequence);
    // A blank line inside a record separates nothing.
    std::vector<CReadResult> blank = ReadAll(kFormatFasta, kKindProtein, ">a\n\nMKV\n\nW\n");
    EXPECT_EQ(blank[0].molecule.Sequence(), "mkvw");
    EXPECT_EQ(blank[1].result, kNoMoreRecords);
}

TEST(ImportRawReader, DropsSkippedCharactersAndChecksTheAlphabet) {
    std::vector<CReadResult> nucleic =
        ReadAll(kFormatRaw, kKindNucleic, "\n1 ACGU-acgt\t10\n  nn  \n\nGGCC\n");
    ASSERT_EQ(nucleic.size(), 3u);
    EXPECT_EQ(nucleic[0].molecule.Sequence(), "acguacgtnn");
    EXPECT_EQ(nucleic[0].molecule.Name(), "NONAME");
    EXPECT_EQ(nucleic[1].molecule.Sequence(), "ggcc");
    EXPECT_EQ(nucleic[2].result, kNoMoreRecords);

    // 'u' is no amino-acid letter: result 8 with the number of the line holding it, read to
    // the end of its block so that the next block is the next record.
    std::vector<CReadResult> protein =
        ReadAll(kFormatRaw, kKindProtein, "\nMKV\nLLA\nMKU\nUU\n\nWW\n");
    EXPECT_EQ(protein[0].result, kIllegalCharacter);
    EXPECT_EQ(protein[0].recordLine, 2);
    EXPECT_EQ(protein[0].problemLine, 4);
    EXPECT_EQ(protein[0].line, 6);
    EXPECT_EQ(ReadAll(kFormatRaw, kKindProtein, "BZX*\n")[0].molecule.Sequence(), "bzx*");
    EXPECT_EQ(ReadAll(kFormatRaw, kKindNucleic, "ACGT\fA\n")[0].result, kIllegalCharacter);
    EXPECT_EQ(ReadAll(kFormatRaw, kKindProtein, "123 456\n")[0].result, kNoSequence);
}

TEST(ImportSuiteTextReader, ReadsMoleculesUntilTheEndRecord) {
    std::string text =
        "100|@552656AS34@|\n212|FIRST|x\n213|A definition\n214|AC1\n209|MKV LA\n209|GG\n210|\n"
        "212|SECOND\n209|WW\n210\n207|\n212|AFTER\n209|KK\n210\n";
    std::vector<CReadResult> results = ReadAll(kFormatSuite, kKindProtein, text);
    ASSERT_EQ(results.size(), 3u);
    EXPECT_EQ(results[0].molecule.Name(), "FIRST");
    EXPECT_EQ(results[0].molecule.Sequence(), "mkvlagg");
    EXPECT_EQ(results[0].molecule.Description().definition, "A definition");
    EXPECT_EQ(results[0].molecule.Description().accessions, std::vector<std::string>{"AC1"});
    EXPECT_EQ(results[1].molecule.Name(), "SECOND");
    EXPECT_EQ(results[2].result, kNoMoreRecords);

    EXPECT_EQ(ReadAll(kFormatSuite, kKindProtein, "212|\n209|MK\n210\n")[0].result, kNoName);
    EXPECT_EQ(ReadAll(kFormatSuite, kKindProtein, "212|X\n210\n")[0].result, kNoSequence);
    EXPECT_EQ(ReadAll(kFormatSuite, kKindProtein, "209|MK\n")[0].result, kNoMoreRecords);
}

TEST(ImportReaders, UnknownFormatIsNotSupported) {
    CSxStream stream(">a\nMK\n");
    CSxMol molecule(kKindProtein);
    EXPECT_EQ(ReadMolecule(5, molecule, stream), kFormatNotSupported);
    EXPECT_EQ(ImportResultMessage(kFormatNotSupported, "f", 0), "Format Not Supported");
}

TEST(ImportReaders, ResultMessages) {
    EXPECT_EQ(ImportResultMessage(kNoName, "a.txt", 0), "File a.txt: No molecule name found");
    EXPECT_EQ(ImportResultMessage(kProteinNotNucleic, "a.txt", 0),
              "File a.txt: Protein file is indicated while DNA/RNA molecule file is expected");
    EXPECT_EQ(ImportResultMessage(kNucleicNotProtein, "a.txt", 0),
              "File a.txt: DNA/RNA molecule file is indicated while protein file is expected");
    EXPECT_EQ(ImportResultMessage(kNoSequence, "a.txt", 0), "File a.txt: No sequence data found");
    EXPECT_EQ(ImportResultMessage(kNoMoreRecords, "a.txt", 0), "No error detected!");
    EXPECT_EQ(ImportResultMessage(kBadSuiteData, "a.txt", 0),
              "Failed to read serialized QRBO data");
    EXPECT_EQ(ImportResultMessage(kIllegalCharacter, "a.txt", 7),
              "Sequence File a.txt: Contains Illegal Character(s) in Line 7");
    EXPECT_EQ(ImportResultMessage(42, "a.txt", 0), "No error detected!");
}

}  // namespace
