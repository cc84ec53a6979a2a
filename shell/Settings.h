#pragma once
// The program's settings: an INI file of the user's configuration folder under the organisation
// "PELLAM, INC" and application "QRBO 10", everything inside the group "Tiler Blocks". Every key
// name the program uses is defined here once.

#include <QSettings>
#include <QString>
#include <QStringList>

namespace SettingsKeys {
inline constexpr char kOrganisation[] = "PELLAM, INC";
inline constexpr char kApplication[] = "QRBO 10";
inline constexpr char kProfile[] = "Tiler Blocks";

inline constexpr char kPageSetup[] = "PageSetup";
inline constexpr char kPageSizeX[] = "PageSizeX";
inline constexpr char kPageSizeY[] = "PageSizeY";
inline constexpr char kMarginL[] = "MarginL";
inline constexpr char kMarginR[] = "MarginR";
inline constexpr char kMarginT[] = "MarginT";
inline constexpr char kMarginB[] = "MarginB";
inline constexpr char kOrientation[] = "Orientation";
inline constexpr char kHeader[] = "Header";
inline constexpr char kFooter[] = "Footer";
inline constexpr char kIsMetric[] = "IsMetric";

inline constexpr char kRecentFiles[] = "Recent File List";
inline constexpr char kRecentFileEntry[] = "File%1";  // numbered from 1

inline constexpr char kMainWindowLayouts[] = "QuilterMainWnd";
inline constexpr char kLastLayout[] = "LastLayout";
inline constexpr char kMainString[] = "MainString";
inline constexpr char kSizeInfoMain[] = "SizeInfoMain";
inline constexpr char kLayoutItem[] = "item%1";  // numbered from 0
inline constexpr char kDefaultStorage[] = "Default_storage_entry";
}  // namespace SettingsKeys

// Page set-up: sizes and margins in thousandths of an inch, or hundredths of a millimetre when
// isMetric is set; a page size of 0 means the printer's own.
struct CPageSetup {
    int pageSizeX = 0;
    int pageSizeY = 0;
    int marginL = 750;
    int marginR = 750;
    int marginT = 500;
    int marginB = 500;
    int orientation = 1;  // 1 portrait, 0 landscape
    QString header = QStringLiteral("&D&c");
    QString footer = QStringLiteral("&s Page &p&l");
    int isMetric = 0;
};

class CSettings {
  public:
    static constexpr int kRecentFileCount = 4;

    CSettings();

    QString GetProfileString(const QString& section, const QString& entry,
                             const QString& defaultValue = {}) const;
    int GetProfileInt(const QString& section, const QString& entry, int defaultValue) const;
    void WriteProfileString(const QString& section, const QString& entry, const QString& value);
    void WriteProfileInt(const QString& section, const QString& entry, int value);

    CPageSetup LoadPageSetup() const;
    // Writes everything but the orientation, which is written from the printer at exit.
    void SavePageSetup(const CPageSetup& setup);
    void SaveOrientation(int orientation);

    QStringList LoadRecentFiles() const;
    void SaveRecentFiles(const QStringList& files);

    void Sync() { m_settings.sync(); }
    // The folder of the user's own files beside the settings ("default.bp1").
    QString UserSettingsDir() const;

  private:
    static QString Key(const QString& section, const QString& entry);

    mutable QSettings m_settings;
};
