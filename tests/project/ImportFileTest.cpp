// Adding whole files to a molecule list: refusal, the raw question, naming, messages, URLs.

#include <gtest/gtest.h>

#include <sys/stat.h>
#include <random>

#include "ImportTestFiles.h"
#include "import/UniqueNamer.h"
#include "molecule/MolListException.h"

namespace {

using Strings = std::vector<std::string>;

// The naming rule applied literally: the molecules in list order, each split at its last '#'.
std::string LiteralUniqueName(const Strings& existing, const std::string& wanted) {
    long count = 1;
    for (const std::string& name : existing) {
        std::string base = name;
        long k = 0;
        std::size_t hash = name.rfind('#');
        if (hash != std::string::npos && hash >= wanted.size()) {
            std::string digits = name.substr(hash + 1);
            bool number = !digits.empty() && digits.size() < 9 &&
                          digits.find_first_not_of("0123456789") == std::string::npos;
            if (number && std::stol(digits) != 0) {
                base = name.substr(0, hash);
                k = std::stol(digits);
            }
        }
        if (base == wanted) {
            ++count;
            if (count <= k)
                count = k + 1;
        }
    }
    return count >= 2 ? wanted + "#" + std::to_string(count) : wanted;
}

TEST(ImportNaming, SuffixesFollowTheExistingNames) {
    EXPECT_EQ(CUniqueNamer({"S"}).Take("S"), "S#2");
    EXPECT_EQ(CUniqueNamer({"S", "S#2"}).Take("S"), "S#3");
    EXPECT_EQ(CUniqueNamer({"S#5"}).Take("S"), "S#6");
    EXPECT_EQ(CUniqueNamer({"S#0", "S#x"}).Take("S"), "S");
    EXPECT_EQ(CUniqueNamer({"T"}).Take("S"), "S");
    CUniqueNamer namer({});
    EXPECT_EQ(namer.Take("A"), "A");
    EXPECT_EQ(namer.Take("A"), "A#2");
    EXPECT_EQ(namer.Take("A"), "A#3");
    EXPECT_EQ(namer.Take("A#2"), "A#2#2");
}

TEST(ImportNaming, MatchesTheLiteralRuleOnRandomNames) {
    std::mt19937 random(7);
    const Strings pieces = {"S", "T", "#", "#2", "#3", "#10", "#0", "1", "#S"};
    for (int round = 0; round < 300; ++round) {
        Strings names;
        CUniqueNamer namer({});
        for (int i = 0; i < 12; ++i) {
            std::string wanted;
            int length = 1 + static_cast<int>(random() % 3);
            for (int p = 0; p < length; ++p)
                wanted += pieces[random() % pieces.size()];
            std::string expected = LiteralUniqueName(names, wanted);
            ASSERT_EQ(namer.Take(wanted), expected) << "wanted " << wanted;
            names.push_back(expected);
        }
    }
}

TEST(ImportFile, SameFastaTwiceGetsSuffixes) {
    CScratchDir dir;
    std::string path = dir.Write("three.fa", ">a\nMKV\n>b\nWWL\n>c x\nPP\n");
    CMolList list(kTypeProtein);
    CRecordingPrompt prompt;
    ASSERT_TRUE(list.AddFile(path, prompt));
    ASSERT_TRUE(list.AddFile(path, prompt));
    EXPECT_EQ(NamesOf(list), (Strings{"a", "b", "c", "a#2", "b#2", "c#2"}));
    ASSERT_TRUE(list.AddFile(path, prompt));
    EXPECT_EQ(list.At(6)->Name(), "a#3");
    EXPECT_TRUE(prompt.Messages().empty());
    EXPECT_EQ(list.At(0)->Creator().name, "UNKNOWN");
    EXPECT_EQ(list.At(0)->Modifier(), list.At(0)->Creator());
}

TEST(ImportFile, SuffixAfterRenamedMolecules) {
    CScratchDir dir;
    std::string path = dir.Write("s.fa", ">S\nMKV\n");
    CMolList list(kTypeProtein);
    CRecordingPrompt prompt;
    list.AddFile(path, prompt);
    list.AddFile(path, prompt);
    list.AddFile(path, prompt);
    EXPECT_EQ(NamesOf(list), (Strings{"S", "S#2", "S#3"}));
    // Only S#5 left: the next copy is S#6.
    list.DeleteByName("S");
    list.DeleteByName("S#2");
    ASSERT_TRUE(list.Rename("S#3", "S#5", prompt));
    list.AddFile(path, prompt);
    EXPECT_EQ(NamesOf(list), (Strings{"S#5", "S#6"}));
}

TEST(ImportFile, WrongTypeIsRefusedAsAWhole) {
    CRecordingPrompt prompt;
    CMolList protein(kTypeProtein);
    EXPECT_FALSE(protein.AddFile(SequenceFixture("genbank_nucleic.gb"), prompt));
    EXPECT_EQ(protein.Count(), 0);
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text,
              "You cannot add a nucleic acid sequence to an amino acid project.");

