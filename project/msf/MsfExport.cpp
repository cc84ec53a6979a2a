#include "msf/MsfExport.h"

#include <algorithm>
#include <cctype>
#include <cstdio>

#include "archive/FileIO.h"
#include "layout/AlignmentLayout.h"

namespace {

// printf-style formatting into a std::string.
template <class... Args>
std::string Format(const char* format, Args... args) {
    const int size = std::snprintf(nullptr, 0, format, args...);
    std::string text(static_cast<std::size_t>(size) + 1, '\0');
    std::snprintf(text.data(), text.size(), format, args...);
    text.pop_back();
    return text;
}

}  // namespace

int GcgChecksum(std::string_view sequence) {
    long long sum = 0;
    for (std::size_t i = 0; i < sequence.size(); ++i) {
        const char c = sequence[i] == '-' ? '.' : sequence[i];
        sum += static_cast<long long>(i % 57 + 1) * std::toupper(static_cast<unsigned char>(c));
        sum %= 10000;
    }
    return static_cast<int>(sum);
}

std::string MsfWriteErrorMessage(const std::string& path) {
    return "Error opening '" + path + "' file";
}

void CMsfExport::Reset() {
    *this = CMsfExport();
}

void CMsfExport::Build(const CAlignmentLayout& layout, int entryCount) {
    Reset();
    m_valid = true;
    m_length = layout.ColumnCount();
    for (int entry = 0; entry < entryCount; ++entry) {
        const int row = layout.RowOfEntry(entry);
        if (row < 0)
            continue;
        m_entries.push_back({layout.RowAt(row).name, layout.DisplaySeqOf(row).Text(),
                             static_cast<int>(m_entries.size()), 0});
    }
}

void CMsfExport::SetAlignment(int length, std::vector<MSF_ENTRY> entries) {
    Reset();
    m_valid = true;
    m_length = length;
    m_entries = std::move(entries);
    for (std::size_t i = 0; i < m_entries.size(); ++i)
        m_entries[i].index = static_cast<int>(i);
}

bool CMsfExport::IsWritable() const {
    return m_valid && m_length != 0 && m_sequenceType == 'P' && !m_entries.empty();
}

void CMsfExport::Normalise() {
    for (MSF_ENTRY& entry : m_entries) {
        std::string& sequence = entry.sequence;
        std::transform(sequence.begin(), sequence.end(), sequence.begin(),
                       [](unsigned char c) { return static_cast<char>(std::toupper(c)); });
        if (static_cast<int>(sequence.size()) < m_length)
            sequence.resize(m_length, '-');
        std::replace(sequence.begin(), sequence.end(), '-', '.');
        std::replace(entry.name.begin(), entry.name.end(), ' ', '_');
    }
}

void CMsfExport::ComputeChecks() {
    int total = 0;
    for (MSF_ENTRY& entry : m_entries) {
        entry.check = GcgChecksum(entry.sequence);
        total = (total + entry.check) % 10000;
    }
    m_totalCheck = total;
}

std::string CMsfExport::Write() {
    Normalise();
    ComputeChecks();
    return Layout();
}

std::string CMsfExport::Layout() const {
    int nameWidth = 0;
    for (const MSF_ENTRY& entry : m_entries) {
        nameWidth = std::max(nameWidth, static_cast<int>(entry.name.size()));
    }
    std::string text = "PileUp\n\n";
    text += Format("   MSF: %d   Type: %c   Check: %d   ..\n\n", m_length, m_sequenceType,
                   m_totalCheck);
    for (const MSF_ENTRY& entry : m_entries) {
        text += " Name: " + entry.name;
        text += Format(" \tLen: %d\tCheck: %d\tWeight: 0\n", m_length, entry.check);
    }
    text += "\n//\n\n";
    // Five groups of ten residues per line, whatever the block width.
    constexpr int kResiduesPerLine = 50;
    const int blocks = (m_length + m_blockWidth - 1) / m_blockWidth;
    for (int b = 0; b < blocks; ++b) {
        const int start = b * m_blockWidth;
        const int columns = std::min(m_blockWidth, m_length - start);
        std::string line = Format("%*s%d", nameWidth + 2, "", start + 1);
        if (columns > 10) {
            const int end = std::min((b + 1) * m_blockWidth, m_length);
            const int field = columns + nameWidth + 6 - static_cast<int>(line.size());
            line += Format("%*d", field, end);
        }
        text += line + "\n";
        for (const MSF_ENTRY& entry : m_entries) {
            text += Format("%*s ", nameWidth, entry.name.c_str());
            const int size = static_cast<int>(entry.sequence.size());
            for (int j = 0; start + j < size && j < kResiduesPerLine; j += 10) {
                text += " " + entry.sequence.substr(start + j, 10);
            }
            text += "\n";
        }
        text += "\n";
    }
    return text;
}

void CMsfExport::Save(const std::string& path) {
    WriteFileAtomically(path, Write());
}
