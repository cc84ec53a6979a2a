// Damaged sequence files: a record that cannot be read is skipped with one message naming the
// file, the record's line and why, and every intact record before and after it is read.

#include <gtest/gtest.h>

#include <fcntl.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <csignal>

#include "ImportTestFiles.h"
#include "import/ImportResult.h"
#include "import/SxStream.h"
#include "molecule/MolListException.h"

namespace {

using Strings = std::vector<std::string>;

struct CImported {
    bool added;
    Strings names;
    Strings sequences;
    Strings messages;
};

// Adds one file written with `content` to a molecule list of `type`; an unrecognised file is
// read as raw sequence of that type.
CImported Import(const std::string& name, const std::string& content, int type = kTypeProtein) {
    CScratchDir dir;
    CMolList list(type);
    CRecordingPrompt prompt(type);
    CImported result{list.AddFile(dir.Write(name, content), prompt), {}, {}, {}};
    for (int i = 0; i < list.Count(); ++i) {
        result.names.push_back(list.At(i)->Name());
        result.sequences.push_back(list.At(i)->Sequence());
        EXPECT_EQ(list.At(i)->SequenceLength(), static_cast<int>(list.At(i)->Sequence().size()));
    }
    for (const auto& message : prompt.Messages())
        result.messages.push_back(message.text);
    return result;
}

// The message lines of one import, split at line ends.
Strings MessageLines(const CImported& imported) {
    Strings lines;
    for (const std::string& message : imported.messages) {
        std::size_t start = 0;
        for (std::size_t end; (end = message.find('\n', start)) != std::string::npos;
             start = end + 1) {
            lines.push_back(message.substr(start, end - start));
        }
        lines.push_back(message.substr(start));
    }
    return lines;
}

std::string Skipped(const std::string& reason, int line) {
    return reason + " (the record at line " + std::to_string(line) + " was skipped)";
}

TEST(ImportDamagedFasta, BlankLinesInsideRecordsAreSkipped) {
    // Twenty residues with a blank line halfway, and a blank line right after a header.
    const CImported imported =
        Import("blank.fa", ">a first\nMKVLAAGGHH\n\nWWLLPPSSTT\n>b\n\n  \nMKW\n\n>c\nPP\n");
    EXPECT_TRUE(imported.added);
    EXPECT_EQ(imported.names, (Strings{"a", "b", "c"}));
    EXPECT_EQ(imported.sequences, (Strings{"mkvlaagghhwwllppsstt", "mkw", "pp"}));
    EXPECT_TRUE(imported.messages.empty());
}

TEST(ImportDamagedFasta, RecordsWithoutSequenceAreSkippedAndTheRestRead) {
    // Line 1 starts a record that has no sequence, and so do lines 4 (a '>' with blanks only)
    // and 6; a '>' with blanks only but with a sequence is read as NONAME.
    const std::string text = ">empty\n>good\nMKV\n>  \n\n>blank_only\n \t \n>   \nWWL\n>last\nLL";
    const CImported imported = Import("d.fa", text);
    EXPECT_TRUE(imported.added);
    EXPECT_EQ(imported.names, (Strings{"good", "NONAME", "last"}));
    EXPECT_EQ(imported.sequences, (Strings{"mkv", "wwl", "ll"}));
    const std::string reason = "File d.fa: No sequence data found";
    EXPECT_EQ(MessageLines(imported),
              (Strings{Skipped(reason, 1), Skipped(reason, 4), Skipped(reason, 6)}));
    ASSERT_EQ(imported.messages.size(), 1u);  // one message for the whole file
}

TEST(ImportDamagedFasta, LineEndsBlanksAndNumbersInSequenceLines) {
    const Strings expected = {"mkvllaww", "gghh"};
    // CR LF with blank lines, a byte order mark, tabs, position numbers and a zero.
    const CImported crlf =
        Import("crlf.fa", "\xEF\xBB\xBF>a\r\n  1 MKV\tLLA\r\n\r\n 0 WW 12\r\n\r\n>b\r\nGG HH\r\n");
    EXPECT_EQ(crlf.names, (Strings{"a", "b"}));
    EXPECT_EQ(crlf.sequences, expected);
    // CR alone, doubled CRs and no end on the last line.
    const CImported cr = Import("cr.fa", ">a\rMKVLLA\r\rWW\r\r\n>b\rGGHH");
    EXPECT_EQ(cr.sequences, expected);
    EXPECT_TRUE(crlf.messages.empty());
    EXPECT_TRUE(cr.messages.empty());
}

TEST(ImportDamagedGenPept, DamagedEntriesAreSkippedAndTheOthersRead) {
    const std::string text =
        "LOCUS       A   6 aa   linear\nORIGIN\n        1 mkvlaa\n//\n"           // 1-4
        "LOCUS\nORIGIN\n        1 ww\n//\n"                                       // 5-8: no name
        "LOCUS       NOORIGIN   6 aa\nDEFINITION  lost.\n        1 mkvlaa\n//\n"  // 9-12
        "LOCUS       B   4 aa\nORIGIN\n        1 wwgg\n"  // 13-15: no "//" before the next
        "LOCUS       C   8 aa\nORIGIN\n        1 mkvl\n\n        5 pp 7 ss\n";  // no "//" at all
    const CImported imported = Import("g.gp", text);
    EXPECT_TRUE(imported.added);
    EXPECT_EQ(imported.names, (Strings{"A", "B", "C"}));
    EXPECT_EQ(imported.sequences, (Strings{"mkvlaa", "wwgg", "mkvlppss"}));
    EXPECT_EQ(MessageLines(imported), (Strings{Skipped("File g.gp: No molecule name found", 5),
                                               Skipped("File g.gp: No sequence data found", 9)}));
}

TEST(ImportDamagedGenPept, EntryOfTheOtherTypeIsSkipped) {
    const std::string text =
        "LOCUS  A 4 aa\nORIGIN\n 1 mkwl\n//\nLOCUS  N 4 bp\nORIGIN\n 1 acgt\n//\n"
        "LOCUS  B 2 aa\nORIGIN\n 1 pp\n//\n";
    const CImported imported = Import("mixed.gp", text);
    EXPECT_TRUE(imported.added);
    EXPECT_EQ(imported.names, (Strings{"A", "B"}));
    EXPECT_EQ(MessageLines(imported),
              Strings{Skipped("File mixed.gp: DNA/RNA molecule file is indicated while protein "
                              "file is expected",
                              5)});
}

TEST(ImportDamagedSwissProt, EntriesWithoutEndLineAreNotMerged) {
    const std::string text =
        "ID   ONE_HUMAN   Reviewed;   6 AA.\nDE   One.\nSQ   SEQUENCE   6 AA;\n"
        "     MKVLAA\n"                                                             // 1-4
        "ID   TWO_HUMAN   Reviewed;   4 AA.\nSQ   SEQUENCE   4 AA;\n     WWGG 4\n"  // 5-7
        "ID   \nSQ   SEQUENCE 2 AA;\n     PP\n//\n"                                 // 8-11
        "ID   NOSQ_HUMAN  Reviewed;  3 AA.\nDE   Nothing.\n//\n"                    // 12-14
        "ID   LAST_HUMAN Reviewed; 8 AA.\nSQ   SEQUENCE 8 AA;\n     MKVL\n\n     WWGG  8";
    const CImported imported = Import("s.sw", text);
    EXPECT_TRUE(imported.added);
    EXPECT_EQ(imported.names, (Strings{"ONE_HUMAN", "TWO_HUMAN", "LAST_HUMAN"}));
    EXPECT_EQ(imported.sequences, (Strings{"mkvlaa", "wwgg", "mkvlwwgg"}));
    EXPECT_EQ(MessageLines(imported), (Strings{Skipped("File s.sw: No molecule name found", 8),
                                               Skipped("File s.sw: No sequence data found", 12)}));
}

TEST(ImportDamagedSuiteText, MoleculesWithoutEndOrNameOrSequence) {
    const std::string text =
        "100|@552656AS34@|\n"
        "212|\n209|MK\n210\n"                // 2-4: no name
        "212|A\n209|MKV\n"                   // 5-6: no end record before the next molecule
        "212|B\n209|WW 12\n\n209|LL\n210\n"  // 7-11
        "212|EMPTY\n210\n"                   // 12-13: no sequence
        "212|C\n209|GG\n207|\n"              // 14-16: the end of the file ends it
        "212|AFTER\n209|PP\n210\n";          // after the end of the file
    const CImported imported = Import("m.txt", text);
    EXPECT_TRUE(imported.added);
    EXPECT_EQ(imported.names, (Strings{"A", "B", "C"}));
    EXPECT_EQ(imported.sequences, (Strings{"mkv", "wwll", "gg"}));
    EXPECT_EQ(MessageLines(imported), (Strings{Skipped("File m.txt: No molecule name found", 2),
                                               Skipped("File m.txt: No sequence data found", 12)}));
}

TEST(ImportDamagedRaw, IllegalCharacterSkipsOnlyItsBlock) {
    const CImported imported = Import("r.txt", "MKV\nLLA\n\nWW\nMKJ\nJJ\n\nGGH\n");
    EXPECT_TRUE(imported.added);
    EXPECT_EQ(imported.names, (Strings{"r", "r#2"}));
    EXPECT_EQ(imported.sequences, (Strings{"mkvlla", "ggh"}));
    EXPECT_EQ(MessageLines(imported),
              Strings{Skipped("Sequence File r.txt: Contains Illegal Character(s) in Line 5", 4)});

    // 'u' is a nucleic-acid letter only.
    const CImported nucleic = Import("n.txt", "acgu\n\nacgt\n", kTypeNucleic);
    EXPECT_EQ(nucleic.sequences, (Strings{"acgu", "acgt"}));
}

TEST(ImportDamaged, FileWithoutAnyReadableRecordFails) {
    const CImported empty = Import("e.gp", "LOCUS  A 2 aa\n//\nLOCUS  B 2 aa\nDEFINITION x.\n//\n");
    EXPECT_FALSE(empty.added);
    EXPECT_TRUE(empty.names.empty());
    EXPECT_EQ(MessageLines(empty), (Strings{Skipped("File e.gp: No sequence data found", 1),
                                            Skipped("File e.gp: No sequence data found", 3)}));
    // Raw text with numbers only has a record without residues.
    const CImported digits = Import("digits.txt", "12345\n678\n");
    EXPECT_FALSE(digits.added);
    EXPECT_EQ(MessageLines(digits), Strings{Skipped("File digits.txt: No sequence data found", 1)});
    // Raw text with blank lines only has no record at all.
    const CImported blank = Import("blank.txt", "\n  \n\t\n");
    EXPECT_FALSE(blank.added);
    EXPECT_EQ(blank.messages, Strings{"File blank.txt: No sequence data found"});
}

TEST(ImportDamaged, ManySkippedRecordsAreCountedInOneMessage) {
    std::string text;
    for (int i = 0; i < 25; ++i)
        text += ">e" + std::to_string(i) + "\n";
    text += ">good\nMKV\n";
    const CImported imported = Import("many.fa", text);
    EXPECT_EQ(imported.names, Strings{"good"});
    ASSERT_EQ(imported.messages.size(), 1u);
    const Strings lines = MessageLines(imported);
    ASSERT_EQ(lines.size(), CSkippedRecords::kListed + 1);
    EXPECT_EQ(lines[0], Skipped("File many.fa: No sequence data found", 1));
    EXPECT_EQ(lines[9], Skipped("File many.fa: No sequence data found", 10));
    EXPECT_EQ(lines.back(), "... and 15 more records of many.fa were skipped");

    CSkippedRecords one("x.fa");
    for (std::size_t i = 0; i <= CSkippedRecords::kListed; ++i)
        one.Add(kNoName, 1, 1);
    EXPECT_NE(one.Message(0).find("\n... and 1 more record of x.fa was skipped"),
              std::string::npos);
    EXPECT_EQ(CSkippedRecords("x.fa").Message(3), "");
}

TEST(ImportDamaged, SuiteDataMessageNamesTheFile) {
    EXPECT_EQ(SkippedRecordMessage(kBadSuiteData, "a.gp", 3, 3),
              "File a.gp: Failed to read serialized QRBO data (the record at line 3 was skipped)");
}

TEST(ImportFileSize, EndlessAndOversizedInputsStopAtTheLimit) {
    constexpr std::size_t kLimit = std::size_t{1} << 20;
    try {
        CSxStream::FromFile("/dev/zero", kLimit);
        ADD_FAILURE() << "an endless input was read";
    } catch (const CSequenceFileTooLarge& e) {
        EXPECT_EQ(std::string(e.what()),
                  "/dev/zero: more than 1048576 bytes; sequence files are read up to 1048576 "
                  "bytes");
    }
    CScratchDir dir;
    const std::string exact = dir.Write("exact.fa", ">a\n" + std::string(kLimit - 3, 'M'));
    CSxStream stream = CSxStream::FromFile(exact, kLimit);
    std::string line;
    ASSERT_TRUE(stream.ReadLine(line));
    ASSERT_TRUE(stream.ReadLine(line));
    EXPECT_EQ(line.size(), kLimit - 3);
    const std::string over = dir.Write("over.fa", ">a\n" + std::string(kLimit - 2, 'M'));
    EXPECT_THROW(CSxStream::FromFile(over, kLimit), CSequenceFileTooLarge);
}

TEST(ImportFileSize, EndlessPipeIsRefusedWithTheLimit) {
    CScratchDir dir;
    const std::string fifo = dir.Write("placeholder", "") + ".fifo";
    ASSERT_EQ(::mkfifo(fifo.c_str(), 0600), 0);
    // A writer that never stops: the reader must stop by itself at the limit.
    pid_t writer = ::fork();
    ASSERT_GE(writer, 0);
    if (writer == 0) {
        const int fd = ::open(fifo.c_str(), O_WRONLY);
        const std::string block(65536, 'M');
        while (::write(fd, block.data(), block.size()) > 0) {
        }
        ::_exit(0);
    }
    EXPECT_THROW(CSxStream::FromFile(fifo, std::size_t{4} << 20), CSequenceFileTooLarge);
    ::kill(writer, SIGKILL);
    ::waitpid(writer, nullptr, 0);
}

}  // namespace
