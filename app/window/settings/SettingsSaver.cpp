// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsSaver.h"

#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/widgets/PlainText.h"

#include <QFileInfo>
#include <QMessageBox>
#include <QObject>
#include <QPushButton>

namespace Velocor {

namespace {

// The maximum length of each line in a message box, in characters.
constexpr int MaximumLossLength = 300;

} // namespace

void SettingsSaver::NoteRead(QString const& path, SettingsDocument const& document)
{
    m_path = path;
    m_hasBackup = false;
    m_read = QFileInfo(path).lastModified();
    NoteLosses(document);
}

void SettingsSaver::NoteLosses(SettingsDocument const& document)
{
    m_fileLosses = SettingsDocument::TextsOf(document.losses);
    m_fileLossCount = document.lossCount;
}

QString SettingsSaver::name() const
{
    return QFileInfo(m_path).fileName();
}

bool SettingsSaver::ask(QString const& text, QString const& details, QString const& acceptText)
{
    PlainMessageBox box(QMessageBox::Warning, m_parent, text, QMessageBox::Cancel, details);
    QPushButton* yes = box.addButton(acceptText, QMessageBox::AcceptRole);
    box.setDefaultButton(QMessageBox::Cancel);
    box.exec();
    return box.clickedButton() == yes;
}

bool SettingsSaver::confirmLosses(SettingsDocument const& document)
{
    QStringList losses =
        m_fileLosses + SettingsDocument::TextsOf(SettingsFileWriter::Losses(document));
    const int unlisted = m_fileLossCount - m_fileLosses.size();
    if (losses.isEmpty())
        return true;

    const int most = 12;
    const int more = losses.size() - most + unlisted;
    if (losses.size() > most)
        losses = losses.mid(0, most);
    for (QString& loss : losses)
        loss = Shortened(loss, MaximumLossLength);
    if (more > 0)
        losses.append(QObject::tr("and %1 more").arg(more));
    return ask(QObject::tr("Saving %1 would lose:").arg(name()), losses.join(QLatin1Char('\n')),
               QObject::tr("Save Anyway"));
}

bool SettingsSaver::confirmOverwrite()
{
    if (!QFileInfo::exists(m_path) || QFileInfo(m_path).lastModified() == m_read)
        return true;
    return ask(QObject::tr("%1 was changed by another program.").arg(name()),
               QObject::tr("Saving would overwrite those changes."), QObject::tr("Save Anyway"));
}

bool SettingsSaver::makeBackup()
{
    if (m_hasBackup)
        return true;
    QString error;
    m_hasBackup = SettingsFileWriter::KeepBackup(m_path, &error);
    if (m_hasBackup)
        return true;
    return ask(QObject::tr("Cannot back up %1.").arg(name()), error,
               QObject::tr("Save Without Backup"));
}

void SettingsSaver::AcceptFile()
{
    m_read = QFileInfo(m_path).lastModified();
}

// The file dialog has asked whether it may be overwritten.
SettingsSaver SettingsSaver::saverOf(QString const& path) const
{
    SettingsSaver other = *this;
    other.m_path = path;
    other.m_hasBackup = false;
    other.AcceptFile();
    return other;
}

bool SettingsSaver::SaveAs(QString const& path, SettingsDocument const& document)
{
    SettingsSaver other = saverOf(path);
    if (!other.Save(document))
        return false;
    *this = other;
    return true;
}

bool SettingsSaver::Save(SettingsDocument const& document)
{
    if (!confirmOverwrite() || !confirmLosses(document) || !makeBackup())
        return false;
    m_statesProblem = m_states.Keep(m_path);
    QString error;
    const bool isSaved = SettingsFileWriter::Save(m_path, document, &error);
    if (!noteOutcome(isSaved, error))
        return false;
    NoteLosses(SettingsDocument());
    return true;
}

bool SettingsSaver::confirmMalformed(SettingsDocument const& parsed)
{
    if (parsed.isParsed)
        return true;
    return ask(QObject::tr("Programs cannot read all of %1 yet.").arg(name()),
               QObject::tr("Line %1, column %2: %3")
                   .arg(parsed.line)
                   .arg(parsed.column)
                   .arg(Shortened(parsed.error, MaximumLossLength)),
               QObject::tr("Save Anyway"));
}

bool SettingsSaver::SaveText(QByteArray const& text, SettingsDocument const& parsed)
{
    if (!confirmOverwrite() || !confirmMalformed(parsed) || !makeBackup())
        return false;
    m_statesProblem = m_states.Keep(m_path);
    QString error;
    const bool isSaved = SettingsFileWriter::SaveBytes(m_path, text, &error);
    if (!noteOutcome(isSaved, error))
        return false;
    NoteLosses(parsed);
    return true;
}

bool SettingsSaver::SaveTextAs(QString const& path, QByteArray const& text,
                               SettingsDocument const& parsed)
{
    SettingsSaver other = saverOf(path);
    if (!other.SaveText(text, parsed))
        return false;
    *this = other;
    return true;
}

bool SettingsSaver::SaveCopyAs(QString const& path)
{
    SettingsSaver other = saverOf(path);
    if (!other.makeBackup())
        return false;
    QString error;
    const bool isSaved = SettingsFileWriter::SaveCopy(path, m_path, &error);
    if (!other.noteOutcome(isSaved, error))
        return false;
    *this = other;
    return true;
}

// Tells the user of a failure.
bool SettingsSaver::noteOutcome(bool isSaved, QString const& error)
{
    if (isSaved) {
        const QString problem = m_states.Keep(m_path);
        if (m_statesProblem.isEmpty())
            m_statesProblem = problem;
        AcceptFile();
    } else {
        PlainMessageBox(QMessageBox::Critical, m_parent,
                        QObject::tr("Could not save %1.\n%2").arg(LeftToRight(m_path), error))
            .exec();
    }
    return isSaved;
}

} // namespace Velocor
