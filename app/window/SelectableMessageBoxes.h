// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

namespace Velocor {

/// While it lives, the texts of all message boxes of the program can be selected with mouse and
/// keyboard, to be copied into a report or a search.
///
/// The boxes in which Qt's file dialog asks about files are made plain text as well: they name the
/// files without a look at what Qt takes for markup.
class SelectableMessageBoxes : public QObject
{
    Q_OBJECT

public:
    explicit SelectableMessageBoxes(QObject* parent = nullptr);

    bool eventFilter(QObject* object, QEvent* event) override;
};

} // namespace Velocor
