// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/log/HighlightRules.h"
#include "app/window/widgets/FittingDialog.h"

#include <memory>

class QCheckBox;
class QComboBox;
class QLabel;
class QLayout;
class QLineEdit;
class QListWidget;
class QPushButton;

namespace Velocor {

/// Changes the rules that highlight lines. The logs show each change at once; Cancel takes all of
/// them back.
class HighlightDialog : public FittingDialog
{
    Q_OBJECT

public:
    HighlightDialog(std::shared_ptr<HighlightRules> const& rules, QWidget* parent);

    void reject() override;

protected:
    bool eventFilter(QObject* watched, QEvent* event) override;

private:
    QLayout* makeList();
    QLayout* makeFields();
    QPushButton* makeButton(QString const& text, void (HighlightDialog::*work)());
    void fillList(int current);
    void showItem(int position);
    void showRule();
    void showError();
    void takeFields();
    void takeChecks();
    void add();
    void remove();
    void moveUp() { moveBy(-1); }
    void moveDown() { moveBy(1); }
    void moveBy(int step);

    std::shared_ptr<HighlightRules> m_shared;
    QVector<HighlightRule> m_before;
    QVector<HighlightRule> m_rules;
    QListWidget* m_list;
    QPushButton* m_add = nullptr;
    QPushButton* m_remove = nullptr;
    QPushButton* m_up = nullptr;
    QPushButton* m_down = nullptr;
    QLineEdit* m_text;
    QCheckBox* m_case;
    QCheckBox* m_expression;
    QComboBox* m_color;
    QLabel* m_error;
};

} // namespace Velocor
