#pragma once
// The project's parameter record: the search values, the alignment's text colours, the block
// colour palette and the score matrix. Stored inside projects and as template files (".bp1").

#include <cstdint>
#include <span>
#include <string>
#include <vector>

#include "ScoreMatrix.h"
#include "SerialArrays.h"
#include "SimBlockParameters.h"
#include "UserPrompt.h"

class CQuilterParams : public CSerializable {
  public:
    TB_CLASS_TAG("QuilterParams")
    // The leading string of a template file.
    static constexpr const char* kTemplateTag = "BlockTemplate";
    // The block colour when the palette is empty: palette-relative red.
    static constexpr std::uint32_t kEmptyPaletteColour = 0x020000FF;

    // The defaults (see SetDefaults) with an empty palette.
    CQuilterParams();

    // The built-in "blosum62mt", its default cutoff, minimum 5 sequences, expectation limit
    // 0.0001 and no text colours. The palette is left as it is.
    void SetDefaults();
    // Sets the cutoff to the matrix's default cutoff; kept when the matrix has none.
    void SetCutoffFromMatrix();

    std::int32_t Cutoff() const { return m_cutoff; }
    void SetCutoff(std::int32_t cutoff) { m_cutoff = cutoff; }
    std::int32_t MinSequences() const { return m_minSequences; }
    void SetMinSequences(std::int32_t count) { m_minSequences = count; }
    double ExpectationLimit() const { return m_expectationLimit; }
    void SetExpectationLimit(double limit) { m_expectationLimit = limit; }
    std::uint32_t TextColour() const { return m_textColour; }
    void SetTextColour(std::uint32_t colour) { m_textColour = colour; }
    std::uint32_t LinkedTextColour() const { return m_linkedTextColour; }
    void SetLinkedTextColour(std::uint32_t colour) { m_linkedTextColour = colour; }
    const CClrfSerialArray& Palette() const { return m_palette; }
    void SetPalette(std::vector<std::uint32_t> colours);
    const CScoreMatrix& Matrix() const { return m_matrix; }
    CScoreMatrix& Matrix() { return m_matrix; }
    void SetMatrix(const CScoreMatrix& matrix) { m_matrix = matrix; }

    // What the search engine reads.
    CSimBlockParameters SearchParameters() const { return {m_cutoff, m_minSequences}; }
    // Block `index` takes palette entry index modulo the palette size.
    std::uint32_t BlockColour(int index) const;

    // What reading a template file came to.
    enum TemplateOutcome { kTemplateRead, kNotTemplate, kTemplateUnreadable, kTemplateDamaged };
    // Takes the parameters of a template file, the cutoff then being the matrix's default
    // cutoff; any other outcome leaves the parameters as they were.
    TemplateOutcome ReadTemplateFile(const std::string& path);
    // The message of an outcome other than kTemplateRead.
    static std::string TemplateOutcomeMessage(TemplateOutcome outcome, const std::string& path);

    // Loads a template file. With a prompt (interactive) every failure is reported through it
    // and leaves the parameters as they were; without one (the user's default template) failures
    // are silent and give the defaults. A file of another kind is reported and keeps the
    // parameters. Whenever the file was read the cutoff becomes the matrix's default cutoff.
    // True when the file was read.
    bool LoadTemplate(const std::string& path, IUserPrompt* prompt);
    // Takes the parameters of a template file's bytes; false, with nothing changed, when the
    // bytes are not a template. Throws CArchiveException for a damaged one.
    bool ReadTemplateBytes(std::span<const std::uint8_t> bytes);
    // Writes a template file, replacing it atomically; a failure is reported through `prompt`
    // with the system's reason on a second line.
    bool SaveTemplate(const std::string& path, IUserPrompt& prompt) const;
    // The bytes of a template file holding these parameters.
    std::vector<std::uint8_t> TemplateBytes() const;

    // An expectation value limit is a positive, finite number.
    static bool IsValidExpectationLimit(double limit);

    static std::string NotTemplateMessage(const std::string& path);
    static std::string TemplateFileErrorMessage(const std::string& path);
    static std::string TemplateFormatErrorMessage(const std::string& path);

    // Cutoff, minimum, expectation limit, text colour, linked text colour, palette, matrix. A
    // matrix that cannot be read is replaced by the built-in default; values below the lower
    // limits of the cutoff and minimum, or an expectation limit that is not a positive number,
    // are a format error.
    void Serialize(CArchive& ar) override;

  private:
    std::int32_t m_cutoff = 0;
    std::int32_t m_minSequences = kDefaultMinSequences;
    double m_expectationLimit = kDefaultExpectationLimit;
    std::uint32_t m_textColour = kNoColour;
    std::uint32_t m_linkedTextColour = kNoColour;
    CClrfSerialArray m_palette;
    CScoreMatrix m_matrix;
};
