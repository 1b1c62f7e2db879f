// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

#include <QString>

class QLineEdit;

namespace Velocor {

/// Asks for a note on a line of a log.
class NoteDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param note  the note so far
    NoteDialog(QString const& note, QWidget* parent);

    /// What the user has entered, of at most LogMark::MaximumNote characters.
    QString note() const;

private:
    QLineEdit* m_text;
};

} // namespace Velocor
