// Text between the core and the widgets: revisions and messages are single-byte (Latin-1) text,
// file names are the file system's bytes.
#pragma once

#include <QFile>
#include <QString>
#include <string>

namespace zx917::ui {

// Latin-1 text without its NUL characters; CR LF line breaks become LF.
inline QString FromLatin1(const std::string& text) {
    QString s = QString::fromLatin1(text.data(), static_cast<qsizetype>(text.size()));
    s.remove(QChar(0));
    s.replace(QLatin1String("\r\n"), QLatin1String("\n"));
    return s;
}

inline std::string ToLatin1(const QString& text) {
    return text.toLatin1().toStdString();
}

// A file name or path as the file system holds it; bytes that are not valid text in the
// locale still come back unchanged through ToFileName.
inline QString FromFileName(const std::string& name) {
    return QFile::decodeName(QByteArray::fromStdString(name));
}

inline std::string ToFileName(const QString& name) {
    return QFile::encodeName(name).toStdString();
}

}  // namespace zx917::ui
