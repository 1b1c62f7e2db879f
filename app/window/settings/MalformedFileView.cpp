// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/MalformedFileView.h"

#include "app/settingsfile/SettingsDocument.h"
#include "app/window/widgets/TextDialog.h"

#include <QFile>
#include <QTextBlock>

namespace Velocor {

namespace {

// The maximum size shown of a malformed file, in bytes.
constexpr qint64 ShownLimit = 1 << 20;

} // namespace

MalformedFileView::MalformedFileView(QWidget* parent) : QPlainTextEdit(parent)
{
    setReadOnly(true);
    ShowUnwrapped(this);
    setAccessibleName(tr("File text"));
    setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
}

void MalformedFileView::ShowFile(QString const& path, SettingsDocument const& document)
{
    QFile file(path);
    if (document.isReadable && file.open(QIODevice::ReadOnly))
        setPlainText(QString::fromUtf8(file.read(ShownLimit)));
    else
        clear();
    markLine(document.line);
}

void MalformedFileView::markLine(int line)
{
    setExtraSelections({});
    const QTextBlock block = document()->findBlockByNumber(line - 1);
    if (!block.isValid())
        return;
    QTextCursor cursor(block);
    cursor.select(QTextCursor::LineUnderCursor);
    setTextCursor(cursor);
    QTextEdit::ExtraSelection error;
    error.cursor = QTextCursor(block);
    error.format.setProperty(QTextFormat::FullWidthSelection, true);
    error.format.setUnderlineStyle(QTextCharFormat::WaveUnderline);
    error.format.setUnderlineColor(Qt::red);
    setExtraSelections({error});
}

} // namespace Velocor
