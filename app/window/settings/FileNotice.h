// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/settings/FileWatch.h"
#include "app/window/widgets/NoticeBar.h"

#include <QDateTime>

namespace Velocor {

/// A bar that tells what happens to the file of an editor from outside: it is changed, removed or
/// replaced by a folder, its folder is gone, or it is read-only from the start. GUI thread only.
class FileNotice : public NoticeBar
{
    Q_OBJECT

public:
    explicit FileNotice(QWidget* parent = nullptr);

    /// Watches a file that was just read or written; what is in it now is known. To be called again
    /// after each of both.
    void SetFile(QString const& path);

    /// Tells again that the file was changed, after it was set: nobody has taken the change.
    void TellChanged();

    /// Whether the editor has something to compare the file with.
    void SetComparable(bool isComparable);

Q_SIGNALS:
    /// The user wants the file's content instead of the editor's, both side by side, the editor's
    /// instead of the file's, or the editor's in another file.
    void reloadRequested();
    void compareRequested();
    void keepRequested();
    void saveAsRequested();

private:
    /// What tells two contents of a file apart.
    struct Stamp
    {
        bool exists = false;
        QDateTime changed;
        qint64 size = 0;
    };

    static Stamp stampOf(QString const& path);
    void check();
    QPushButton* addButton(QString const& text, QString const& toolTip,
                           void (FileNotice::*signal)());

    QString m_path;
    Stamp m_known;
    bool m_isComparable = false;
    FileWatch m_watch;
    QPushButton* m_reload;
    QPushButton* m_compare;
    QPushButton* m_keep;
    QPushButton* m_saveAs;
};

} // namespace Velocor
