// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/HighlightDialog.h"

#include "app/window/log/HighlightColors.h"
#include "app/window/log/LogModel.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QCheckBox>
#include <QComboBox>
#include <QDialogButtonBox>
#include <QFormLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QListWidget>
#include <QPixmap>
#include <QPushButton>
#include <QSignalBlocker>
#include <QVBoxLayout>

#include <algorithm>
#include <utility>

namespace Velocor {

HighlightDialog::HighlightDialog(std::shared_ptr<HighlightRules> const& rules, QWidget* parent)
    : FittingDialog(parent), m_shared(rules), m_before(rules->rules()), m_rules(rules->rules()),
      m_list(new QListWidget), m_text(new QLineEdit), m_case(new QCheckBox(tr("&Match case"))),
      m_expression(new QCheckBox(tr("Regular &expression"))), m_color(new QComboBox),
      m_error(NewPlainLabel())
{
    setWindowTitle(tr("Highlight Rules"));
    setWindowFlags(windowFlags() & ~Qt::WindowContextHelpButtonHint);
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    RemoveButtonIcons(buttons);
    connect(buttons, &QDialogButtonBox::accepted, this, &HighlightDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &HighlightDialog::reject);

    auto* layout = new QVBoxLayout(this);
    layout->addLayout(makeList());
    layout->addLayout(makeFields());
    layout->addWidget(
        NewPlainLabel(tr("Rules look at the first %1 bytes of a line.").arg(LogModel::ShownLimit)));
    layout->addWidget(m_error);
    layout->addWidget(buttons);
    resize(520, 420);
    fillList(0);
}

QLayout* HighlightDialog::makeList()
{
    m_list->setAccessibleName(tr("Highlight rules"));
    m_list->setLayoutDirection(Qt::LeftToRight);
    m_list->setTextElideMode(Qt::ElideRight);
    m_list->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    connect(m_list, &QListWidget::currentRowChanged, this, &HighlightDialog::showRule);
    connect(m_list, &QListWidget::itemChanged, this, &HighlightDialog::takeChecks);
    m_add = makeButton(tr("&Add"), &HighlightDialog::add);
    m_remove = makeButton(tr("&Remove"), &HighlightDialog::remove);
    m_up = makeButton(tr("Move &Up"), &HighlightDialog::moveUp);
    m_down = makeButton(tr("Move &Down"), &HighlightDialog::moveDown);

    auto* column = new QVBoxLayout;
    for (QPushButton* button : {m_add, m_remove, m_up, m_down})
        column->addWidget(button);
    column->addStretch();
    auto* row = new QHBoxLayout;
    row->addWidget(m_list, 1);
    row->addLayout(column);
    return row;
}

QPushButton* HighlightDialog::makeButton(QString const& text, void (HighlightDialog::*work)())
{
    auto* button = new QPushButton(text);
    button->setAutoDefault(false); // Enter in the text is OK
    connect(button, &QPushButton::clicked, this, work);
    return button;
}

QLayout* HighlightDialog::makeFields()
{
    m_text->setAccessibleName(tr("Text to highlight"));
    m_text->setMaxLength(HighlightRule::MaximumText);
    m_text->installEventFilter(this);
    m_text->setPlaceholderText(tr("Lines with this text get the color"));
    m_case->setAccessibleName(tr("Match case"));
    m_expression->setAccessibleName(tr("Regular expression"));
    m_color->setAccessibleName(tr("Color"));
    for (int color = 0; color < HighlightColors::Count; ++color) {
        QPixmap sample(m_color->iconSize());
        sample.fill(HighlightColors::Background(color, palette()));
        m_color->addItem(sample, HighlightColors::Name(color));
    }
    m_error->setAccessibleName(tr("Problem of the rule"));
    m_error->setWordWrap(true);
    connect(m_text, &QLineEdit::textChanged, this, &HighlightDialog::takeFields);
    connect(m_case, &QCheckBox::toggled, this, &HighlightDialog::takeFields);
    connect(m_expression, &QCheckBox::toggled, this, &HighlightDialog::takeFields);
    connect(m_color, QOverload<int>::of(&QComboBox::currentIndexChanged), this,
            &HighlightDialog::takeFields);

    auto* options = new QHBoxLayout;
    options->addWidget(m_case);
    options->addWidget(m_expression);
    options->addStretch();
    QLabel* text = NewPlainLabel(tr("&Text:"));
    text->setBuddy(m_text);
    QLabel* color = NewPlainLabel(tr("C&olor:"));
    color->setBuddy(m_color);
    auto* form = new QFormLayout;
    form->addRow(text, m_text);
    form->setLayout(1, QFormLayout::FieldRole, options);
    form->addRow(color, m_color);
    return form;
}

void HighlightDialog::fillList(int current)
{
    {
        const QSignalBlocker blocker(m_list);
        m_list->clear();
        for (int i = 0; i < m_rules.size(); ++i) {
            m_list->addItem(QString());
            showItem(i);
        }
        m_list->setCurrentRow(qBound(-1, current, m_rules.size() - 1));
    }
    showRule();
}

void HighlightDialog::showItem(int position)
{
    const QSignalBlocker blocker(m_list);
    HighlightRule const& rule = m_rules.at(position);
    QListWidgetItem* item = m_list->item(position);
    item->setText(rule.text.isEmpty() ? tr("(no text)") : rule.text);
    item->setFlags(item->flags() | Qt::ItemIsUserCheckable);
    item->setCheckState(rule.isOn ? Qt::Checked : Qt::Unchecked);
    item->setBackground(HighlightColors::Background(rule.color, palette()));
    item->setForeground(HighlightColors::Text(palette()));
}

void HighlightDialog::showRule()
{
    const int position = m_list->currentRow();
    const bool isRule = position >= 0;
    const HighlightRule rule = isRule ? m_rules.at(position) : HighlightRule();
    const QSignalBlocker blockers[] = {QSignalBlocker(m_text), QSignalBlocker(m_case),
                                       QSignalBlocker(m_expression), QSignalBlocker(m_color)};
    Q_UNUSED(blockers)
    m_text->setText(rule.text);
    m_case->setChecked(rule.isCaseSensitive);
    m_expression->setChecked(rule.isExpression);
    m_color->setCurrentIndex(rule.color);
    for (QWidget* field : {static_cast<QWidget*>(m_text), static_cast<QWidget*>(m_case),
                           static_cast<QWidget*>(m_expression), static_cast<QWidget*>(m_color),
                           static_cast<QWidget*>(m_remove)})
        field->setEnabled(isRule);
    m_up->setEnabled(position > 0);
    m_down->setEnabled(isRule && position + 1 < m_rules.size());
    m_add->setEnabled(m_rules.size() < HighlightRules::MaximumRules);
    showError();
}

void HighlightDialog::showError()
{
    const QString error =
        m_expression->isChecked() ? LogFilter::ErrorOf(m_text->text()) : QString();
    m_error->setText(error.isEmpty() ? QString() : tr("Invalid regular expression: %1").arg(error));
    m_error->setVisible(!error.isEmpty());
}

void HighlightDialog::takeFields()
{
    const int position = m_list->currentRow();
    if (position < 0)
        return;
    HighlightRule& rule = m_rules[position];
    rule.text = m_text->text();
    rule.isCaseSensitive = m_case->isChecked();
    rule.isExpression = m_expression->isChecked();
    rule.color = m_color->currentIndex();
    showItem(position);
    showError();
    m_shared->SetRules(m_rules);
}

void HighlightDialog::takeChecks()
{
    for (int i = 0; i < m_rules.size(); ++i)
        m_rules[i].isOn = m_list->item(i)->checkState() == Qt::Checked;
    m_shared->SetRules(m_rules);
}

void HighlightDialog::add()
{
    HighlightRule rule;
    rule.color = HighlightRules::UnusedColor(m_rules);
    m_rules.append(rule);
    fillList(m_rules.size() - 1);
    m_shared->SetRules(m_rules);
    m_text->setFocus();
}

void HighlightDialog::remove()
{
    const int position = m_list->currentRow();
    m_rules.removeAt(position);
    fillList(std::min<int>(position, m_rules.size() - 1));
    m_shared->SetRules(m_rules);
}

void HighlightDialog::moveBy(int step)
{
    const int position = m_list->currentRow();
    std::swap(m_rules[position], m_rules[position + step]);
    fillList(position + step);
    m_shared->SetRules(m_rules);
}

// Alt and the letter of a button that is disabled would type the letter. On macOS, that is how
// characters are typed.
bool HighlightDialog::eventFilter(QObject* watched, QEvent* event)
{
#ifndef Q_OS_MACOS
    if (watched == m_text && event->type() == QEvent::KeyPress) {
        auto const* key = static_cast<QKeyEvent*>(event);
        if (key->modifiers() == Qt::AltModifier && !key->text().isEmpty())
            return true;
    }
#endif
    return QDialog::eventFilter(watched, event);
}

void HighlightDialog::reject()
{
    m_shared->SetRules(m_before);
    QDialog::reject();
}

} // namespace Velocor
