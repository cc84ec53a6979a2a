#pragma once
// Source addresses from the ".url" file that may sit next to a sequence file: an
// internet-shortcut settings file whose [Pair] section names the size ("Length") and the
// modification time ("Time", seconds since 1970) of the file it belongs to. Only when both
// match is its [InternetShortcut] section read: "URL" for the first molecule, "URL1",
// "URL2" ... for the next ones.

#include <map>
#include <string>

class CUrlCompanion {
  public:
    // Reads `sequenceFile` + ".url" when it exists and matches the file.
    explicit CUrlCompanion(const std::string& sequenceFile);
    // The address of the molecule with that 0-based index in the file; empty when none.
    std::string UrlOf(int index) const;

  private:
    std::map<std::string, std::string> m_shortcut;  // entries of [InternetShortcut]
};
