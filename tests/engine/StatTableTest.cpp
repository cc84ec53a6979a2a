#include "StatTable.h"

#include <gtest/gtest.h>

#include "SimBlockParameters.h"

namespace {

struct Entry {
    int sequences;
    double lambda;
    double k;
    bool marked;
    bool operator==(const Entry&) const = default;
};

std::vector<Entry> EntriesOf(const CStatTable& table) {
    std::vector<Entry> entries;
    for (const auto& constant : table.Entries()) {
        entries.push_back(
            {constant->sequences, constant->lambda, constant->k, constant->marked != 0});
    }
    return entries;
}

template <class T>
void RoundTrip(T& written, T& read) {
    CArchive out = CArchive::ForWriting();
    out.XData(written);
    CArchive in = CArchive::ForReading(out.Bytes());
    in.XData(read);
}

}  // namespace

TEST(StatTable, SetReplacesByNumberOfSequencesAndKeepsOrder) {
    CStatTable table;
    EXPECT_TRUE(table.IsEmpty());
    EXPECT_EQ(table.Reference(), CStatTable::kDefaultReference);
    table.Set(5, 0.5, 0.1, false);
    table.Set(2, 0.2, 0.3, true);
    table.Set(5, 0.6, 0.7, true);
    EXPECT_EQ(EntriesOf(table), (std::vector<Entry>{{5, 0.6, 0.7, true}, {2, 0.2, 0.3, true}}));

    double lambda = -1;
    double k = -1;
    EXPECT_FALSE(table.Lookup(3, lambda, k));
    EXPECT_EQ(lambda, -1);
    ASSERT_TRUE(table.Lookup(2, lambda, k));
    EXPECT_EQ(lambda, 0.2);
    EXPECT_EQ(k, 0.3);

    table.SetReference("mine");
    table.Clear();
    EXPECT_TRUE(table.IsEmpty());
    EXPECT_EQ(table.Reference(), "mine");
}

TEST(StatTable, CopiesAreDeepAndIndependent) {
    CStatTable original;
    original.Set(3, 0.25, 0.05, true);
    original.SetReference("source");
    CStatTable copy = original;
    copy.Set(3, 9.0, 9.0, false);
    copy.Set(4, 1.0, 1.0, false);
    EXPECT_EQ(EntriesOf(original), (std::vector<Entry>{{3, 0.25, 0.05, true}}));

    copy = original;
    EXPECT_EQ(EntriesOf(copy), EntriesOf(original));
    EXPECT_EQ(copy.Reference(), "source");
    const CStatTable& same = copy;
    copy = same;  // assigning a table to itself keeps its entries
    EXPECT_EQ(EntriesOf(copy), EntriesOf(original));
}

TEST(StatTable, TextLinesReadBackWhatIsWritten) {
    CStatTable written;
    written.Set(3, 0.25, 0.05, true);
    written.Set(16, 1.0625, 12.5, false);
    std::string text;
    written.AppendText(text);

    CStatTable read;
    std::string error;
    ASSERT_TRUE(read.ReadTextLines(DataLines(text), error)) << error;
    EXPECT_EQ(EntriesOf(read), EntriesOf(written));

    CStatConst entry;
    EXPECT_EQ(CStatTable::ParseTextLine("\t3\t0.2500\t0.0500\t*", entry), "");
    EXPECT_EQ((Entry{entry.sequences, entry.lambda, entry.k, entry.marked != 0}),
              (Entry{3, 0.25, 0.05, true}));
    EXPECT_NE(CStatTable::ParseTextLine("3 0.25", entry), "");
    EXPECT_NE(CStatTable::ParseTextLine("99999999999 0.25 0.5", entry), "");  // m beyond 32 bits
    EXPECT_EQ(CStatTable::ParseTextLine("3,0.5,0.75,no-mark,extra", entry), "");
    EXPECT_EQ((Entry{entry.sequences, entry.lambda, entry.k, entry.marked != 0}),
              (Entry{3, 0.5, 0.75, false}));

    // A bad line leaves the table as it was.
    EXPECT_FALSE(read.ReadTextLines(DataLines("3 0.5 0.5\n4 x 0.5\n"), error));
    EXPECT_EQ(error, "line 2: lambda \"x\" is not a number of 0 or more");
    EXPECT_EQ(EntriesOf(read), EntriesOf(written));

    std::string empty;
    CStatTable().AppendText(empty);
    EXPECT_EQ(empty, "");
}

TEST(StatTable, ArchiveRoundTripAndNullSlots) {
    CStatTable written;
    written.Set(2, 0.125, 0.5, false);
    written.Set(7, 0.75, 0.25, true);
    written.SetReference("stored reference");
    CStatTable read;
    read.Set(9, 9, 9, false);  // replaced, not merged
    RoundTrip(written, read);
    EXPECT_EQ(EntriesOf(read), EntriesOf(written));
    EXPECT_EQ(read.Reference(), "stored reference");

    CStatSerialArray withHole;
    withHole.push_back(std::make_unique<CStatConst>(4, 0.5, 0.5, false));
    withHole.push_back(nullptr);
    CStatSerialArray array;
    RoundTrip(withHole, array);
    ASSERT_EQ(array.size(), 1u);
    EXPECT_EQ(array[0]->sequences, 4);
}

TEST(SimBlockParameters, LimitMessageNamesTheLimit) {
    EXPECT_EQ(IntegerLimitMessage(kMinCutoff), "Please enter an integer >= 1");
    EXPECT_EQ(IntegerLimitMessage(kMinMinSequences), "Please enter an integer >= 2");
    const CSimBlockParameters parameters(33, kDefaultMinSequences);
    CSimBlockParameters copy;
    copy = parameters;
    EXPECT_EQ(copy.Cutoff(), 33);
    EXPECT_EQ(copy.MinSequences(), 5);
}
