// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/NumberedText.h"

#include "app/window/widgets/BlendedColor.h"
#include "app/window/widgets/TextDialog.h"

#include <QEvent>
#include <QPaintEvent>
#include <QPainter>
#include <QTextBlock>

namespace Velocor {

namespace {

constexpr int MarginPadding = 6;       // pixels on both sides of the numbers
constexpr int MinimumDigits = 3;       // so that the text seldom moves sideways
constexpr qreal NumberDimming = 0.35;  // of the color in that of the background
constexpr qreal ErrorLineTint = 0.16;  // of the color in the background
constexpr qreal ErrorPlaceTint = 0.45; // the same, of the character

const QColor ErrorColor(0xe0, 0x20, 0x20);

} // namespace

class NumberedText::Margin : public QWidget
{
public:
    explicit Margin(NumberedText* text) : QWidget(text), m_text(text) {}

protected:
    void paintEvent(QPaintEvent* event) override { m_text->paintMargin(event); }

private:
    NumberedText* m_text;
};

NumberedText::NumberedText(QWidget* parent) : QPlainTextEdit(parent), m_margin(new Margin(this))
{
    ShowUnwrapped(this);
    m_margin->setFont(font());
    setAcceptDrops(false); // leave dropped files to the window
    connect(this, &QPlainTextEdit::blockCountChanged, this, &NumberedText::layOutMargin);
    connect(this, &QPlainTextEdit::updateRequest, this, [this] { m_margin->update(); });
    layOutMargin();
}

int NumberedText::marginWidth() const
{
    const int digits = std::max(MinimumDigits, int(QString::number(blockCount()).size()));
    return 2 * MarginPadding +
           fontMetrics().boundingRect(QString(digits, QLatin1Char('8'))).width();
}

void NumberedText::layOutMargin()
{
    setViewportMargins(marginWidth(), 0, 0, 0);
    const QRect inside = contentsRect();
    m_margin->setGeometry(inside.left(), inside.top(), marginWidth(), inside.height());
}

void NumberedText::resizeEvent(QResizeEvent* event)
{
    QPlainTextEdit::resizeEvent(event);
    layOutMargin();
}

void NumberedText::changeEvent(QEvent* event)
{
    QPlainTextEdit::changeEvent(event);
    if (event->type() == QEvent::PaletteChange)
        showError();
}

void NumberedText::paintMargin(QPaintEvent const* event)
{
    QPainter painter(m_margin);
    painter.setLayoutDirection(layoutDirection());
    const QColor base = palette().color(QPalette::Base);
    const QColor ink = palette().color(QPalette::Text);
    painter.fillRect(event->rect(), palette().color(QPalette::AlternateBase));
    QTextBlock block = firstVisibleBlock();
    qreal top = blockBoundingGeometry(block).translated(contentOffset()).top();
    while (block.isValid() && top <= event->rect().bottom()) {
        const QRectF place(0, top, m_margin->width() - MarginPadding, fontMetrics().height());
        const bool isError = block.blockNumber() + 1 == m_errorLine;
        QFont numberFont = font();
        numberFont.setBold(isError);
        painter.setFont(numberFont);
        painter.setPen(isError ? ink : Blended(ink, base, NumberDimming));
        painter.drawText(place, Qt::AlignRight | Qt::AlignVCenter,
                         QString::number(block.blockNumber() + 1));
        top += blockBoundingRect(block).height();
        block = block.next();
    }
}

void NumberedText::SetError(int line, int column)
{
    m_errorLine = line;
    m_errorColumn = column;
    showError();
    m_margin->update();
}

// Null if the line does not exist.
QTextCursor NumberedText::errorCursor() const
{
    const QTextBlock block = document()->findBlockByNumber(m_errorLine - 1);
    if (!block.isValid())
        return QTextCursor();
    QTextCursor cursor(block);
    cursor.setPosition(block.position() + qBound(0, m_errorColumn - 1, block.length() - 1));
    return cursor;
}

void NumberedText::showError()
{
    const QTextCursor place = errorCursor();
    QList<QTextEdit::ExtraSelection> marks;
    if (!place.isNull()) {
        const QColor base = palette().color(QPalette::Base);
        QTextEdit::ExtraSelection line;
        line.cursor = QTextCursor(place.block());
        line.format.setProperty(QTextFormat::FullWidthSelection, true);
        line.format.setBackground(Blended(base, ErrorColor, ErrorLineTint));
        marks.append(line);
        QTextEdit::ExtraSelection character;
        character.cursor = place;
        character.cursor.movePosition(QTextCursor::NextCharacter, QTextCursor::KeepAnchor);
        character.format.setBackground(Blended(base, ErrorColor, ErrorPlaceTint));
        character.format.setUnderlineStyle(QTextCharFormat::WaveUnderline);
        character.format.setUnderlineColor(ErrorColor);
        marks.append(character);
    }
    setExtraSelections(marks);
}

void NumberedText::GoToError()
{
    const QTextCursor place = errorCursor();
    if (!place.isNull())
        setTextCursor(place);
    setFocus();
}

} // namespace Velocor
