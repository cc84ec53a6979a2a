#include "archive/Archive.h"

#include <gtest/gtest.h>

#include <cstring>
#include <random>

namespace {

// A record that grew a member: version 1 wrote (number, text), version 2 appends `extra`.
struct Versioned : CSerializable {
    TB_CLASS_TAG("TestVersioned")
    std::int32_t number = 0;
    std::string text;
    std::int32_t extra = -1;
    bool writeExtra = true;

    void Serialize(CArchive& ar) override {
        ar.XMember(number);
        ar.XMember(text);
        if (ar.IsStoring() ? writeExtra : !ar.AtEnd()) ar.XMember(extra);
    }
};
TB_REGISTER_CLASS(Versioned);

// The same record as read by a program that knows only its first member.
struct OldReader : CSerializable {
    TB_CLASS_TAG("TestVersioned")
    std::int32_t number = 0;
    void Serialize(CArchive& ar) override { ar.XMember(number); }
};

struct Node : CSerializable {
    TB_CLASS_TAG("TestNode")
    std::vector<std::int32_t> values;
    std::unique_ptr<Node> child;
    Versioned embedded;

    void Serialize(CArchive& ar) override {
        ar.XMember(values);
        ar.XData(embedded);
        ar.XPointer(child);
    }
};
TB_REGISTER_CLASS(Node);

struct Other : CSerializable {
    TB_CLASS_TAG("TestOther")
    void Serialize(CArchive&) override {}
};
TB_REGISTER_CLASS(Other);

std::vector<std::uint8_t> StoreChain(int depth) {
    auto root = std::make_unique<Node>();
    Node* node = root.get();
    for (int i = 0; i < depth; ++i) {
        node->values = {i, -i, i * 1000};
        node->embedded.number = i;
        node->embedded.text = "level " + std::to_string(i);
        node->child = std::make_unique<Node>();
        node = node->child.get();
    }
    CArchive ar = CArchive::ForWriting();
    std::string signature = "TestFile";
    ar.XMember(signature);
    ar.XPointer(root);
    return ar.Bytes();
}

std::unique_ptr<Node> LoadChain(const std::vector<std::uint8_t>& bytes) {
    CArchive ar = CArchive::ForReading(bytes);
    std::string signature;
    ar.XMember(signature);
    std::unique_ptr<Node> root;
    ar.XPointer(root);
    return root;
}

TEST(Archive, ScalarsStringsAndListsRoundTrip) {
    std::int16_t s = -1234;
    std::int32_t i = INT32_MIN;
    std::uint32_t u = 0x01000000;
    std::int64_t l = -(std::int64_t{1} << 40);
    double d = 0.0001;
    bool b = true;
    std::string text = "caf\xc3\xa9 with\0nul";
    std::vector<std::string> list = {"", "a", std::string(1000, 'x')};
    std::vector<double> doubles = {1.5, -2.25};
    CArchive out = CArchive::ForWriting();
    out.XMember(s), out.XMember(i), out.XMember(u), out.XMember(l), out.XMember(d);
    out.XMember(b), out.XMember(text), out.XMember(list), out.XMember(doubles);

    CArchive in = CArchive::ForReading(out.Bytes());
    std::int16_t s2 = 0;
    std::int32_t i2 = 0;
    std::uint32_t u2 = 0;
    std::int64_t l2 = 0;
    double d2 = 0;
    bool b2 = false;
    std::string text2;
    std::vector<std::string> list2 = {"stale"};
    std::vector<double> doubles2;
    in.XMember(s2), in.XMember(i2), in.XMember(u2), in.XMember(l2), in.XMember(d2);
    in.XMember(b2), in.XMember(text2), in.XMember(list2), in.XMember(doubles2);
    EXPECT_EQ(s2, s);
    EXPECT_EQ(i2, i);
    EXPECT_EQ(u2, u);
    EXPECT_EQ(l2, l);
    EXPECT_EQ(d2, d);
    EXPECT_TRUE(b2);
    EXPECT_EQ(text2, text);
    EXPECT_EQ(list2, list);
    EXPECT_EQ(doubles2, doubles);
    EXPECT_TRUE(in.AtEnd());
}

TEST(Archive, NestedPointersAndEmbeddedRecordsRoundTrip) {
    auto root = LoadChain(StoreChain(5));
    Node* node = root.get();
    for (int level = 0; level < 5; ++level) {
        ASSERT_NE(node, nullptr);
        EXPECT_EQ(node->values, (std::vector<std::int32_t>{level, -level, level * 1000}));
        EXPECT_EQ(node->embedded.text, "level " + std::to_string(level));
        node = node->child.get();
    }
    ASSERT_NE(node, nullptr);
    EXPECT_EQ(node->child, nullptr);
}

TEST(Archive, OlderRecordStopsEarlyAndNewerMembersAreSkipped) {
    // An old writer leaves out `extra`: the reader sees AtEnd and keeps its default.
    Versioned old;
    old.number = 7;
    old.writeExtra = false;
    std::int32_t after = 99;
    CArchive out = CArchive::ForWriting();
    out.XData(old);
    out.XMember(after);
    CArchive in = CArchive::ForReading(out.Bytes());
    Versioned read;
    std::int32_t after2 = 0;
    in.XData(read);
    in.XMember(after2);
    EXPECT_EQ(read.number, 7);
    EXPECT_EQ(read.extra, -1);
    EXPECT_EQ(after2, 99);

    // A newer record carries a member this reader does not know: it is skipped.
    OldReader oldReader;
    Versioned recent;
    recent.number = 3;
    recent.text = "skipped";
    CArchive out2 = CArchive::ForWriting();
    out2.XData(recent);
    out2.XMember(after);
    CArchive in2 = CArchive::ForReading(out2.Bytes());
    in2.XData(oldReader);
    in2.XMember(after2);
    EXPECT_EQ(oldReader.number, 3);
    EXPECT_EQ(after2, 99);
}

TEST(Archive, WrongKindsTagsAndClassesAreFormatErrors) {
    CArchive out = CArchive::ForWriting();
    std::int32_t number = 5;
    out.XMember(number);
    CArchive in = CArchive::ForReading(out.Bytes());
    std::string text;
    try {
        in.XMember(text);
        FAIL() << "an int read as a string";
    } catch (const CArchiveException& e) {
        EXPECT_EQ(e.GetCause(), CArchiveException::badSchema);
        EXPECT_EQ(e.Report("a.bpr"), "a.bpr\nFile format not supported (version error).");
    }

    auto other = std::make_unique<Other>();
    CArchive out2 = CArchive::ForWriting();
    out2.XPointer(other);
    CArchive in2 = CArchive::ForReading(out2.Bytes());
    std::unique_ptr<Node> node;
    try {
        in2.XPointer(node);
        FAIL() << "an Other read as a Node";
    } catch (const CArchiveException& e) {
        EXPECT_EQ(e.GetCause(), CArchiveException::badClass);
    }

    auto bytes = out2.Bytes();
    bytes[5] = 'X';  // first letter of the tag: "XestOther" is not registered
    CArchive in3 = CArchive::ForReading(bytes);
    std::unique_ptr<Other> other2;
    EXPECT_THROW(in3.XPointer(other2), CArchiveException);
}

TEST(Archive, HugeCountsAreRefusedBeforeAllocating) {
    CArchive out = CArchive::ForWriting();
    std::vector<std::int32_t> values = {1, 2, 3};
    out.XMember(values);
    auto bytes = out.Bytes();
    // The count follows its type code; claim two billion elements.
    std::uint32_t huge = 2'000'000'000;
    std::memcpy(bytes.data() + 1, &huge, sizeof huge);
    CArchive in = CArchive::ForReading(bytes);
    std::vector<std::int32_t> read;
    EXPECT_THROW(in.XMember(read), CArchiveException);
    EXPECT_LT(read.capacity(), 1000u);
}

TEST(Archive, DeepNestingIsRefused) {
    EXPECT_NO_THROW(LoadChain(StoreChain(CArchive::kMaxDepth - 2)));
    // Written by hand: a writer refuses to go that deep, a reader must too.
    std::vector<std::uint8_t> bytes;
    for (int i = 0; i < 200; ++i) {
        bytes.push_back(static_cast<std::uint8_t>(CArchive::Code::Record));
        std::uint32_t length = 5 * (200 - i - 1);
        bytes.insert(bytes.end(), reinterpret_cast<std::uint8_t*>(&length),
                     reinterpret_cast<std::uint8_t*>(&length) + 4);
    }
    CArchive in = CArchive::ForReading(bytes);
    Node node;
    try {
        in.XData(node);
        FAIL();
    } catch (const CArchiveException& e) {
        EXPECT_NE(e.GetCause(), CArchiveException::writeError);
    }
}

TEST(Archive, EveryTruncationAndManyBitFlipsFailCleanly) {
    const auto bytes = StoreChain(4);
    for (std::size_t size = 0; size < bytes.size(); ++size) {
        std::vector<std::uint8_t> cut(bytes.begin(), bytes.begin() + size);
        EXPECT_THROW(LoadChain(cut), CArchiveException) << "truncated at " << size;
    }
    std::mt19937 random(42);
    for (int round = 0; round < 2000; ++round) {
        auto damaged = bytes;
        damaged[random() % damaged.size()] ^= static_cast<std::uint8_t>(1u << (random() % 8));
        try {
            LoadChain(damaged);
        } catch (const CArchiveException&) {
        }
    }
}

TEST(Archive, LeadingStringNeverThrows) {
    const auto bytes = StoreChain(1);
    EXPECT_EQ(CArchive::LeadingString(bytes), "TestFile");
    std::string text = ">seq1\nMKV\n";
    EXPECT_EQ(CArchive::LeadingString(
                  std::span(reinterpret_cast<const std::uint8_t*>(text.data()), text.size())),
              "");
    EXPECT_EQ(CArchive::LeadingString({}), "");
}

}  // namespace
