// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/RunText.h"

#include <QCoreApplication>
#include <QLocale>
#include <QStringList>

namespace Velocor {

namespace {

struct RunTexts
{
    Q_DECLARE_TR_FUNCTIONS(RunText)
};

QString ExitOf(HistoryRun::Exit exit)
{
    switch (exit) {
    case HistoryRun::Normal:
        return RunTexts::tr("ended normally");
    case HistoryRun::Abnormal:
        return RunTexts::tr("killed or crashed");
    case HistoryRun::Running:
        return RunTexts::tr("still running");
    case HistoryRun::Unknown:
        break;
    }
    return QString();
}

QString CountOf(size_t count, QString const& one, QString const& several)
{
    if (count == 0)
        return QString();
    return count == 1 ? one : several.arg(QLocale().toString(qulonglong(count)));
}

} // namespace

QString TimesText(QString const& start, QString const& end)
{
    if (start.isEmpty() || end == start)
        return start;
    const int space = start.indexOf(QLatin1Char(' ')) + 1;
    const bool isSameDay = space > 0 && end.startsWith(start.left(space));
    return RunTexts::tr("%1 to %2").arg(start, isSameDay ? end.mid(space) : end);
}

QString RunText(RunHeading const& run, QString const& program)
{
    QStringList parts = {
        program, TimesText(run.start, run.end), ExitOf(run.exit),
        CountOf(run.warnings, RunTexts::tr("1 warning"), RunTexts::tr("%1 warnings")),
        CountOf(run.errors, RunTexts::tr("1 error"), RunTexts::tr("%1 errors"))};
    parts.removeAll(QString());
    return parts.join(QStringLiteral("  %1  ").arg(QChar(0xb7))); // middle dot
}

QString RunTextWithArrow(RunHeading const& run, QString const& program)
{
    const QChar arrow(run.isFolded ? 0x25b8 : 0x25be);
    return QStringLiteral("%1  ").arg(arrow) + RunText(run, program);
}

} // namespace Velocor