    CMolList nucleic(kTypeNucleic);
    EXPECT_FALSE(nucleic.AddFile(SequenceFixture("swissprot_globins.txt"), prompt));
    EXPECT_EQ(prompt.Messages().back().text,
              "You cannot add an amino acid sequence to a nucleic acid project.");

    // A list of unknown type takes the type of its first file.
    CMolList open;
    EXPECT_TRUE(open.AddFile(SequenceFixture("genbank_nucleic.gb"), prompt));
    EXPECT_EQ(open.MolType(), kTypeNucleic);
    EXPECT_EQ(open.Count(), 2);
    EXPECT_FALSE(open.AddFile(SequenceFixture("genpept_globin.gp"), prompt));
}

TEST(ImportFile, SwissProtEntriesMatchTheirFastaSequences) {
    CRecordingPrompt prompt;
    CMolList swiss(kTypeProtein);
    ASSERT_TRUE(swiss.AddFile(SequenceFixture("swissprot_globins.txt"), prompt));
    CMolList fasta(kTypeProtein);
    ASSERT_TRUE(fasta.AddFile(
        std::string(TB_TEST_DATA_DIR) + "/../../resources/examples/globins.fa", prompt));
    ASSERT_EQ(swiss.Count(), 3);
    for (int i = 0; i < swiss.Count(); ++i) {
        const CSxMolX* reference = fasta.FindByName(swiss.At(i)->Name());
        ASSERT_NE(reference, nullptr) << swiss.At(i)->Name();
        EXPECT_EQ(swiss.At(i)->Sequence(), reference->Sequence());
    }
    EXPECT_EQ(swiss.At(0)->SequenceLength(), 153);
    EXPECT_EQ(swiss.At(1)->SequenceLength(), 141);
    EXPECT_EQ(swiss.At(2)->SequenceLength(), 148);
}

TEST(ImportFile, RawQuestionForUnrecognisedFiles) {
    CScratchDir dir;
    std::string digits = dir.Write("digits.txt", "12345\n678\n");
    CRecordingPrompt cancel;
    CMolList list;
    EXPECT_FALSE(list.AddFile(digits, cancel));
    EXPECT_EQ(cancel.RawQuestions(), Strings{digits});
    EXPECT_EQ(list.MolType(), kTypeUnknown);

    // Accepted: only digits give a record without sequence, so nothing is read.
    CRecordingPrompt accept(kTypeNucleic);
    EXPECT_FALSE(list.AddFile(digits, accept));
    EXPECT_EQ(list.MolType(), kTypeNucleic);
    EXPECT_EQ(list.Count(), 0);
    ASSERT_EQ(accept.Messages().size(), 1u);
    EXPECT_EQ(accept.Messages()[0].text,
              "File digits.txt: No sequence data found (the record at line 1 was skipped)");

    std::string blocks = dir.Write("blocks.seq", "acgt acgt\n\n\nggcc\n");
    EXPECT_TRUE(list.AddFile(blocks, accept));
    EXPECT_EQ(NamesOf(list), (Strings{"blocks", "blocks#2"}));
    EXPECT_EQ(accept.Messages().size(), 1u);
}

TEST(ImportFile, DamagedRecordsAreSkippedWithOneMessage) {
    CScratchDir dir;
    CMolList protein(kTypeProtein);
    CRecordingPrompt prompt(kTypeProtein);
    std::string raw = dir.Write("r.txt", "mkv\n\nwwl\nMKU\n\npp\n");
    EXPECT_TRUE(protein.AddFile(raw, prompt));
    EXPECT_EQ(NamesOf(protein), (Strings{"r", "r#2"}));
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text,
              "Sequence File r.txt: Contains Illegal Character(s) in Line 4 (the record at line 3 "
              "was skipped)");
    EXPECT_EQ(prompt.Messages()[0].icon, MessageIcon::exclamation);

    // The header of the first entry says nothing; the second contradicts the list.
    std::string mixed =
        dir.Write("mixed.gb",
                  "LOCUS  A\nORIGIN\n 1 acgt\n//\n"
                  "LOCUS  B 4 aa\nORIGIN\n 1 mkvl\n//\nLOCUS  C\nORIGIN\n 1 gg\n//\n");
    CMolList nucleic;
    CRecordingPrompt quiet;
    EXPECT_TRUE(nucleic.AddFile(mixed, quiet));
    EXPECT_EQ(NamesOf(nucleic), (Strings{"A", "C"}));
    EXPECT_EQ(quiet.Messages().back().text,
              "File mixed.gb: Protein file is indicated while DNA/RNA molecule file is expected "
              "(the record at line 5 was skipped)");

    // No name, no sequence, damaged suite data: each record is skipped, the others read.
    CMolList list(kTypeProtein);
    CRecordingPrompt told;
    EXPECT_TRUE(list.AddFile(
        dir.Write("a.gp", "LOCUS\nORIGIN\n 1 ww\n//\nLOCUS  A 2 aa\nORIGIN\n 1 mk\n//\n"), told));
    EXPECT_TRUE(list.AddFile(
        dir.Write("c.sw", "ID   C  PRT;\nCC   @QRBO-DATA@ 1\nSQ\n MK\n//\nID   D PRT;\nSQ\n W\n"),
        told));
    EXPECT_EQ(NamesOf(list), (Strings{"A", "D"}));
    ASSERT_EQ(told.Messages().size(), 2u);
    EXPECT_EQ(told.Messages()[0].text,
              "File a.gp: No molecule name found (the record at line 1 was skipped)");
    EXPECT_EQ(told.Messages()[1].text,
              "File c.sw: Failed to read serialized QRBO data (the record at line 1 was skipped)");
}

