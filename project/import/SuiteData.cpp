#include "import/SuiteData.h"

#include "import/SeqText.h"

namespace {

constexpr std::size_t kHexPerLine = 64;
constexpr char kHexDigits[] = "0123456789ABCDEF";

struct CStamps {
    CSxStamp& creator;
    CSxStamp& modifier;
    void Serialize(CArchive& ar) {
        ar.XData(creator);
        ar.XData(modifier);
    }
};

int HexValue(char c) {
    if (c >= '0' && c <= '9')
        return c - '0';
    if (c >= 'A' && c <= 'F')
        return c - 'A' + 10;
    if (c >= 'a' && c <= 'f')
        return c - 'a' + 10;
    return -1;
}

}  // namespace

std::vector<std::string> SuiteDataLines(const CSxMol& molecule) {
    CSxStamp creator = molecule.Creator();
    CSxStamp modifier = molecule.Modifier();
    CArchive ar = CArchive::ForWriting();
    CStamps stamps{creator, modifier};
    ar.XData(stamps);
    std::string hex;
    for (std::uint8_t byte : ar.Bytes()) {
        hex += kHexDigits[byte >> 4];
        hex += kHexDigits[byte & 15];
    }
    std::vector<std::string> lines;
    for (std::size_t pos = 0; pos < hex.size(); pos += kHexPerLine) {
        lines.push_back(std::string(kSuiteDataMarker) + " " + hex.substr(pos, kHexPerLine));
    }
    return lines;
}

bool TakeSuiteDataLine(std::string_view commentLine, std::string& hex) {
    std::string text = Trim(commentLine);
    if (!StartsWith(text, kSuiteDataMarker))
        return false;
    hex += Trim(std::string_view(text).substr(kSuiteDataMarker.size()));
    return true;
}

bool ReadSuiteData(const std::string& hex, CSxMol& molecule) {
    if (hex.size() % 2 != 0)
        return false;
    std::vector<std::uint8_t> bytes;
    for (std::size_t i = 0; i < hex.size(); i += 2) {
        int high = HexValue(hex[i]);
        int low = HexValue(hex[i + 1]);
        if (high < 0 || low < 0)
            return false;
        bytes.push_back(static_cast<std::uint8_t>(high * 16 + low));
    }
    CSxStamp creator;
    CSxStamp modifier;
    try {
        CArchive ar = CArchive::ForReading(bytes);
        CStamps stamps{creator, modifier};
        ar.XData(stamps);
    } catch (const CArchiveException&) {
        return false;
    }
    molecule.Creator() = creator;
    molecule.Modifier() = modifier;
    return true;
}
