// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogStateText.h"

#include "app/window/log/LogModel.h"
#include "app/window/widgets/PlainText.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QLocale>

#include <algorithm>

namespace Velocor {

namespace {

struct StateText
{
    Q_DECLARE_TR_FUNCTIONS(LogStateText)
};

qulonglong ShownLines(LogModel const& model)
{
    LogRows const& rows = *model.state().rows;
    return static_cast<qulonglong>(rows.size() - rows.headings());
}

QString LinesShown(LogModel const& model)
{
    const QLocale locale;
    const qulonglong lines = model.state().lines;
    const QString all = StateText::tr("%Ln line(s)", nullptr, static_cast<int>(lines));
    const qulonglong shown = ShownLines(model);
    return shown < lines ? StateText::tr("%1 of %2").arg(locale.toString(shown), all) : all;
}

QString LineOf(LogModel const& model, int row, qulonglong current)
{
    const QLocale locale;
    if (model.isAll())
        return StateText::tr("Line %1 of %2")
            .arg(locale.toString(current), LeftToRight(QFileInfo(model.FileOf(row)).fileName()));
    const qulonglong lines = std::max<qulonglong>(current, model.state().lines);
    return StateText::tr("Line %1 of %2").arg(locale.toString(current), locale.toString(lines));
}

} // namespace

QString LogStateText::Summary(LogModel const& model, int percent, int row, qulonglong current)
{
    const bool isReading = model.isReading() && percent < 100;
    LogUpdate const& state = model.state();
    if (isReading && !state.isPartial)
        return StateText::tr("Reading: %1%").arg(percent);
    const QString separator = QStringLiteral("  %1  ").arg(QChar(0xb7)); // middle dot
    const QLocale locale;
    QString text = current > 0 ? LineOf(model, row, current) : LinesShown(model);
    const auto problems = static_cast<qlonglong>(state.rows->problems());
    text += separator + StateText::tr("%Ln problem(s)", nullptr, static_cast<int>(problems));
    if (current > 0 && ShownLines(model) < state.lines)
        text += separator + StateText::tr("%1 shown").arg(locale.toString(ShownLines(model)));
    if (isReading)
        text += separator + StateText::tr("%1% read").arg(percent);
    if (model.isPaused())
        text += separator + StateText::tr("paused");
    return text;
}

QString LogStateText::ContentNotice(LogModel const& model)
{
    QStringList const& unreadable = model.state().unreadable;
    if (!unreadable.isEmpty()) {
        QStringList names;
        for (QString const& path : unreadable)
            names.append(LeftToRight(QFileInfo(path).fileName()));
        return StateText::tr("Cannot be read, so their lines are missing: %1")
            .arg(names.join(QStringLiteral(", ")));
    }
    const auto compressed = [&model](char const* program) {
        return StateText::tr("This looks like a compressed file. To read it: %1")
            .arg(LeftToRight(QStringLiteral("%1 %2 | velocor -")
                                 .arg(QLatin1String(program), QFileInfo(model.path()).fileName())));
    };
    switch (model.state().type.content) {
    case LogFileType::Gzip:
        return compressed("zcat");
    case LogFileType::Xz:
        return compressed("xzcat");
    case LogFileType::Bzip2:
        return compressed("bzcat");
    case LogFileType::Zstd:
        return compressed("zstdcat");
    case LogFileType::Binary:
        return StateText::tr("This looks like a binary file. Its bytes are shown as text.");
    case LogFileType::Text:
        break;
    }
    return QString();
}

QString LogStateText::Placeholder(LogModel const& model, int percent)
{
    LogUpdate const& state = model.state();
    if (model.isReading())
        return percent < 100 ? StateText::tr("Reading: %1%").arg(percent) : QString();
    if (!state.error.isEmpty())
        return StateText::tr("Cannot read %1:\n%2").arg(LeftToRight(model.path()), state.error);
    if (!state.exists)
        return StateText::tr("%1 does not exist.\nIt is shown here as soon as it is created.")
            .arg(LeftToRight(model.path()));
    if (state.lines > 0)
        return StateText::tr("No lines match the filter.\nClear it with Ctrl+Shift+F.");
    return StateText::tr("The log is empty.\nNew lines appear here as they are written.");
}

} // namespace Velocor
