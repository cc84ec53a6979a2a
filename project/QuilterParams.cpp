#include "QuilterParams.h"

#include <cmath>
#include <filesystem>
#include <memory>

#include "archive/FileIO.h"

namespace {

// Templates are small; anything larger is not one of ours.
constexpr std::size_t kMaxTemplateBytes = std::size_t{64} << 20;

}  // namespace

CQuilterParams::CQuilterParams() {
    SetDefaults();
}

void CQuilterParams::SetDefaults() {
    m_matrix = CScoreMatrix::Default();
    SetCutoffFromMatrix();
    m_minSequences = kDefaultMinSequences;
    m_expectationLimit = kDefaultExpectationLimit;
    m_textColour = kNoColour;
    m_linkedTextColour = kNoColour;
}

void CQuilterParams::SetCutoffFromMatrix() {
    if (std::optional<int> cutoff = m_matrix.DefaultCutoff())
        m_cutoff = *cutoff;
}

void CQuilterParams::SetPalette(std::vector<std::uint32_t> colours) {
    m_palette.assign(colours.begin(), colours.end());
}

std::uint32_t CQuilterParams::BlockColour(int index) const {
    if (m_palette.empty())
        return kEmptyPaletteColour;
    const int size = static_cast<int>(m_palette.size());
    return m_palette[((index % size) + size) % size];
}

bool CQuilterParams::IsValidExpectationLimit(double limit) {
    return std::isfinite(limit) && limit > 0;
}

std::string CQuilterParams::NotTemplateMessage(const std::string& path) {
    return "File '" + path + "' is not a quilter template";
}

std::string CQuilterParams::TemplateFileErrorMessage(const std::string& path) {
    return "Error opening template '" + path + "' file";
}

std::string CQuilterParams::TemplateFormatErrorMessage(const std::string& path) {
    return "Error loading alignment template '" + path + "'";
}

CQuilterParams::TemplateOutcome CQuilterParams::ReadTemplateFile(const std::string& path) {
    std::error_code error;
    if (!std::filesystem::exists(path, error))
        return kTemplateUnreadable;
    try {
        if (!ReadTemplateBytes(ReadWholeFile(path, kMaxTemplateBytes)))
            return kNotTemplate;
        SetCutoffFromMatrix();
        return kTemplateRead;
    } catch (const CFileException&) {
        return kTemplateUnreadable;
    } catch (const CArchiveException&) {
        return kTemplateDamaged;
    }
}

std::string CQuilterParams::TemplateOutcomeMessage(TemplateOutcome outcome,
                                                   const std::string& path) {
    switch (outcome) {
        case kNotTemplate:
            return NotTemplateMessage(path);
        case kTemplateUnreadable:
            return TemplateFileErrorMessage(path);
        case kTemplateDamaged:
            return TemplateFormatErrorMessage(path);
        default:
            return "";
    }
}

bool CQuilterParams::LoadTemplate(const std::string& path, IUserPrompt* prompt) {
    const TemplateOutcome outcome = ReadTemplateFile(path);
    if (outcome == kTemplateRead)
        return true;
    const std::string message = TemplateOutcomeMessage(outcome, path);
    if (outcome == kNotTemplate) {
        if (prompt)
            prompt->ShowMessage(message, MessageIcon::exclamation);
        SetCutoffFromMatrix();
        return true;
    }
    if (prompt) {
        prompt->ShowMessage(message, MessageIcon::exclamation);
    } else {
        SetDefaults();
    }
    return false;
}

bool CQuilterParams::ReadTemplateBytes(std::span<const std::uint8_t> bytes) {
    std::unique_ptr<CQuilterParams> read =
        CArchive::ReadSigned<CQuilterParams>(bytes, kTemplateTag);
    if (!read)
        return false;
    *this = *read;
    return true;
}

std::vector<std::uint8_t> CQuilterParams::TemplateBytes() const {
    CArchive ar = CArchive::ForWriting();
    std::string tag = kTemplateTag;
    ar.XMember(tag);
    auto copy = std::make_unique<CQuilterParams>(*this);
    ar.XPointer(copy);
    return ar.Bytes();
}

bool CQuilterParams::SaveTemplate(const std::string& path, IUserPrompt& prompt) const {
    try {
        WriteFileAtomically(path, TemplateBytes());
        return true;
    } catch (const CFileException& e) {
        prompt.ShowMessage(TemplateFileErrorMessage(path) + "\n" + e.Reason(),
                           MessageIcon::exclamation);
        return false;
    }
}

void CQuilterParams::Serialize(CArchive& ar) {
    ar.XMember(m_cutoff);
    ar.XMember(m_minSequences);
    ar.XMember(m_expectationLimit);
    ar.XMember(m_textColour);
    ar.XMember(m_linkedTextColour);
    ar.XData(m_palette);
    if (!ar.XDataContained(m_matrix) || (ar.IsLoading() && !m_matrix.IsValid())) {
        m_matrix = CScoreMatrix::Default();
    }
    if (ar.IsLoading() && (m_cutoff < kMinCutoff || m_minSequences < kMinMinSequences ||
                           !IsValidExpectationLimit(m_expectationLimit))) {
        throw CArchiveException(CArchiveException::genericError,
                                "search values outside their limits");
    }
}

TB_REGISTER_CLASS(CQuilterParams);