TEST(ImportFile, CarriageReturnLinesReadLikeCrLf) {
    CScratchDir dir;
    CRecordingPrompt prompt;
    CMolList cr(kTypeProtein), crlf(kTypeProtein);
    ASSERT_TRUE(cr.AddFile(dir.Write("cr.fa", ">a\rMKV\rLL\r>b\rWW\r"), prompt));
    ASSERT_TRUE(crlf.AddFile(dir.Write("crlf.fa", ">a\r\nMKV\r\nLL\r\n>b\r\nWW\r\n"), prompt));
    ASSERT_EQ(cr.Count(), 2);
    ASSERT_EQ(crlf.Count(), 2);
    for (int i = 0; i < 2; ++i)
        EXPECT_EQ(cr.At(i)->Sequence(), crlf.At(i)->Sequence());
    EXPECT_EQ(cr.At(0)->Sequence(), "mkvll");
}

TEST(ImportFile, UnreadableFileThrows) {
    CMolList list;
    CRecordingPrompt prompt;
    EXPECT_THROW(list.AddFile("/nonexistent/tb/file.fa", prompt), CMolListException);
}

TEST(ImportFile, SourceUrlsFromAMatchingCompanion) {
    CScratchDir dir;
    std::string path = dir.Write("u.fa", ">a\nMK\n>b\nWW\n>c\nLL\n");
    struct stat info {};
    ASSERT_EQ(::stat(path.c_str(), &info), 0);
    std::string pair = "[Pair]\nLength=" + std::to_string(info.st_size) +
                       "\nTime=" + std::to_string(info.st_mtime) + "\n";
    dir.Write("u.fa.url", "[InternetShortcut]\r\nURL=http://x/a\r\nURL1=http://x/b\r\n" + pair);
    CRecordingPrompt prompt;
    CMolList list(kTypeProtein);
    ASSERT_TRUE(list.AddFile(path, prompt));
    EXPECT_EQ(list.At(0)->SourceUrl(), "http://x/a");
    EXPECT_EQ(list.At(1)->SourceUrl(), "http://x/b");
    EXPECT_EQ(list.At(2)->SourceUrl(), "");

    // A companion written for another version of the file is ignored.
    dir.Write("u.fa.url", "[InternetShortcut]\nURL=http://x/a\n[Pair]\nLength=1\nTime=" +
                              std::to_string(info.st_mtime) + "\n");
    CMolList stale(kTypeProtein);
    ASSERT_TRUE(stale.AddFile(path, prompt));
    EXPECT_EQ(stale.At(0)->SourceUrl(), "");
}

TEST(ImportFile, BadInputNeverCrashes) {
    CScratchDir dir;
    std::string binary;
    std::mt19937 random(3);
    for (int i = 0; i < 20000; ++i)
        binary += static_cast<char>(random());
    std::string hugeLine = ">" + std::string(200000, 'x') + "\n" + std::string(3000000, 'M');
    const Strings inputs = {
        binary,
        hugeLine,
        "LOCUS",
        "LOCUS X 3 aa\nFEATURES\n     CDS   1..2\n                     /note=\"open",
        "ID   X PRT;\nFT   A  1  2  \"\nFT                   /x=\"\"\"\nSQ\n MK",
        "ID   X PRT;\nRN   [99999999999999999999]\nRX   PubMed\nSQ\n MK\n//",
        std::string(100000, '>'),
        "LOCUS X 1 aa\nORIGIN\n" + std::string(100000, '9'),
        "@552656AS34@\n212|" + std::string(1000, '|') + "\n209\n210",
    };
    for (const std::string& input : inputs) {
        for (int type : {kTypeProtein, kTypeNucleic}) {
            CMolList list(type);
            CRecordingPrompt prompt(type);
            try {
                list.AddFile(dir.Write("bad", input), prompt);
            } catch (const CMolListException&) {
                // refusing the whole file is fine too
            }
            for (int i = 0; i < list.Count(); ++i) {
                EXPECT_EQ(list.At(i)->SequenceLength(),
                          static_cast<int>(list.At(i)->Sequence().size()));
            }
        }
    }
    CMolList list(kTypeProtein);
    CRecordingPrompt prompt;
    ASSERT_TRUE(list.AddFile(dir.Write("huge.fa", hugeLine), prompt));
    ASSERT_EQ(list.Count(), 1);
    EXPECT_EQ(list.At(0)->Name().size(), 200000u);
    EXPECT_EQ(list.At(0)->SequenceLength(), 3000000);
}

}  // namespace
