// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/WindowDialogs.h"

#include "app/report/OwnNames.h"
#include "app/report/Redactor.h"
#include "app/report/ReportReader.h"
#include "app/runninglog/LogPreferences.h"
#include "app/runninglog/RunningLog.h"
#include "app/window/ApplicationProperty.h"
#include "app/window/Manual.h"
#include "app/window/PlacesPanel.h"
#include "app/window/ProblemReportDialog.h"
#include "app/window/ReportDialog.h"
#include "app/window/ShortcutList.h"
#include "app/window/SystemReport.h"
#include "app/window/log/LogSettingsDialog.h"

#include <QMainWindow>

namespace Velocor {

WindowDialogs::WindowDialogs(QString const& settingsFile, QMainWindow* window)
    : m_settingsFile(settingsFile), m_window(window)
{}

void WindowDialogs::ShowAbout()
{
    ReportDialog dialog(tr("About %1").arg(QStringLiteral("Velocor")),
                        QStringLiteral("Velocor %1\n").arg(QLatin1String(VELOCOR_VERSION)) +
                            tr("The startup program of the Tork family. MIT license."),
                        SystemReport::Licenses() + SystemReport::Facts(m_settingsFile), m_window);
    dialog.exec();
}

void WindowDialogs::ShowShortcuts()
{
    ReportDialog dialog(tr("Keyboard Shortcuts"),
                        tr("Alt and the underlined letter open a menu; Tab goes from one control "
                           "to the next."),
                        ShortcutList(m_window), m_window);
    dialog.exec();
}

void WindowDialogs::ShowManual()
{
    if (!OpenManual())
        Q_EMIT messageReported(
            tr("The manual is not installed, or there is no program to show it"));
}

void WindowDialogs::SaveReport()
{
    const QString installation = ApplicationProperty("RootPath");
    QList<ReportPart> parts = {
        {tr("Versions and system"), SystemReport::Versions(), {}},
        {tr("Identity and places"), SystemReport::Places(m_settingsFile), {}},
        ReportReader::Settings(tr("Log settings"), {LogPreferences::FileName()}),
        ReportReader::Settings(tr("Settings files"),
                               {m_settingsFile, installation + QLatin1String("appdata.cfg")})};
    parts += ReportReader::Log(RunningLog::FileName());
    Redactor redactor;
    OwnNames::AddTo(redactor);
    ProblemReportDialog dialog(parts, redactor, m_window);
    dialog.exec();
}

void WindowDialogs::ShowEndOfRun()
{
    const QString text = ReportReader::EndOfAbnormalRun(RunningLog::FileName());
    ReportDialog dialog(tr("Last Entries"),
                        text.isEmpty() ? tr("The log no longer has the entries of that run.")
                                       : tr("The last entries before the program ended:"),
                        text, m_window);
    dialog.exec();
}

void WindowDialogs::ChangeLogSettings()
{
    LogSettingsDialog dialog(m_window);
    if (dialog.exec() != QDialog::Accepted)
        return;
    Q_EMIT messageReported(tr("Log settings saved"));
    Q_EMIT logSettingsChanged();
}

void WindowDialogs::OpenLogFolder()
{
    if (!PlacesPanel::OpenPlace(RunningLog::FileName()))
        Q_EMIT messageReported(
            tr("Cannot open the log folder: it does not exist, or there is no file manager"));
}

} // namespace Velocor
