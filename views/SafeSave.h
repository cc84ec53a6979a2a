#pragma once
// Every file the program writes goes through here, so every save behaves alike: regular files
// and new paths are replaced atomically (through symbolic links, which stay links), devices,
// FIFOs and pipes are written in place, and a failure keeps the system's reason.

#include <QByteArray>
#include <QString>

#include <string>

// True when `bytes` were saved at `path`; otherwise `reason` (when given) gets the system's
// reason, such as "No space left on device".
bool SaveFileContents(const QString& path, const std::string& bytes, QString* reason = nullptr);
bool SaveFileContents(const QString& path, const QByteArray& bytes, QString* reason = nullptr);
