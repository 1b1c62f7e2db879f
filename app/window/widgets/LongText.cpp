// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/LongText.h"

#include "app/window/widgets/PlainText.h"

#include <QMimeData>
#include <QTextCursor>

#include <algorithm>

namespace Velocor {

LongText::LongText(QWidget* parent) : QPlainTextEdit(parent)
{
    KeepLeftToRight(this);
}

void LongText::SetText(QString const& text)
{
    if (text.isEmpty() && m_text.isEmpty())
        return; // for each line of a log that is followed
    m_text = text;
    m_breaks.clear();
    QString shown;
    shown.reserve(text.size() + text.size() / MaximumPart + 1);
    int length = 0; // of the part
    for (const QChar c : text) {
        if (length >= MaximumPart && c != QLatin1Char('\n') && !c.isLowSurrogate()) {
            m_breaks.append(shown.size());
            shown += QLatin1Char('\n');
            length = 0;
        }
        length = c == QLatin1Char('\n') ? 0 : length + 1;
        shown += c;
    }
    setPlainText(shown);
}

QString LongText::SelectedText() const
{
    const QTextCursor cursor = textCursor();
    const QString shown = cursor.selectedText();
    const int start = cursor.selectionStart();
    QString text;
    text.reserve(shown.size());
    int from = 0;
    auto next = std::lower_bound(m_breaks.begin(), m_breaks.end(), start);
    for (; next != m_breaks.end() && *next < cursor.selectionEnd(); ++next) {
        text += shown.mid(from, *next - start - from);
        from = *next - start + 1;
    }
    text += shown.mid(from);
    return text.replace(QChar::ParagraphSeparator, QLatin1Char('\n'));
}

QMimeData* LongText::createMimeDataFromSelection() const
{
    auto* copied = new QMimeData;
    copied->setText(SelectedText());
    return copied;
}

} // namespace Velocor
