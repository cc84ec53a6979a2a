#pragma once
// The help module is a small library loaded by name when help is first asked for; it opens the
// manual that comes with the program. The library stays loaded once a call succeeded.

#include <QString>

class CHelpModule {
  public:
    // Opens the manual's contents; false when the library could not be loaded.
    static bool OpenHelpFile(const char* helpKey, const char* title);
    // Opens one page of the manual ("index.html", ...).
    static bool OpenHelpPage(const QString& page);
    // Where the library was found; empty before the first successful load.
    static QString LoadedPath();
};
