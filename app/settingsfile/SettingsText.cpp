// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/settingsfile/SettingsText.h"

#include <algorithm>

namespace Velocor {

namespace {

constexpr char ByteOrderMark[] = "\xEF\xBB\xBF";

QByteArray Encoded(QString const& text, bool isLatin1)
{
    return isLatin1 ? text.toLatin1() : text.toUtf8();
}

// With its size, because Qt 5 would end at a NUL.
QString Decoded(QByteArray const& bytes, bool isLatin1)
{
    return isLatin1 ? QString::fromLatin1(bytes.constData(), bytes.size())
                    : QString::fromUtf8(bytes.constData(), bytes.size());
}

} // namespace

SettingsText SettingsText::Of(QByteArray const& bytes)
{
    SettingsText file;
    file.hasMark = bytes.startsWith(ByteOrderMark);
    const QByteArray content =
        file.hasMark ? bytes.mid(static_cast<int>(sizeof ByteOrderMark) - 1) : bytes;
    file.isLatin1 = Decoded(content, false).toUtf8() != content;
    file.text = Decoded(content, file.isLatin1);
    const int breaks = content.count('\n');
    file.hasCarriageReturns = breaks > 0 && content.count("\r\n") == breaks;
    if (file.hasCarriageReturns)
        file.text.replace(QLatin1String("\r\n"), QLatin1String("\n"));
    return file;
}

QByteArray SettingsText::ToBytes(QString const& edited) const
{
    QByteArray bytes = Encoded(edited, isLatin1);
    if (hasCarriageReturns)
        bytes.replace("\n", "\r\n");
    return hasMark ? ByteOrderMark + bytes : bytes;
}

int SettingsText::FirstUnwritable(QString const& edited) const
{
    const QString readBack = Decoded(Encoded(edited, isLatin1), isLatin1);
    const auto differing =
        std::mismatch(edited.begin(), edited.end(), readBack.begin(), readBack.end());
    return differing.first == edited.end() ? -1
                                           : static_cast<int>(differing.first - edited.begin());
}

} // namespace Velocor
