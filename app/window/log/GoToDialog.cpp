// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/GoToDialog.h"

#include "app/window/widgets/PlainText.h"

#include <QDialogButtonBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QVBoxLayout>

namespace Velocor {

GoToDialog::GoToDialog(qint64 lines, bool hasCurrent, QWidget* parent)
    : QDialog(parent), m_lines(lines), m_hasCurrent(hasCurrent), m_text(new QLineEdit),
      m_error(NewPlainLabel())
{
    setWindowTitle(tr("Go To"));
    setWindowFlags(windowFlags() & ~Qt::WindowContextHelpButtonHint);
    QLabel* label = NewPlainLabel(tr("&Line or time:"));
    label->setBuddy(m_text);
    m_text->setAccessibleName(tr("Line or time"));
    QLabel* samples = NewPlainLabel(tr("214\t\tline 214 of the file\n"
                                       "14:03\t\ttime, on the day of the current entry\n"
                                       "2026-11-20 14:03\tdate and time\n"
                                       "+5m  -30s  +2h\tfrom the current entry"));
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
    layout->addWidget(samples);
    layout->addWidget(buttons);
    layout->setSizeConstraint(QLayout::SetFixedSize);
    check();
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
