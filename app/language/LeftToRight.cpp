// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/language/LeftToRight.h"

#include <QGuiApplication>

namespace Velocor {

QString LeftToRight(QString const& text)
{
    const QChar embedding(0x202a);
    const QChar end(0x202c);
    return QGuiApplication::isRightToLeft() && !text.isEmpty() ? embedding + text + end : text;
}

} // namespace Velocor
