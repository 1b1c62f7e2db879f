// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QWidget>

namespace Velocor {

class ElidedLabel;
class LongText;

/// The pane below a log with the full text of the current line, and the note on it. GUI thread.
class CurrentLine : public QWidget
{
    Q_OBJECT

public:
    explicit CurrentLine(QWidget* parent = nullptr);

    void SetText(QString const& text);

    /// Shows a note above the text; nothing if it is empty. A selection in the text stays.
    void SetNote(QString const& note);

    /// Sets the font of the text; a default QFont is the application's.
    void SetTextFont(QFont const& font);

    /// The height that shows three lines.
    int UsualHeight() const;

    /// The widget that gets the mouse events of the text.
    QWidget* viewport() const;

Q_SIGNALS:
    /// What is selected in the text shall filter the log, lines with it shall be hidden, or
    /// highlighted.
    void filterRequested(QString const& text);
    void hideRequested(QString const& text);
    void highlightRequested(QString const& text);

private:
    void showMenu(QPoint const& position);

    ElidedLabel* m_note;
    LongText* m_text;
};

} // namespace Velocor
