#pragma once
// The molecule record: name, kind, sequence and the description that the sequence readers fill
// from database entries and the writers put back into flat files.

#include <string>
#include <vector>

#include "archive/Archive.h"

// Molecule kinds a record can have.
enum MoleculeKind { kKindUnknown = 0, kKindNucleic = 1, kKindProtein = 2 };

// Who made or last changed the record, and when (free text date).
struct CSxStamp {
    std::string name;
    std::string date;

    void Serialize(CArchive& ar);
    bool operator==(const CSxStamp&) const = default;
};

// A literature reference of a database entry.
struct CSxReference {
    int number = 0;
    std::string positions;  // what the reference covers, as the entry words it
    std::string comment;    // remark on the reference
    std::string authors;
    std::string title;
    std::string journal;
    std::string pubmed;   // PubMed id, digits
    std::string medline;  // MEDLINE id, digits

    void Serialize(CArchive& ar);
    bool operator==(const CSxReference&) const = default;
};

struct CSxQualifier {
    std::string name;      // without the leading '/'
    std::string value;     // without quotes; empty for a qualifier without value
    bool hasValue = true;  // "/name=value" rather than "/name"
    bool quoted = true;    // the value is written in double quotes

    void Serialize(CArchive& ar);
    bool operator==(const CSxQualifier&) const = default;
};

// One entry of a feature table.
struct CSxFeature {
    std::string key;       // "CDS", "source", "DOMAIN" ...
    std::string location;  // the location text as written ("complement(join(1..5,9..20))")
    int start = 0;         // first and last position the location names; 0 when none
    int end = 0;
    bool complement = false;  // on the complementary strand
    std::vector<CSxQualifier> qualifiers;

    // Sets the location text and derives start, end and strand from it.
    void SetLocation(const std::string& text);
    void Serialize(CArchive& ar);
    bool operator==(const CSxFeature&) const = default;
};

// The annotation a database entry carries.
struct CSxDescription {
    std::string definition;
    std::vector<std::string> accessions;
    std::vector<std::string> keywords;
    std::string database;      // "GenBank", "GenPept", "EMBL", "SWISS-PROT"
    std::string division;      // database division ("PRI", "BCT" ...)
    std::string moleculeType;  // nucleic acids: "DNA", "mRNA" ...
    std::string dbDate;        // last modification date in the source database
    std::string sequenceSource;
    std::string organism;
    std::vector<std::string> taxonomy;  // lineage, kingdom first
    std::vector<std::string> dbLinks;   // cross references, one per line ("EMBL; V00488; ...")
    std::vector<std::string> comments;  // comment lines as written
    std::vector<CSxReference> references;
    std::vector<CSxFeature> features;

    void Serialize(CArchive& ar);
    bool operator==(const CSxDescription&) const = default;
};

// The molecule record ("Molecule" in files).
class CSxMol : public CSerializable {
  public:
    TB_CLASS_TAG("Molecule")
    CSxMol() = default;
    explicit CSxMol(int kind);

    const std::string& Name() const { return m_name; }
    void SetName(std::string name) { m_name = std::move(name); }
    int Kind() const { return m_kind; }
    void SetKind(int kind);
    // 2 for proteins, 0 otherwise.
    int ProteinClass() const { return m_proteinClass; }
    bool IsLinear() const { return m_linear; }
    void SetLinear(bool linear) { m_linear = linear; }
    // Lower-case residues, no blanks or digits.
    const std::string& Sequence() const { return m_sequence; }
    void SetSequence(std::string sequence) { m_sequence = std::move(sequence); }
    int SequenceLength() const { return static_cast<int>(m_sequence.size()); }
    const std::string& SourceUrl() const { return m_sourceUrl; }
    void SetSourceUrl(std::string url) { m_sourceUrl = std::move(url); }

    CSxStamp& Creator() { return m_creator; }
    const CSxStamp& Creator() const { return m_creator; }
    CSxStamp& Modifier() { return m_modifier; }
    const CSxStamp& Modifier() const { return m_modifier; }
    CSxDescription& Description() { return m_description; }
    const CSxDescription& Description() const { return m_description; }

    // Empties every field except the kind, as readers do before parsing: linear, and the
    // protein class follows the kind.
    void ClearForReading();

    void Serialize(CArchive& ar) override;
    bool SameContent(const CSxMol& other) const;

  private:
    std::string m_name;
    int m_kind = kKindUnknown;
    int m_proteinClass = 0;
    bool m_linear = false;
    std::string m_sequence;
    std::string m_sourceUrl;
    CSxStamp m_creator;
    CSxStamp m_modifier;
    CSxDescription m_description;
};
