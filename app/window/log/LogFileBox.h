// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QComboBox>
#include <QString>

namespace Velocor {

/// The choice between a log file and the older ones beside it. GUI thread.
class LogFileBox : public QComboBox
{
    Q_OBJECT

public:
    explicit LogFileBox(QWidget* parent = nullptr);

    /// Offers one file. The list is filled with the others whenever it is opened.
    void Open(QString const& path);

    /// Says which file is shown.
    void SetShown(QString const& path);

    void showPopup() override;

Q_SIGNALS:
    /// The user has chosen another file than the one shown.
    void fileChosen(QString const& path);

private:
    void fill();
    void choose(int position);

    QString m_shown;
};

} // namespace Velocor
