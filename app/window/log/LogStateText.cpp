// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogStateText.h"

#include "app/window/log/LogModel.h"

#include <QCoreApplication>
#include <QLocale>

namespace Velocor {

namespace {

struct StateText
{
    Q_DECLARE_TR_FUNCTIONS(LogStateText)
};

} // namespace

QString LogStateText::Summary(LogModel const& model, int percent)
{
    const bool isReading = model.isReading() && percent < 100;
    LogUpdate const& state = model.state();
    if (isReading && !state.isPartial)
        return StateText::tr("Reading: %1%").arg(percent);
    const QString separator = QStringLiteral("  %1  ").arg(QChar(0xb7)); // middle dot
    const QLocale locale;
    const auto lines = static_cast<qlonglong>(state.lines);
    qlonglong shown = model.rowCount();
    if (state.rows->earlier() > 0)
        shown -= 2; // headings
    const QString all = lines == 1 ? StateText::tr("1 line")
                                   : StateText::tr("%1 lines").arg(locale.toString(lines));
    QString text = shown < lines ? StateText::tr("%1 of %2").arg(locale.toString(shown), all) : all;
    const auto problems = static_cast<qlonglong>(state.rows->problems());
    text +=
        separator + (problems == 1 ? StateText::tr("1 problem")
                                   : StateText::tr("%1 problems").arg(locale.toString(problems)));
    if (isReading)
        text += separator + StateText::tr("%1% read").arg(percent);
    if (model.isPaused())
        text += separator + StateText::tr("paused");
    return text;
}

QString LogStateText::Placeholder(LogModel const& model, int percent)
{
    LogUpdate const& state = model.state();
    if (model.isReading())
        return percent < 100 ? StateText::tr("Reading: %1%").arg(percent) : QString();
    if (!state.error.isEmpty())
        return StateText::tr("Cannot read %1:\n%2").arg(model.path(), state.error);
    if (!state.exists)
        return StateText::tr("%1 does not exist.\nIt is shown here as soon as it is created.")
            .arg(model.path());
    if (state.lines > 0)
        return StateText::tr("No lines match the filter.\nClear it with Ctrl+Shift+F.");
    return StateText::tr("The log is empty.\nNew lines appear here as they are written.");
}

} // namespace Velocor
