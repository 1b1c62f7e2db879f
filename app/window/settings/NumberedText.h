// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QPlainTextEdit>

namespace Velocor {

/// A text editor with line numbers beside the text, in which the place of an error can be marked.
/// GUI thread only.
class NumberedText : public QPlainTextEdit
{
    Q_OBJECT

public:
    explicit NumberedText(QWidget* parent = nullptr);

    /// Marks a line and a character in it, or no line.
    ///
    /// @param line, column  starting at 1; a line or column that does not exist is not marked
    void SetError(int line, int column);

    /// Puts the cursor where the error is.
    void GoToError();

protected:
    void resizeEvent(QResizeEvent* event) override;
    void changeEvent(QEvent* event) override;

private:
    class Margin;

    int marginWidth() const;
    void layOutMargin();
    void paintMargin(QPaintEvent const* event);
    QTextCursor errorCursor() const;
    void showError();

    QWidget* m_margin;
    int m_errorLine = 0;
    int m_errorColumn = 0;
};

} // namespace Velocor
