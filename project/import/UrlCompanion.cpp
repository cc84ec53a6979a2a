#include "import/UrlCompanion.h"

#include <sys/stat.h>

#include "import/SeqText.h"
#include "import/SxStream.h"

namespace {

using CIniFile = std::map<std::string, std::map<std::string, std::string>>;

CIniFile ReadIni(const std::string& path) {
    CIniFile ini;
    CSxStream stream("");
    try {
        stream = CSxStream::FromFile(path);
    } catch (const std::exception&) {
        return ini;
    }
    std::string section;
    std::string line;
    while (stream.ReadLine(line)) {
        std::string text = Trim(line);
        if (text.size() >= 2 && text.front() == '[' && text.back() == ']') {
            section = ToLower(text.substr(1, text.size() - 2));
            continue;
        }
        std::size_t equals = text.find('=');
        if (equals == std::string::npos)
            continue;
        ini[section][ToLower(Trim(text.substr(0, equals)))] = Trim(text.substr(equals + 1));
    }
    return ini;
}

std::string Entry(const CIniFile& ini, const std::string& section, const std::string& key) {
    auto s = ini.find(section);
    if (s == ini.end())
        return {};
    auto k = s->second.find(key);
    return k == s->second.end() ? std::string() : k->second;
}

}  // namespace

CUrlCompanion::CUrlCompanion(const std::string& sequenceFile) {
    struct stat info {};
    if (::stat(sequenceFile.c_str(), &info) != 0)
        return;
    CIniFile ini = ReadIni(sequenceFile + ".url");
    if (Entry(ini, "pair", "length") != std::to_string(info.st_size) ||
        Entry(ini, "pair", "time") != std::to_string(info.st_mtime)) {
        return;
    }
    auto shortcut = ini.find("internetshortcut");
    if (shortcut != ini.end())
        m_shortcut = shortcut->second;
}

std::string CUrlCompanion::UrlOf(int index) const {
    std::string key = index == 0 ? "url" : "url" + std::to_string(index);
    auto found = m_shortcut.find(key);
    return found == m_shortcut.end() ? std::string() : found->second;
}
