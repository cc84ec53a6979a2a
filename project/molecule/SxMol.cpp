#include "molecule/SxMol.h"

#include <cctype>

namespace {

// A counted list of embedded records. Each record needs at least 5 bytes (code and length).
template <class T>
void RecordList(CArchive& ar, std::vector<T>& list) {
    std::size_t count = list.size();
    ar.XCount(count, 5);
    if (ar.IsLoading())
        list.assign(count, T{});
    for (T& element : list)
        ar.XData(element);
}

void XInt(CArchive& ar, int& value) {
    std::int32_t stored = value;
    ar.XMember(stored);
    value = stored;
}

}  // namespace

void CSxStamp::Serialize(CArchive& ar) {
    ar.XMember(name);
    ar.XMember(date);
}

void CSxReference::Serialize(CArchive& ar) {
    XInt(ar, number);
    ar.XMember(positions);
    ar.XMember(comment);
    ar.XMember(authors);
    ar.XMember(title);
    ar.XMember(journal);
    ar.XMember(pubmed);
    ar.XMember(medline);
}

void CSxQualifier::Serialize(CArchive& ar) {
    ar.XMember(name);
    ar.XMember(value);
    ar.XMember(hasValue);
    ar.XMember(quoted);
}

void CSxFeature::SetLocation(const std::string& text) {
    location = text;
    complement = text.find("complement") != std::string::npos;
    // The first and the last number of the location are its extent.
    start = end = 0;
    bool first = true;
    for (std::size_t i = 0; i < text.size();) {
        if (!std::isdigit(static_cast<unsigned char>(text[i]))) {
            ++i;
            continue;
        }
        long long value = 0;
        for (; i < text.size() && std::isdigit(static_cast<unsigned char>(text[i])); ++i) {
            if (value < 1000000000)
                value = value * 10 + (text[i] - '0');
        }
        int position = static_cast<int>(std::min<long long>(value, 1000000000));
        if (first)
            start = position;
        end = position;
        first = false;
    }
}

void CSxFeature::Serialize(CArchive& ar) {
    ar.XMember(key);
    ar.XMember(location);
    XInt(ar, start);
    XInt(ar, end);
    ar.XMember(complement);
    RecordList(ar, qualifiers);
}

void CSxDescription::Serialize(CArchive& ar) {
    ar.XMember(definition);
    ar.XMember(accessions);
    ar.XMember(keywords);
    ar.XMember(database);
    ar.XMember(division);
    ar.XMember(moleculeType);
    ar.XMember(dbDate);
    ar.XMember(sequenceSource);
    ar.XMember(organism);
    ar.XMember(taxonomy);
    ar.XMember(dbLinks);
    ar.XMember(comments);
    RecordList(ar, references);
    RecordList(ar, features);
}

CSxMol::CSxMol(int kind) {
    SetKind(kind);
}

void CSxMol::SetKind(int kind) {
    m_kind = kind;
    m_proteinClass = kind == kKindProtein ? 2 : 0;
    m_linear = kind == kKindProtein;
}

void CSxMol::ClearForReading() {
    int kind = m_kind;
    *this = CSxMol(kind);
    m_linear = true;
}

void CSxMol::Serialize(CArchive& ar) {
    if (ar.IsLoading())
        *this = CSxMol();
    ar.XMember(m_name);
    XInt(ar, m_kind);
    XInt(ar, m_proteinClass);
    ar.XMember(m_linear);
    ar.XMember(m_sequence);
    ar.XMember(m_sourceUrl);
    ar.XData(m_creator);
    ar.XData(m_modifier);
    ar.XData(m_description);
}

bool CSxMol::SameContent(const CSxMol& other) const {
    return m_name == other.m_name && m_kind == other.m_kind &&
           m_proteinClass == other.m_proteinClass && m_linear == other.m_linear &&
           m_sequence == other.m_sequence && m_sourceUrl == other.m_sourceUrl &&
           m_creator == other.m_creator && m_modifier == other.m_modifier &&
           m_description == other.m_description;
}

TB_REGISTER_CLASS(CSxMol);
