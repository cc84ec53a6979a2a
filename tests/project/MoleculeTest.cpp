// The molecule record, project molecules and their keys, and the molecule list.

#include <gtest/gtest.h>

#include <algorithm>
#include <cstdio>
#include <set>

#include "ImportTestFiles.h"
#include "archive/FileIO.h"
#include "molecule/BlockListEntry.h"
#include "molecule/MolEntryOf.h"
#include "molecule/MolList.h"

namespace {

CSxMolX FullMolecule() {
    CSxMolX molecule(kKindNucleic);
    molecule.SetName("full");
    molecule.SetLinear(false);
    molecule.SetSequence("acgtn");
    molecule.SetSourceUrl("http://example.org/x?user=a&pass=b");
    molecule.Creator() = {"creator", "2001-01-01"};
    molecule.Modifier() = {"modifier", "2002-02-02"};
    CSxDescription& desc = molecule.Description();
    desc.definition = "definition";
    desc.accessions = {"A1", "A2"};
    desc.keywords = {"k1"};
    desc.database = "EMBL";
    desc.division = "SYN";
    desc.moleculeType = "mRNA";
    desc.dbDate = "01-JAN-2000";
    desc.sequenceSource = "source";
    desc.organism = "organism";
    desc.taxonomy = {"t1", "t2"};
    desc.dbLinks = {"DB; 1."};
    desc.comments = {"c1", ""};
    desc.references = {{1, "1-5", "remark", "authors", "title", "journal", "123", "456"}};
    CSxFeature feature;
    feature.key = "CDS";
    feature.SetLocation("complement(2..4)");
    feature.qualifiers = {{"gene", "x", true, true}, {"pseudo", "", false, false}};
    desc.features = {feature};
    return molecule;
}

// Stores `object` as an owned pointer and reads it back as a T.
template <class T, class Stored>
std::unique_ptr<T> StoreAndLoad(std::unique_ptr<Stored> object) {
    CArchive writer = CArchive::ForWriting();
    writer.XPointer(object);
    CArchive reader = CArchive::ForReading(writer.Bytes());
    std::unique_ptr<T> loaded;
    reader.XPointer(loaded);
    return loaded;
}

// A record of class SxMolX written by an older writer: the molecule part only.
struct CKeylessMolX : CSerializable {
    static constexpr const char* kClassTag = "SxMolX";
    const char* ClassTag() const override { return kClassTag; }
    void Serialize(CArchive& ar) override { ar.XData(molecule); }
    CSxMol molecule;
};

// A list whose elements are plain molecule records.
struct CPlainMolList : CSerializable {
    static constexpr const char* kClassTag = "MolList";
    const char* ClassTag() const override { return kClassTag; }
    void Serialize(CArchive& ar) override {
        std::int32_t type = kTypeNucleic;
        ar.XMember(type);
        ar.XObjectList(molecules);
    }
    std::vector<std::unique_ptr<CSxMol>> molecules;
};

std::uint64_t KeyValue(const std::string& key) {
    return std::stoull(key, nullptr, 16);
}

std::string Hex(std::uint64_t value) {
    char text[24];
    std::snprintf(text, sizeof text, "%llX", static_cast<unsigned long long>(value));
    return text;
}

TEST(MoleculeRecord, StoresEveryFieldAndTheKey) {
    auto molecule = std::make_unique<CSxMolX>(FullMolecule());
    CSxMolX original(*molecule);
    std::string key = molecule->Key();
    std::unique_ptr<CSxMolX> loaded = StoreAndLoad<CSxMolX>(std::move(molecule));
    ASSERT_TRUE(loaded);
    EXPECT_TRUE(loaded->SameContent(original));
    EXPECT_EQ(loaded->Key(), key);
    EXPECT_EQ(loaded->Description().features[0].start, 2);
    EXPECT_TRUE(loaded->Description().features[0].complement);
    EXPECT_FALSE(loaded->IsLinear());
    EXPECT_EQ(loaded->Description().features[0].qualifiers[1].hasValue, false);
}

TEST(MoleculeRecord, KindSetsProteinClassAndLinearFlag) {
    CSxMol protein(kKindProtein);
    EXPECT_EQ(protein.ProteinClass(), 2);
    EXPECT_TRUE(protein.IsLinear());
    CSxMol nucleic(kKindNucleic);
    EXPECT_EQ(nucleic.ProteinClass(), 0);
    EXPECT_FALSE(nucleic.IsLinear());
    nucleic.SetSequence("acg");
    nucleic.ClearForReading();
    EXPECT_TRUE(nucleic.IsLinear());
    EXPECT_EQ(nucleic.Kind(), kKindNucleic);
    EXPECT_EQ(nucleic.SequenceLength(), 0);
}

TEST(MoleculeKeys, RecordWithoutKeyLoadsWithItsConstructedKey) {
    auto keyless = std::make_unique<CKeylessMolX>();
    keyless->molecule = FullMolecule();
    std::unique_ptr<CSxMolX> loaded = StoreAndLoad<CSxMolX>(std::move(keyless));
    ASSERT_TRUE(loaded);
    EXPECT_EQ(loaded->Name(), "full");
    EXPECT_FALSE(loaded->Key().empty());
    EXPECT_EQ(loaded->Key().find_first_not_of("0123456789ABCDEF"), std::string::npos);
}

TEST(MoleculeKeys, CopiesGetNewKeysAndNewKeysAvoidLoadedOnes) {
    CSxMolX first;
    CSxMolX copy(first);
    CSxMolX fromRecord(static_cast<const CSxMol&>(first));
    std::set<std::string> keys = {first.Key(), copy.Key(), fromRecord.Key()};
    EXPECT_EQ(keys.size(), 3u);
    for (const std::string& key : keys) {
        EXPECT_NE(key[0], '0');
        EXPECT_EQ(key.find_first_not_of("0123456789ABCDEF"), std::string::npos);
    }

    // A file holds the keys that the next two new molecules would otherwise get.
    CSxMolX probe;
    std::uint64_t next = KeyValue(probe.Key()) + 1;
    for (std::uint64_t value : {next, next + 1}) {
        auto stored = std::make_unique<CSxMolX>();
        CArchive writer = CArchive::ForWriting();
        writer.XPointer(stored);
        std::vector<std::uint8_t> bytes = writer.Bytes();
        // Patch the stored key text (same length: the keys are consecutive).
        std::string oldKey = stored->Key();
        std::string newKey = Hex(value);
        ASSERT_EQ(oldKey.size(), newKey.size());
        auto at = std::search(bytes.begin(), bytes.end(), oldKey.begin(), oldKey.end());
        ASSERT_NE(at, bytes.end());
        std::copy(newKey.begin(), newKey.end(), at);
        CArchive reader = CArchive::ForReading(bytes);
        std::unique_ptr<CSxMolX> loaded;
        reader.XPointer(loaded);
        EXPECT_EQ(loaded->Key(), newKey);
    }
    CSxMolX later;
    EXPECT_NE(later.Key(), Hex(next));
    EXPECT_NE(later.Key(), Hex(next + 1));
}

TEST(MoleculeKeys, EntryTakesKeyNameAndSequence) {
    CSxMolX molecule(kKindProtein);
    molecule.SetName("m");
    molecule.SetSequence("mk");
    CSxMolEntry entry = MolEntryOf(&molecule);
    EXPECT_EQ(entry, CSxMolEntry(molecule.Key(), "m", "mk"));
    molecule.SetName("renamed");
    EXPECT_EQ(entry.Name(), "m");
    EXPECT_EQ(MolEntryOf(nullptr), CSxMolEntry());
}

TEST(MoleculeList, LookupsRenameAndDelete) {
    CMolList list(kTypeProtein);
    for (const char* name : {"a", "b", "a"}) {
        auto molecule = std::make_unique<CSxMolX>(kKindProtein);
        molecule->SetName(name);
        list.Append(std::move(molecule));
    }
    EXPECT_EQ(list.IndexOfName("a"), 0);
    EXPECT_EQ(list.IndexOfName("A"), -1);
    EXPECT_EQ(list.At(3), nullptr);
    EXPECT_EQ(list.At(-1), nullptr);
    EXPECT_EQ(list.FindByKey(list.At(1)->Key()), list.At(1));
    EXPECT_EQ(list.FindByKey("nope"), nullptr);

    CRecordingPrompt prompt;
    EXPECT_FALSE(list.Rename("b", "a", prompt));
    ASSERT_EQ(prompt.Messages().size(), 1u);
    EXPECT_EQ(prompt.Messages()[0].text,
              "Illegal name. Molecule with the name \"a\" already exists in the project.");
    EXPECT_TRUE(list.Rename("b", "b", prompt));
    EXPECT_TRUE(list.Rename("b", "c", prompt));
    EXPECT_EQ(list.At(1)->Name(), "c");
    EXPECT_FALSE(list.Rename("zz", "y", prompt));

    std::string secondKey = list.At(2)->Key();
    list.DeleteByName("a");
    EXPECT_EQ(list.Count(), 2);
    EXPECT_EQ(list.At(1)->Key(), secondKey);
    list.DeleteByName("missing");
    EXPECT_EQ(list.Count(), 2);

    CMolList copy(list);
    ASSERT_EQ(copy.Count(), 2);
    EXPECT_EQ(copy.MolType(), kTypeProtein);
    for (int i = 0; i < 2; ++i) {
        EXPECT_EQ(copy.At(i)->Name(), list.At(i)->Name());
        EXPECT_NE(copy.At(i)->Key(), list.At(i)->Key());
    }
}

TEST(MoleculeList, StoresTypeAndMolecules) {
    auto list = std::make_unique<CMolList>(kTypeNucleic);
    list->Append(std::make_unique<CSxMolX>(FullMolecule()));
    std::string key = list->At(0)->Key();
    std::unique_ptr<CMolList> loaded = StoreAndLoad<CMolList>(std::move(list));
    ASSERT_EQ(loaded->Count(), 1);
    EXPECT_EQ(loaded->MolType(), kTypeNucleic);
    EXPECT_EQ(loaded->At(0)->Key(), key);
    EXPECT_TRUE(loaded->At(0)->SameContent(FullMolecule()));
}

TEST(MoleculeList, PlainMoleculeRecordsBecomeProjectMolecules) {
    auto plain = std::make_unique<CPlainMolList>();
    plain->molecules.push_back(std::make_unique<CSxMol>(FullMolecule()));
    plain->molecules.push_back(nullptr);
    std::unique_ptr<CMolList> loaded = StoreAndLoad<CMolList>(std::move(plain));
    ASSERT_EQ(loaded->Count(), 1);
    EXPECT_TRUE(loaded->At(0)->SameContent(FullMolecule()));
    EXPECT_FALSE(loaded->At(0)->Key().empty());
}

TEST(MoleculeList, ClassifiesFiles) {
    CScratchDir dir;
    CArchive project = CArchive::ForWriting();
    std::string tag = "BlockProject";
    project.XMember(tag);
    std::string projectPath = dir.Write("p.bpr", "");
    WriteFileAtomically(projectPath, project.Bytes());
    EXPECT_EQ(CMolList::ClassifyFile(projectPath), CMolList::kFileBlockProject);
    EXPECT_EQ(CMolList::ClassifyFile(SequenceFixture("genbank_nucleic.gb")),
              CMolList::kFileSequences);
    EXPECT_EQ(CMolList::ClassifyFile(dir.Write("a.fa", ">a\nMK\n")), CMolList::kFileSequences);
    EXPECT_EQ(CMolList::ClassifyFile(dir.Write("s.txt", "@551656AS34@\n")),
              CMolList::kFileSequences);
    EXPECT_EQ(CMolList::ClassifyFile(dir.Write("raw.txt", "MKVL\n")), CMolList::kFileOther);
    EXPECT_EQ(CMolList::ClassifyFile(dir.Write("bin", std::string("\x07\x00\x01", 3))),
              CMolList::kFileOther);
    EXPECT_EQ(CMolList::ClassifyFile("/nonexistent/tb"), CMolList::kFileOther);
}

TEST(MoleculeList, BlockListEntryStoresBothStrings) {
    auto entry = std::make_unique<CBlockListEntry>("first", "second");
    std::unique_ptr<CBlockListEntry> loaded = StoreAndLoad<CBlockListEntry>(std::move(entry));
    EXPECT_EQ(loaded->First(), "first");
    EXPECT_EQ(loaded->Second(), "second");
}

}  // namespace
