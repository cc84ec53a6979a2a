#include <gtest/gtest.h>

#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QTemporaryDir>

#include <cerrno>
#include <cstring>

#include "SafeSave.h"
#include "SpecialFiles.h"

namespace {

QByteArray Contents(const QString& path) {
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

TEST(SafeSave, SavesThroughLinksUnderAnyNameAndSaysWhyNot) {
    QTemporaryDir dir;
    ASSERT_TRUE(dir.isValid());
    // A name outside ASCII reaches the disk as the user typed it.
    const QString accented = dir.filePath(QStringLiteral("r\u00e9sum\u00e9.fa"));
    QString reason;
    ASSERT_TRUE(SaveFileContents(accented, std::string(">a\nMKV\n"), &reason))
        << reason.toStdString();
    EXPECT_EQ(Contents(accented), QByteArray(">a\nMKV\n"));
    EXPECT_TRUE(
        QDir(dir.path()).entryList(QDir::Files).contains(QStringLiteral("r\u00e9sum\u00e9.fa")));

    // A link stays a link; the file it leads to gets the bytes.
    const QString link = dir.filePath(QStringLiteral("link.fa"));
    ASSERT_TRUE(QFile::link(accented, link));
    ASSERT_TRUE(SaveFileContents(link, QByteArrayLiteral("new"), &reason));
    EXPECT_TRUE(QFileInfo(link).isSymLink());
    EXPECT_EQ(Contents(accented), QByteArray("new"));

    const QString missing = dir.filePath(QStringLiteral("absent/file.fa"));
    EXPECT_FALSE(SaveFileContents(missing, QByteArrayLiteral("x"), &reason));
    EXPECT_EQ(reason, QString::fromLocal8Bit(std::strerror(ENOENT)));
    const CDeviceGuard full("/dev/full");
    if (full.Present()) {
        EXPECT_FALSE(
            SaveFileContents(QStringLiteral("/dev/full"), QByteArrayLiteral("x"), &reason));
        EXPECT_EQ(reason, QString::fromLocal8Bit(std::strerror(ENOSPC)));
        EXPECT_TRUE(full.Intact());
    }
}

}  // namespace
