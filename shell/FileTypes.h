#pragma once
// File types the Linux way: a desktop entry for the program and shared-mime-info types for
// block projects (".bpr") and templates (".bp1") in the user's data folder, rewritten at every
// start. A default application the user already has for a type is left alone.

#include <QString>
#include <QStringList>

class CFileTypes {
  public:
    static constexpr char kProjectType[] = "application/x-qrbo-blockprj";
    static constexpr char kTemplateType[] = "application/x-qrbo-blockpt";
    static constexpr char kDesktopFileName[] = "tiler-blocks.desktop";

    // Writes the desktop entry, the MIME types and the icon, and makes the program the default
    // for the two types where none is set. Returns false when a file could not be written.
    static bool Register(const QString& programPath);

    static QString DesktopEntry(const QString& programPath);
    static QString MimeTypesXml();
    // Adds "type=desktopFile" to the [Default Applications] group of a mimeapps.list text for
    // every type that has no entry there yet; the rest of the text stays as it was.
    static QString WithDefaults(const QString& mimeApps, const QStringList& types,
                                const QString& desktopFile);
};
