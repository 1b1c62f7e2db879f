// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/FileNotice.h"

#include "app/window/widgets/PlainText.h"

#include <QDir>
#include <QFileInfo>
#include <QPushButton>

namespace Velocor {

FileNotice::FileNotice(QWidget* parent)
    : NoticeBar(tr("State of the file"), parent), m_watch(this),
      m_reload(addButton(tr("Reload"), tr("Show what is in the file now; can be undone"),
                         &FileNotice::reloadRequested)),
      m_compare(addButton(tr("Compare..."), tr("Show what differs, and take over single values"),
                          &FileNotice::compareRequested)),
      m_keep(addButton(tr("Keep Mine"), tr("Leave the editor as it is; saving replaces the file"),
                       &FileNotice::keepRequested)),
      m_saveAs(
          addButton(tr("Save As..."), tr("Save to another file"), &FileNotice::saveAsRequested))
{
    connect(&m_watch, &FileWatch::changed, this, &FileNotice::check);
}

QPushButton* FileNotice::addButton(QString const& text, QString const& toolTip,
                                   void (FileNotice::*signal)())
{
    QPushButton* button = AddButton(text);
    button->setToolTip(PlainToolTip(toolTip));
    connect(button, &QPushButton::clicked, this, signal);
    return button;
}

FileNotice::Stamp FileNotice::stampOf(QString const& path)
{
    const QFileInfo info(path);
    return Stamp{info.exists(), info.lastModified(), info.size()};
}

void FileNotice::SetFile(QString const& path)
{
    m_path = path;
    m_known = stampOf(path);
    m_watch.SetFile(path);
    check();
}

void FileNotice::SetComparable(bool isComparable)
{
    m_isComparable = isComparable;
    check();
}

void FileNotice::TellChanged()
{
    m_known.exists = false;
    check();
}

void FileNotice::check()
{
    const QFileInfo file(m_path);
    const QString name = LeftToRight(file.fileName());
    const Stamp now = stampOf(m_path);
    const bool isChanged = file.isFile() && (!m_known.exists || now.changed != m_known.changed ||
                                             now.size != m_known.size);
    const bool isWritable = file.isWritable();
    QString state;
    if (!now.exists && !file.dir().exists())
        state = tr("The folder of %1 is gone.").arg(name);
    else if (!now.exists)
        state = tr("%1 was removed. Saving changes creates it again.").arg(name);
    else if (file.isDir())
        state = tr("%1 is a folder now, not a file.").arg(name);
    else if (!file.isFile())
        state = tr("%1 is not a regular file any more.").arg(name);
    else if (isChanged)
        state = tr("%1 was changed by another program.").arg(name);
    else if (!isWritable)
        state = tr("%1 is read-only. Changes can only be saved to another file.").arg(name);
    m_reload->setVisible(isChanged);
    m_compare->setVisible(isChanged && m_isComparable);
    m_keep->setVisible(isChanged);
    m_saveAs->setVisible(!file.isFile() || !isWritable);
    SetState(state);
}

} // namespace Velocor
