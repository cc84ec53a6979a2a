#include "Settings.h"

#include <QFileInfo>

using namespace SettingsKeys;

CSettings::CSettings()
    : m_settings(QSettings::IniFormat, QSettings::UserScope, QString::fromLatin1(kOrganisation),
                 QString::fromLatin1(kApplication)) {}

QString CSettings::UserSettingsDir() const {
    const QFileInfo file(m_settings.fileName());
    return file.absolutePath() + QLatin1Char('/') + file.completeBaseName();
}

// Sections may hold a "\" between a section and its subsection; QSettings nests groups at "/".
QString CSettings::Key(const QString& section, const QString& entry) {
    QString path = section;
    path.replace(QLatin1Char('\\'), QLatin1Char('/'));
    return QString::fromLatin1(kProfile) + QLatin1Char('/') + path + QLatin1Char('/') + entry;
}

QString CSettings::GetProfileString(const QString& section, const QString& entry,
                                    const QString& defaultValue) const {
    return m_settings.value(Key(section, entry), defaultValue).toString();
}

int CSettings::GetProfileInt(const QString& section, const QString& entry, int defaultValue) const {
    bool ok = false;
    const int value = m_settings.value(Key(section, entry)).toInt(&ok);
    return ok ? value : defaultValue;
}

void CSettings::WriteProfileString(const QString& section, const QString& entry,
                                   const QString& value) {
    m_settings.setValue(Key(section, entry), value);
}

void CSettings::WriteProfileInt(const QString& section, const QString& entry, int value) {
    m_settings.setValue(Key(section, entry), value);
}

CPageSetup CSettings::LoadPageSetup() const {
    const CPageSetup defaults;
    const QString section = QString::fromLatin1(kPageSetup);
    CPageSetup setup;
    setup.pageSizeX = GetProfileInt(section, kPageSizeX, defaults.pageSizeX);
    setup.pageSizeY = GetProfileInt(section, kPageSizeY, defaults.pageSizeY);
    setup.marginL = GetProfileInt(section, kMarginL, defaults.marginL);
    setup.marginR = GetProfileInt(section, kMarginR, defaults.marginR);
    setup.marginT = GetProfileInt(section, kMarginT, defaults.marginT);
    setup.marginB = GetProfileInt(section, kMarginB, defaults.marginB);
    setup.orientation = GetProfileInt(section, kOrientation, defaults.orientation);
    setup.header = GetProfileString(section, kHeader, defaults.header);
    setup.footer = GetProfileString(section, kFooter, defaults.footer);
    setup.isMetric = GetProfileInt(section, kIsMetric, defaults.isMetric);
    return setup;
}

void CSettings::SavePageSetup(const CPageSetup& setup) {
    const QString section = QString::fromLatin1(kPageSetup);
    WriteProfileInt(section, kPageSizeX, setup.pageSizeX);
    WriteProfileInt(section, kPageSizeY, setup.pageSizeY);
    WriteProfileInt(section, kMarginL, setup.marginL);
    WriteProfileInt(section, kMarginR, setup.marginR);
    WriteProfileInt(section, kMarginT, setup.marginT);
    WriteProfileInt(section, kMarginB, setup.marginB);
    WriteProfileString(section, kHeader, setup.header);
    WriteProfileString(section, kFooter, setup.footer);
    WriteProfileInt(section, kIsMetric, setup.isMetric);
}

void CSettings::SaveOrientation(int orientation) {
    WriteProfileInt(QString::fromLatin1(kPageSetup), kOrientation, orientation);
}

QStringList CSettings::LoadRecentFiles() const {
    QStringList files;
    for (int i = 1; i <= kRecentFileCount; ++i) {
        const QString file =
            GetProfileString(kRecentFiles, QString::fromLatin1(kRecentFileEntry).arg(i));
        if (!file.isEmpty()) {
            files << file;
        }
    }
    return files;
}

void CSettings::SaveRecentFiles(const QStringList& files) {
    for (int i = 1; i <= kRecentFileCount; ++i) {
        const QString entry = QString::fromLatin1(kRecentFileEntry).arg(i);
        if (i <= files.size()) {
            WriteProfileString(kRecentFiles, entry, files[i - 1]);
        } else {
            m_settings.remove(Key(kRecentFiles, entry));
        }
    }
}
