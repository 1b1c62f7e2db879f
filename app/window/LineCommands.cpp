// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/LineCommands.h"

#include "app/window/ApplicationProperty.h"
#include "app/window/FileTabs.h"
#include "app/window/log/LineSaver.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogPanel.h"
#include "app/window/settings/SettingsEditor.h"

#include <QApplication>
#include <QFileDialog>
#include <QFileInfo>

namespace Velocor {

LineCommands::LineCommands(FileTabs* tabs, QWidget* window) : m_tabs(tabs), m_window(window) {}

void LineCommands::Copy()
{
    if (askFocused("copy"))
        return;
    if (LogPanel* log = m_tabs->currentLog())
        log->CopySelected();
}

void LineCommands::SelectAll()
{
    if (askFocused("selectAll"))
        return;
    if (LogPanel* log = m_tabs->currentLog())
        log->SelectAll();
}

void LineCommands::Undo()
{
    if (askFocused("undo"))
        return;
    if (SettingsEditor* editor = m_tabs->currentEditor())
        editor->Undo();
}

void LineCommands::Redo()
{
    if (askFocused("redo"))
        return;
    if (SettingsEditor* editor = m_tabs->currentEditor())
        editor->Redo();
}

// A text field that has the focus does it with its own text, also when invoked from the menu.
bool LineCommands::askFocused(char const* slot)
{
    QWidget* focused = QApplication::focusWidget();
    const QByteArray signature = QByteArray(slot) + "()";
    return focused && focused->metaObject()->indexOfSlot(signature) >= 0 &&
           QMetaObject::invokeMethod(focused, slot);
}

void LineCommands::Save()
{
    const QString name = QFileInfo(m_tabs->currentLog()->path()).completeBaseName();
    const QString path = QFileDialog::getSaveFileName(
        m_window, tr("Save Lines"), ApplicationProperty("DocPath") + name + tr("-lines.log"),
        tr("Logs (*.log);;All files (*)"));
    if (!path.isEmpty())
        saveTo(path);
}

void LineCommands::saveTo(QString const& path)
{
    LogPanel const* log = m_tabs->currentLog();
    if (!log)
        return;
    auto* saver = new LineSaver(log->model()->source(), log->LineStarts(),
                                log->model()->parser().fileType(), path, this);
    connect(saver, &LineSaver::progressed, this,
            [this](int percent) { Q_EMIT messageReported(tr("Saving lines: %1%").arg(percent)); });
    connect(saver, &QThread::finished, this, [this, saver] {
        saver->deleteLater();
        const QString error = saver->error();
        if (!error.isEmpty())
            Q_EMIT problemReported(
                tr("Could not save lines to %1: %2").arg(saver->target(), error));
        else
            Q_EMIT messageReported(
                tr("%Ln line(s) saved to %1", nullptr, saver->count()).arg(saver->target()));
    });
    saver->start();
}

} // namespace Velocor
