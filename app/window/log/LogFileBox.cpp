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
    addItem(LeftToRight(QFileInfo(path).fileName()), path);
}

void LogFileBox::SetShown(QString const& path, bool isAll, bool isFamily)
{
    const bool isOther = isAll != m_isAll || isFamily != m_isFamily;
    m_shown = path;
    m_isAll = isAll;
    m_isFamily = isFamily;
    if (isOther)
        fill();
    setToolTip(PlainToolTip(LeftToRight(path)));
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
        addItem(tr("%1 (%2)").arg(LeftToRight(info.fileName()), size), file);
        setItemData(count() - 1, PlainToolTip(LeftToRight(file)), Qt::ToolTipRole);
    }
    addItem(tr("All files, by time"));
    setItemData(count() - 1, PlainToolTip(tr("Every run that the files still have, oldest first")),
                Qt::ToolTipRole);
    addItem(tr("Whole family, by time"));
    setItemData(count() - 1, PlainToolTip(tr("The logs of all programs of the family as one")),
                Qt::ToolTipRole);
    setCurrentIndex(m_isFamily ? count() - 1 : m_isAll ? count() - 2 : findData(m_shown));
}

void LogFileBox::choose(int position)
{
    const QString file = itemData(position).toString();
    const bool isFamily = position == count() - 1 && file.isEmpty();
    if (isFamily && !m_isFamily)
        Q_EMIT familyChosen();
    else if (file.isEmpty() && !isFamily && (!m_isAll || m_isFamily))
        Q_EMIT allChosen();
    else if (!file.isEmpty() && (file != m_shown || m_isAll))
        Q_EMIT fileChosen(file);
}

} // namespace Velocor
