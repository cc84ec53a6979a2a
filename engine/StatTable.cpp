#include "StatTable.h"

#include "TextTokens.h"

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
    Clear();
    for (const auto& entry : other.m_constants) {
        Set(entry->sequences, entry->lambda, entry->k, entry->marked != 0);
    }
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

bool CStatTable::ReadTextLine(std::string_view line) {
    const std::vector<std::string_view> tokens = SplitTokens(line);
    if (tokens.size() < 3)
        return false;
    const std::optional<std::int32_t> sequences = LeadingInteger(tokens[0]);
    if (!sequences)
        return false;
    const bool marked = tokens.size() > 3 && tokens[3].find('*') != std::string_view::npos;
    Set(*sequences, LeadingNumber(tokens[1]), LeadingNumber(tokens[2]), marked);
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
