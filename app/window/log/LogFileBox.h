// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QComboBox>
#include <QString>

namespace Velocor {

/// The choice between a log file, the older ones beside it, all of them as one, and the logs of all
/// programs as one. GUI thread.
class LogFileBox : public QComboBox
{
    Q_OBJECT

public:
    explicit LogFileBox(QWidget* parent = nullptr);

    /// Offers one file. The list is filled with the others whenever it is opened.
    void Open(QString const& path);

    /// Says which file is shown.
    ///
    /// @param isAll  whether the older ones of that log are shown with it
    /// @param isFamily  whether the logs of all programs are shown with it
    void SetShown(QString const& path, bool isAll, bool isFamily = false);

    void showPopup() override;

Q_SIGNALS:
    /// The user has chosen another file than the one shown.
    void fileChosen(QString const& path);

    /// The user has chosen to see all of them as one.
    void allChosen();

    /// The user has chosen to see the logs of all programs as one.
    void familyChosen();

private:
    void fill();
    void choose(int position);

    QString m_shown;
    bool m_isAll = false;
    bool m_isFamily = false;
};

} // namespace Velocor
