// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFrame>

class QLabel;

namespace Velocor {

/// A bar above a view that shows messages without interrupting the user and can be dismissed. The
/// text is selectable.
class NoticeBar : public QFrame
{
    Q_OBJECT

public:
    /// Hidden until there is a message.
    explicit NoticeBar(QWidget* parent = nullptr);

    /// Shows a message, below those not dismissed yet.
    void ShowMessage(QString const& text);

    /// Removes all messages.
    void Dismiss();

    QString text() const;

private:
    QLabel* m_icon;
    QLabel* m_label;
};

} // namespace Velocor
