// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFrame>

class QLabel;

namespace Velocor {

/// A strip above a view that tells of something without stopping the work; can be dismissed. Its
/// text can be selected.
class NoticeBar : public QFrame
{
    Q_OBJECT

public:
    /// Hidden until there is something to tell.
    explicit NoticeBar(QWidget* parent = nullptr);

    /// Shows a text, below those that have not been dismissed yet.
    void Tell(QString const& text);

    /// Takes all texts away.
    void Dismiss();

    QString text() const;

private:
    QLabel* m_icon;
    QLabel* m_label;
};

} // namespace Velocor
