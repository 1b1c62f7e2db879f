// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogSettingsDialog.h"

#include "app/logfile/LogSeverities.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QCheckBox>
#include <QDateTime>
#include <QDialogButtonBox>
#include <QFontDatabase>
#include <QFormLayout>
#include <QGroupBox>
#include <QLabel>
#include <QLineEdit>
#include <QPushButton>
#include <QSpinBox>

namespace Velocor {

LogSettingsDialog::LogSettingsDialog(QWidget* parent)
    : FittingDialog(parent), m_enabled(new QCheckBox(tr("&Enable logging"))),
      m_elapsed(new QCheckBox(tr("&Log time since the previous entry"))),
      m_echo(new QCheckBox(tr("Echo entries &to the console"))), m_maxFiles(new QSpinBox),
      m_elapsedPrefix(new QLineEdit), m_dateFormat(new QLineEdit), m_filePrefix(new QLineEdit),
      m_sample(NewPlainLabel()), m_problem(NewPlainLabel()),
      m_buttons(new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel))
{
    setWindowTitle(tr("Log Settings"));
    makeFields();
    fill(LogPreferences::Read());
    for (QLineEdit* field : {m_elapsedPrefix, m_dateFormat, m_filePrefix})
        connect(field, &QLineEdit::textChanged, this, &LogSettingsDialog::check);
    connect(m_elapsed, &QCheckBox::toggled, this, &LogSettingsDialog::check);
    RemoveButtonIcons(m_buttons);
    connect(m_buttons, &QDialogButtonBox::accepted, this, &LogSettingsDialog::accept);
    connect(m_buttons, &QDialogButtonBox::rejected, this, &LogSettingsDialog::reject);
    check();
}

void LogSettingsDialog::makeFields()
{
    m_maxFiles->setRange(1, 100);
    m_maxFiles->setAccessibleName(tr("Older files to keep"));
    m_sample->setAccessibleName(tr("Sample entry"));
    m_sample->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    m_sample->setFont(QFontDatabase::systemFont(QFontDatabase::FixedFont));
    m_problem->setAccessibleName(tr("Settings problem"));
    m_problem->setWordWrap(true);

    auto* now = new QGroupBox(tr("Immediately"));
    auto* nowForm = new QFormLayout(now);
    nowForm->addRow(m_enabled);
    nowForm->addRow(m_elapsed);
    nowForm->addRow(m_echo);
    addRow(nowForm, tr("&Older files to keep:"), m_maxFiles);

    auto* later = new QGroupBox(tr("After restart"));
    auto* laterForm = new QFormLayout(later);
    addNextStartField(laterForm, tr("&Date format:"), m_dateFormat);
    addNextStartField(laterForm, tr("Elapsed time &prefix:"), m_elapsedPrefix);
    addNextStartField(laterForm, tr("Log file &name:"), m_filePrefix);
    addRow(laterForm, tr("Sample:"), m_sample);

    auto* layout = new QVBoxLayout(this);
    layout->addWidget(now);
    layout->addWidget(later);
    layout->addWidget(m_problem);
    layout->addWidget(m_buttons);
}

void LogSettingsDialog::addRow(QFormLayout* form, QString const& caption, QWidget* field)
{
    QLabel* label = NewPlainLabel(caption);
    label->setBuddy(field);
    form->addRow(label, field);
}

void LogSettingsDialog::addNextStartField(QFormLayout* form, QString const& caption,
                                          QLineEdit* field)
{
    field->setMinimumWidth(260);
    field->setAccessibleName(QString(caption).remove(QLatin1Char('&')).remove(QLatin1Char(':')));
    field->setAccessibleDescription(tr("After restart"));
    field->setToolTip(PlainToolTip(tr("After restart")));
    addRow(form, caption, field);
}

void LogSettingsDialog::fill(LogPreferences const& preferences)
{
    m_enabled->setChecked(preferences.enabled);
    m_elapsed->setChecked(preferences.elapsedTime);
    m_echo->setChecked(preferences.echo);
    m_maxFiles->setValue(preferences.maxFiles);
    m_elapsedPrefix->setText(preferences.elapsedPrefix);
    m_dateFormat->setText(preferences.dateFormat);
    m_filePrefix->setText(preferences.filePrefix);
}

LogPreferences LogSettingsDialog::preferences() const
{
    LogPreferences preferences;
    preferences.enabled = m_enabled->isChecked();
    preferences.elapsedTime = m_elapsed->isChecked();
    preferences.echo = m_echo->isChecked();
    preferences.maxFiles = m_maxFiles->value();
    preferences.elapsedPrefix = m_elapsedPrefix->text();
    preferences.dateFormat = m_dateFormat->text();
    preferences.filePrefix = m_filePrefix->text();
    return preferences;
}

QString LogSettingsDialog::problem() const
{
    if (!LogPreferences::IsStorable(m_dateFormat->text()))
        return tr("This date format cannot be saved.");
    if (!LogPreferences::IsStorable(m_elapsedPrefix->text()))
        return tr("This elapsed time prefix cannot be saved.");
    if (!LogPreferences::IsValidFilePrefix(m_filePrefix->text()))
        return tr("Not a valid log file name.");
    return QString();
}

void LogSettingsDialog::check()
{
    QString sample = QDateTime::currentDateTime().toString(m_dateFormat->text()) +
                     QLatin1Char(' ') + LogSeverities::NameInLog(LogEntry::Trace) +
                     QLatin1Char(' ');
    if (m_elapsed->isChecked())
        sample += m_elapsedPrefix->text() + QLatin1String("[250] ");
    m_sample->setText(sample + tr("message"));
    m_problem->setText(problem());
    m_buttons->button(QDialogButtonBox::Ok)->setEnabled(problem().isEmpty());
}

void LogSettingsDialog::accept()
{
    if (!problem().isEmpty())
        return;
    const QString error = preferences().Apply();
    if (error.isEmpty())
        QDialog::accept();
    else
        PlainMessageBox(QMessageBox::Critical, this, error).exec();
}

} // namespace Velocor
