// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QPlainTextEdit>
#include <QString>
#include <QVector>

namespace Velocor {

/// Shows a text whose lines may be very long.
///
/// Qt lays out a line as a whole, and one without blanks in a time that grows with the square of
/// its length. Lines above MaximumPart are therefore shown in parts, each of which begins a row.
/// What is copied is the text without these breaks. GUI thread.
class LongText : public QPlainTextEdit
{
    Q_OBJECT

public:
    explicit LongText(QWidget* parent = nullptr);

    /// Shows another text; setPlainText() does so without breaks.
    void SetText(QString const& text);

    QString const& text() const { return m_text; }

    /// The part of the text that is selected, with '\n' between its lines.
    QString SelectedText() const;

    /// The longest part of a line, in UTF-16 units.
    static constexpr int MaximumPart = 4096;

protected:
    QMimeData* createMimeDataFromSelection() const override;

private:
    QString m_text;
    QVector<int> m_breaks; // where the breaks are in what is shown, in order
};

} // namespace Velocor
