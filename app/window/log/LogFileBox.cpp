// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogFileBox.h"

#include "app/logfile/LogFileList.h"
#include "app/window/widgets/FileSizeText.h"
#include "app/window/widgets/PlainText.h"

#include <QFileInfo>
#include <QSignalBlocker>

namespace Velocor {

LogFileBox::LogFileBox(QWidget* parent) : QComboBox(parent)
{
    setAccessibleName(tr("Log file"));
    setToolTip(PlainToolTip(tr("The current log file and older log files")));
    setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
    setMinimumContentsLength(16);
    connect(this, QOverload<int>::of(&QComboBox::activated), this, &LogFileBox::choose);
}

void LogFileBox::Open(QString const& path)
{
    const QSignalBlocker blocker(this);
    clear();
    addItem(QFileInfo(path).fileName(), path);
}

void LogFileBox::SetShown(QString const& path)
{
    m_shown = path;
    setToolTip(PlainToolTip(path));
    setAccessibleDescription(path);
}

void LogFileBox::showPopup()
{
    fill();
    QComboBox::showPopup();
}

void LogFileBox::fill()
{
    const QSignalBlocker blocker(this);
    clear();
    const QStringList files = LogFileList::FilesOf(m_shown);
    for (QString const& file : files) {
        const QFileInfo info(file);
        const QString size = info.exists() ? FileSizeText(info.size()) : tr("does not exist");
        addItem(tr("%1 (%2)").arg(info.fileName(), size), file);
        setItemData(count() - 1, PlainToolTip(file), Qt::ToolTipRole);
    }
    setCurrentIndex(findData(m_shown));
}

void LogFileBox::choose(int position)
{
    const QString file = itemData(position).toString();
    if (file != m_shown)
        Q_EMIT fileChosen(file);
}

} // namespace Velocor
