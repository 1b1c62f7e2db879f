// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/GoToDialog.h"

#include "app/window/widgets/PlainText.h"

#include <QDialogButtonBox>
#include <QGridLayout>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>

#include <initializer_list>
#include <utility>

namespace Velocor {

GoToDialog::GoToDialog(qint64 lines, bool hasCurrent, QWidget* parent)
    : FittingDialog(parent), m_lines(lines), m_hasCurrent(hasCurrent), m_text(new QLineEdit),
      m_error(NewPlainLabel())
{
    setWindowTitle(tr("Go To"));
    setWindowFlags(windowFlags() & ~Qt::WindowContextHelpButtonHint);
    QLabel* label = NewPlainLabel(tr("&Line or time:"));
    label->setBuddy(m_text);
    m_text->setAccessibleName(tr("Line or time"));
    m_error->setAccessibleName(tr("Problem"));
    m_error->setMinimumHeight(m_error->fontMetrics().lineSpacing());

    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    m_ok = buttons->button(QDialogButtonBox::Ok);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    connect(m_text, &QLineEdit::textChanged, this, &GoToDialog::check);

    auto* layout = new QVBoxLayout(this);
    layout->addWidget(label);
    layout->addWidget(m_text);
    layout->addWidget(m_error);
    layout->addLayout(newSamples());
    layout->addWidget(buttons);
    layout->setSizeConstraint(QLayout::SetFixedSize);
    check();
}

QLayout* GoToDialog::newSamples()
{
    const std::initializer_list<std::pair<char const*, QString>> samples = {
        {"214", tr("line 214 of the file")},
        {"14:03", tr("time, on the day of the current entry")},
        {"2026-11-20 14:03", tr("date and time")},
        {"+5m  -30s  +2h", tr("from the current entry")}};
    auto* rows = new QGridLayout;
    rows->setVerticalSpacing(0);
    rows->setHorizontalSpacing(16);
    rows->setColumnStretch(1, 1);
    for (auto const& sample : samples) {
        const int row = rows->rowCount();
        rows->addWidget(NewPlainLabel(LeftToRight(QLatin1String(sample.first))), row, 0);
        rows->addWidget(NewPlainLabel(sample.second), row, 1);
    }
    return rows;
}

void GoToDialog::check()
{
    m_place = LogPlace::Parse(m_text->text());
    if (m_place.kind == LogPlace::Line && m_place.value > m_lines)
        m_place.error = tr("The file has only %Ln line(s).", nullptr, static_cast<int>(m_lines));
    else if (m_place.kind == LogPlace::Interval && !m_hasCurrent)
        m_place.error = tr("Select an entry first, from which to count.");
    m_error->setText(m_place.error);
    m_ok->setEnabled(m_place.kind != LogPlace::Invalid && m_place.error.isEmpty());
}

} // namespace Velocor
