#include "StatTable.h"

#include <unordered_map>

namespace {

// Entries set one after another as Set() does, in time linear in their number.
class CEntryBuilder {
  public:
    void Set(const CStatConst& entry) {
        const CStatConst copy(entry.sequences, entry.lambda, entry.k, entry.marked != 0);
        const auto [found, added] = m_indexOf.emplace(entry.sequences, m_entries.size());
        if (added) {
            m_entries.push_back(std::make_unique<CStatConst>(copy));
        } else {
            *m_entries[found->second] = copy;
        }
    }
    CStatSerialArray Take() { return std::move(m_entries); }

  private:
    CStatSerialArray m_entries;
    std::unordered_map<std::int32_t, std::size_t> m_indexOf;
};

}  // namespace

void CStatConst::Serialize(CArchive& ar) {
    ar.XMember(sequences);
    ar.XMember(lambda);
    ar.XMember(k);
    ar.XMember(marked);
}

void CStatSerialArray::Serialize(CArchive& ar) {
    std::size_t count = size();
    ar.XCount(count, 1);
    if (ar.IsStoring()) {
        for (auto& constant : *this)
            ar.XPointer(constant);
        return;
    }
    clear();
    for (std::size_t i = 0; i < count; ++i) {
        std::unique_ptr<CStatConst> constant;
        ar.XPointer(constant);
        // A null slot carries no constants; keeping it would only give lookups a hole.
        if (constant)
            push_back(std::move(constant));
    }
}

CStatTable::CStatTable(const CStatTable& other) {
    *this = other;
}

CStatTable& CStatTable::operator=(const CStatTable& other) {
    if (this == &other)
        return *this;
    CEntryBuilder builder;
    for (const auto& entry : other.m_constants)
        builder.Set(*entry);
    m_constants = builder.Take();
    m_reference = other.m_reference;
    return *this;
}

bool CStatTable::Lookup(std::int32_t sequences, double& lambda, double& k) const {
    for (const auto& entry : m_constants) {
        if (entry->sequences == sequences) {
            lambda = entry->lambda;
            k = entry->k;
            return true;
        }
    }
    return false;
}

void CStatTable::Set(std::int32_t sequences, double lambda, double k, bool marked) {
    for (auto& entry : m_constants) {
        if (entry->sequences == sequences) {
            *entry = CStatConst(sequences, lambda, k, marked);
            return;
        }
    }
    m_constants.push_back(std::make_unique<CStatConst>(sequences, lambda, k, marked));
}

void CStatTable::Clear() {
    m_constants.clear();
}

void CStatTable::AppendText(std::string& out) const {
    if (IsEmpty())
        return;
    out += "\n";
    AppendCommentLines(out, m_reference);
    out += "#\tm\tlambda\tK\n";
    for (const auto& entry : m_constants) {
        out += "\t" + std::to_string(entry->sequences) + "\t" + FixedNumber(entry->lambda, 4) +
               "\t" + FixedNumber(entry->k, 4);
        if (entry->marked)
            out += "\t*";
        out += "\n";
    }
}

std::string CStatTable::ParseTextLine(std::string_view line, CStatConst& entry) {
    const std::vector<std::string_view> tokens = SplitTokens(line);
    if (tokens.size() < 3)
        return "a statistics line needs the number of sequences, lambda and K";
    std::int32_t sequences = 0;
    if (ParseInteger(tokens[0], sequences) != NumberParse::ok || sequences < 1) {
        return "the number of sequences \"" + std::string(tokens[0]) +
               "\" is not a whole number from 1 to 2147483647";
    }
    double constants[2] = {};
    const char* names[2] = {"lambda", "K"};
    for (int i = 0; i < 2; ++i) {
        const std::string_view token = tokens[1 + i];
        if (!ParseNumber(token, constants[i]) || constants[i] < 0) {
            return std::string(names[i]) + " \"" + std::string(token) +
                   "\" is not a number of 0 or more";
        }
    }
    const bool marked = tokens.size() > 3 && tokens[3].find('*') != std::string_view::npos;
    entry = CStatConst(sequences, constants[0], constants[1], marked);
    return {};
}

bool CStatTable::ReadTextLines(const std::vector<CTextLine>& lines, std::string& error) {
    CEntryBuilder builder;
    for (const CTextLine& line : lines) {
        CStatConst entry;
        if (std::string why = ParseTextLine(line.text, entry); !why.empty()) {
            error = "line " + std::to_string(line.number) + ": " + why;
            return false;
        }
        builder.Set(entry);
    }
    m_constants = builder.Take();
    return true;
}

void CStatTable::Serialize(CArchive& ar) {
    if (ar.IsLoading())
        Clear();
    ar.XData(m_constants);
    ar.XMember(m_reference);
}

TB_REGISTER_CLASS(CStatConst);
TB_REGISTER_CLASS(CStatSerialArray);
TB_REGISTER_CLASS(CStatTable);
