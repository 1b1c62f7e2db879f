// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/ValueDialog.h"

#include "app/window/widgets/FileSizeText.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QDialogButtonBox>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QMimeData>
#include <QPlainTextEdit>
#include <QTextDocument>

namespace Velocor {

namespace {

constexpr int PieceLength = 1000;

// A symbol for a newline that the value does not contain; first those that most fonts have.
QChar FreeMark(QString const& value)
{
    for (ushort candidate : {0x21b5, 0x00b6, 0x240a, 0x2424}) {
        if (!value.contains(QChar(candidate)))
            return QChar(candidate);
    }
    ushort candidate = 0xe000; // private use area
    while (value.contains(QChar(candidate)) && candidate < 0xf8ff)
        ++candidate;
    return QChar(candidate);
}

// The text widget turns these into line feeds, so an edited value would lose them.
bool HasOtherBreaks(QString const& value)
{
    return value.contains(QLatin1Char('\r')) || value.contains(QChar(QChar::LineSeparator)) ||
           value.contains(QChar(QChar::ParagraphSeparator));
}

bool HasLongLine(QString const& value)
{
    int start = 0;
    while (value.size() - start > ValueDialog::MaximumLineLength) {
        const int end = value.indexOf(QLatin1Char('\n'), start);
        if (end < 0 || end - start > ValueDialog::MaximumLineLength)
            return true;
        start = end + 1;
    }
    return false;
}

QString SplitLines(QString const& value, QChar mark)
{
    QString text;
    text.reserve(value.size() + value.size() / PieceLength + 1);
    int inLine = 0;
    for (QChar c : value) {
        if (c == QLatin1Char('\n')) {
            text += mark;
            inLine = 0;
        } else if (inLine >= PieceLength && !c.isLowSurrogate()) {
            text += QLatin1Char('\n');
            inLine = 0;
        }
        text += c;
        if (c != QLatin1Char('\n'))
            ++inLine;
    }
    return text;
}

// If line breaks are marked, also marks those that are typed or pasted.
class ValueEdit : public QPlainTextEdit
{
public:
    explicit ValueEdit(QChar mark) : m_mark(mark) {}

protected:
    void keyPressEvent(QKeyEvent* event) override
    {
        const bool isBreak = event->key() == Qt::Key_Return || event->key() == Qt::Key_Enter;
        if (isBreak && !m_mark.isNull() && !isReadOnly())
            insertPlainText(QString(m_mark) + QLatin1Char('\n'));
        else
            QPlainTextEdit::keyPressEvent(event);
    }

    void insertFromMimeData(QMimeData const* source) override
    {
        if (m_mark.isNull()) {
            QPlainTextEdit::insertFromMimeData(source);
            return;
        }
        QString text = source->text();
        text.replace(QLatin1String("\r\n"), QLatin1String("\n"));
        insertPlainText(SplitLines(text, m_mark));
    }

private:
    QChar m_mark;
};

} // namespace

ValueDialog::ValueDialog(QString const& name, QString const& value, QWidget* parent)
    : FittingDialog(parent), m_value(value), m_mark(HasLongLine(value) ? FreeMark(value) : QChar()),
      m_text(new ValueEdit(m_mark))
{
    setWindowTitle(QObject::tr("Edit Value"));
    QString heading = QStringLiteral("%1 (%2)").arg(name, FileSizeText(value.toUtf8().size()));
    if (!m_mark.isNull())
        heading += QLatin1Char('\n') +
                   QObject::tr("Long lines are split for display; only %1 marks a line break.")
                       .arg(m_mark);
    m_text->setReadOnly(!CanEdit(value));
    if (m_text->isReadOnly())
        heading +=
            QLatin1Char('\n') +
            QObject::tr("This value contains carriage returns or Unicode line separators, so "
                        "it cannot be edited here.");
    QLabel* label = NewPlainLabel(heading);
    label->setWordWrap(true);
    ShowUnwrapped(m_text);
    m_text->setAccessibleName(QObject::tr("Value"));
    m_text->setPlainText(m_mark.isNull() ? value : SplitLines(value, m_mark));
    m_text->document()->setModified(false);

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    auto* top = new QHBoxLayout;
    top->addWidget(label);
    LayOutTextDialog(this, top, m_text, buttons);
}

bool ValueDialog::isModified() const
{
    return m_text->document()->isModified();
}

// Not toPlainText(), which converts non-breaking spaces to spaces.
QString ValueDialog::value() const
{
    if (!isModified())
        return m_value;
    QString text = m_text->document()->toRawText();
    if (m_mark.isNull())
        return text.replace(QChar(QChar::ParagraphSeparator), QLatin1Char('\n'));
    text.remove(QChar(QChar::ParagraphSeparator));
    return text.replace(m_mark, QLatin1Char('\n'));
}

bool ValueDialog::CanEdit(QString const& value)
{
    return !HasOtherBreaks(value);
}

} // namespace Velocor
