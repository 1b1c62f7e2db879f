// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/Manual.h"

#include <QDesktopServices>
#include <QStandardPaths>
#include <QUrl>

namespace Velocor {

bool OpenManual()
{
    const QString manual = QStandardPaths::locate(QStandardPaths::GenericDataLocation,
                                                  QStringLiteral("doc/velocor/window.md"));
    return !manual.isEmpty() && QDesktopServices::openUrl(QUrl::fromLocalFile(manual));
}

} // namespace Velocor
