// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

namespace Velocor {

/// As long as this object exists, the text of every message box in the program can be selected with
/// mouse and keyboard, so that it can be copied.
///
/// The message boxes of Qt's file dialog are also set to plain text: they show file names, which
/// could otherwise be displayed as rich text.
class SelectableMessageBoxes : public QObject
{
    Q_OBJECT

public:
    explicit SelectableMessageBoxes(QObject* parent = nullptr);

    bool eventFilter(QObject* object, QEvent* event) override;
};

} // namespace Velocor
