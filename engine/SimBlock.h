#pragma once
// A conserved block: an ungapped stretch of equal width in several molecules, with its
// sum-of-pairs score. A block keeps the layout the search found (original) and the layout the
// user edited (current): members may be left out of the current layout and its starts, width and
// score may differ.

#include <cstdint>
#include <span>
#include <string>
#include <utility>
#include <vector>

#include "SerialArrays.h"
#include "archive/Archive.h"

class CScoreMatrix;
class CSxMolEntry;
class CSxMolEntrySerialList;

class CSimBlock : public CSerializable {
  public:
    TB_CLASS_TAG("SimBlock")

    enum Layout { kOriginal = 0, kCurrent = 1 };

    // A block with a new identifier, no members, empty name and no colour.
    CSimBlock();
    // The same without an identifier until TakeNewIdentifier(): blocks made on several threads
    // take theirs in the order the search makes them.
    struct CDeferredIdentifier {};
    explicit CSimBlock(CDeferredIdentifier) : m_identifier(0) {}
    void TakeNewIdentifier();
    // Copies keep the identifier: links and coloured ranges find the copy by it.
    CSimBlock(const CSimBlock&) = default;
    CSimBlock& operator=(const CSimBlock&) = default;

    // Sets the original layout (members are molecule-entry indices in increasing order, starts
    // are 0-based positions) and the flag, then resets the current layout to it.
    void Init(std::span<const std::int32_t> members, std::span<const std::int32_t> starts,
              int width, int score, int flag);
    // The same, taking the arrays over (a search makes blocks by the ten thousand).
    void Init(std::vector<std::int32_t>&& members, std::vector<std::int32_t>&& starts, int width,
              int score, int flag);
    // Current starts, width and score become the original ones; every member is included.
    void ResetCurrentLayout();

    int Identifier() const { return m_identifier; }
    int Flag() const { return m_flag; }
    void SetFlag(int flag) { m_flag = flag; }
    const std::string& Name() const { return m_name; }
    void SetName(std::string name) { m_name = std::move(name); }
    std::uint32_t Colour() const { return m_colour; }
    void SetColour(std::uint32_t colour) { m_colour = colour; }

    int Reserved(Layout layout) const { return m_reserved[layout]; }
    int Width(Layout layout) const { return m_width[layout]; }
    int Score(Layout layout) const { return m_score[layout]; }
    void SetCurrentWidth(int width) { m_width[kCurrent] = width; }
    void SetCurrentScore(int score) { m_score[kCurrent] = score; }

    // Members of the original layout; the current layout holds those that are included.
    int MemberCount() const { return static_cast<int>(m_members.size()); }
    int Member(int index) const { return m_members[index]; }
    int Start(Layout layout, int index) const;
    bool IsIncluded(int index) const { return m_included[index] != 0; }
    void SetCurrentStart(int index, int start) { m_currentStarts[index] = start; }
    void SetIncluded(int index, bool included) { m_included[index] = included ? 1 : 0; }
    const CIntSerialArray& Members() const { return m_members; }
    const CIntSerialArray& OriginalStarts() const { return m_originalStarts; }
    const CIntSerialArray& CurrentStarts() const { return m_currentStarts; }
    const CBoolSerialArray& Included() const { return m_included; }
    // Member indices above `removedIndex` are lowered by one (an entry before them was removed).
    void ShiftMembersAbove(int removedIndex);
    // Whether member `index` belongs to the layout (every member belongs to the original one).
    bool InLayout(Layout layout, int index) const;

    // Original: number of members; current: number of included members.
    int SequenceCount(Layout layout) const;
    // Largest start of the layout's members; 0 when it has none.
    int HighestStart(Layout layout) const;
    // Smallest start of the layout's members; -1 when it has none.
    int LowestStart(Layout layout) const;
    // The "MP-score": score / (n(n-1)/2) for the layout's n sequences; 0.0 when n <= 1.
    double MeanPairScore(Layout layout) const;

    // The layout's sum-of-pairs score recomputed from molecule texts. The molecules are encoded
    // against the matrix alphabet in list order, skipping those that do not encode; member
    // indices then index the encoded ones. Residue pairs that fall outside a sequence (or
    // members without a molecule) add nothing.
    int LayoutScore(Layout layout, const CSxMolEntrySerialList& molecules,
                    const CScoreMatrix& matrix, int shift) const;
    int LayoutScore(Layout layout, const std::vector<CSxMolEntry>& molecules,
                    const CScoreMatrix& matrix, int shift) const;

    // Same width, score and starts in both layouts, and every member included.
    bool IsUnedited() const;
    // Every field equal: identifier, flag, name, colour, both layouts and all four arrays.
    bool operator==(const CSimBlock& other) const;
    // The block-set order: more original members (as 16-bit counts), or as many and a higher
    // original score.
    bool IsGreater(const CSimBlock& other) const { return OrderKey() > other.OrderKey(); }
    // A number that orders blocks as IsGreater() does.
    std::int64_t OrderKey() const;

    void Serialize(CArchive& ar) override;

    // Makes sure identifiers handed out from now on are above `identifier` (used for blocks
    // read from files, so new blocks never collide with them).
    static void ReserveIdentifier(int identifier);

  private:
    int LayoutScoreOfSequences(Layout layout, const std::vector<const std::string*>& sequences,
                               const CScoreMatrix& matrix, int shift) const;

    std::int32_t m_identifier;
    std::int16_t m_reserved[2] = {0, 0};
    std::int32_t m_width[2] = {0, 0};
    std::int32_t m_score[2] = {0, 0};
    std::int32_t m_flag = 0;
    std::string m_name;
    std::uint32_t m_colour = kNoColour;
    CIntSerialArray m_members;
    CIntSerialArray m_originalStarts;
    CIntSerialArray m_currentStarts;
    CBoolSerialArray m_included;
};

// A range of sequence positions that belongs to a block (base of the coloured row ranges).
class CSimSegment {
  public:
    CSimSegment() = default;
    CSimSegment(int blockIdentifier, int start, int length)
        : m_blockIdentifier(blockIdentifier), m_length(length), m_start(start) {}
    virtual ~CSimSegment() = default;

    int BlockIdentifier() const { return m_blockIdentifier; }
    int Length() const { return m_length; }
    int Start() const { return m_start; }
    bool Contains(int position) const {
        return position >= 0 && position >= m_start && position < m_start + m_length;
    }
    // First and last position (inclusive).
    std::pair<int, int> Range() const { return {m_start, m_start + m_length - 1}; }

  private:
    int m_blockIdentifier = 0;
    int m_length = 0;
    int m_start = 0;
};
