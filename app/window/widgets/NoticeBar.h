// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFrame>

class QLabel;
class QPushButton;

namespace Velocor {

/// A colored bar above a view that shows messages without interrupting the user and can be
/// dismissed. The text is selectable.
class NoticeBar : public QFrame
{
    Q_OBJECT

public:
    /// Hidden until there is a message.
    ///
    /// @param name  for assistive technology
    explicit NoticeBar(QString const& name = tr("Notice"), QWidget* parent = nullptr);

    /// Shows a state instead of all messages; hides the bar if it is empty. A state that was
    /// dismissed stays hidden until it changes.
    void SetState(QString const& state);

    /// Shows a message, below those not dismissed yet.
    void ShowMessage(QString const& text);

    /// Adds a button before "Dismiss".
    ///
    /// @return owned by the bar
    QPushButton* AddButton(QString const& text);

    /// Removes all messages.
    void Dismiss();

    QString text() const;

protected:
    void changeEvent(QEvent* event) override;

private:
    void updateColors();

    QLabel* m_icon;
    QLabel* m_label;
    QString m_state;
};

} // namespace Velocor
