// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QDateTime>
#include <QFont>
#include <QLibraryInfo>
#include <QLocale>
#include <QString>
#include <QStringList>
#include <QTextStream>
#include <QtGlobal>

/// What Qt 5 and Qt 6 do differently and no common function covers. The files of the framework are
/// the same with both.
namespace TorkQt {

/// Makes a stream read and write bytes as the characters of the same number.
inline void UseLatin1(QTextStream& stream)
{
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    stream.setCodec("ISO 8859-1");
#else
    stream.setEncoding(QStringConverter::Latin1);
#endif
}

/// A time in the user's language. QDateTime::toString() of Qt 6 always uses English.
inline QString DateText(QDateTime const& time, QString const& format)
{
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    return time.toString(format);
#else
    return QLocale::system().toString(time, format);
#endif
}

/// A font as QFont::toString() of Qt 5 formats it. That of Qt 6 has other weights and more fields,
/// which Qt 5 would not read; QFont::fromString() of Qt 6 reads both.
inline QString FontText(QFont const& font)
{
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    return font.toString();
#else
    QStringList fields{font.family(), QString::number(font.pointSizeF())};
    for (int number :
         {font.pixelSize(), int(font.styleHint()), font.legacyWeight(), int(font.style()),
          int(font.underline()), int(font.strikeOut()), int(font.fixedPitch()), 0})
        fields.append(QString::number(number));
    if (!font.styleName().isEmpty())
        fields.append(font.styleName());
    return fields.join(QLatin1Char(','));
#endif
}

/// Where Qt's own translations are installed.
inline QString TranslationsFolder()
{
#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0)
    return QLibraryInfo::location(QLibraryInfo::TranslationsPath);
#else
    return QLibraryInfo::path(QLibraryInfo::TranslationsPath);
#endif
}

} // namespace TorkQt
