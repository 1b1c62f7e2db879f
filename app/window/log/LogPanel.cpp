// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogPanel.h"

#include "app/logfile/LogFileList.h"
#include "app/logfile/LogIndex.h"
#include "app/window/log/LinesAsText.h"
#include "app/window/log/LogFilterBar.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/log/RunningLogParser.h"
#include "app/window/widgets/FileSizeText.h"
#include "app/window/widgets/PlainText.h"

#include <QClipboard>
#include <QComboBox>
#include <QFileInfo>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QLabel>
#include <QLocale>
#include <QPlainTextEdit>
#include <QSignalBlocker>
#include <QSplitter>
#include <QWheelEvent>

#include <algorithm>
#include <functional>

namespace Velocor {

namespace {

// Refreshes its list of files whenever it is opened.
class FileBox : public QComboBox
{
public:
    std::function<void()> fill;

    void showPopup() override
    {
        fill();
        QComboBox::showPopup();
    }
};

} // namespace

LogPanel::LogPanel(QWidget* parent)
    : QWidget(parent), m_model(new LogModel(this)), m_view(new LogView(m_model)),
      m_filterBar(new LogFilterBar), m_splitter(new QSplitter(Qt::Vertical))
{
    makeControls();
    makeLayout();
    connectAll();
}

// Not a focus proxy: coming from the widget before this one, Tab would skip all up to the table.
void LogPanel::focusInEvent(QFocusEvent*)
{
    m_view->setFocus();
}

void LogPanel::makeControls()
{
    auto* files = new FileBox;
    files->fill = [this] {
        fillFileList();
    };
    m_files = files;
    m_files->setAccessibleName(tr("Log file"));
    m_files->setToolTip(PlainToolTip(tr("The current log file and older log files")));
    m_files->setSizeAdjustPolicy(QComboBox::AdjustToMinimumContentsLengthWithIcon);
    m_files->setMinimumContentsLength(16);

    m_line = new QPlainTextEdit;
    m_line->setReadOnly(true);
    m_line->setTabChangesFocus(true);
    m_line->setAccessibleName(tr("Full text of the current line"));
    m_line->setPlaceholderText(tr("Select a line to see its full text here"));
    m_line->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
}

void LogPanel::makeLayout()
{
    QLabel* label = NewPlainLabel(tr("&File:"));
    label->setBuddy(m_files);
    auto* top = new QHBoxLayout;
    top->setSpacing(8);
    top->addWidget(label);
    top->addWidget(m_files, 1);

    m_splitter->setAccessibleName(tr("Log entries and current line"));
    m_splitter->setChildrenCollapsible(false);
    m_splitter->addWidget(m_view);
    m_splitter->addWidget(m_line);
    m_splitter->setStretchFactor(0, 1);
    m_line->setMinimumHeight(m_line->fontMetrics().lineSpacing() * 2 + 12);
    m_splitter->setSizes({400, m_line->fontMetrics().lineSpacing() * 3 + 12});

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(8, 8, 8, 8);
    layout->setSpacing(6);
    layout->addLayout(top);
    layout->addWidget(m_filterBar);
    layout->addWidget(m_splitter, 1);
}

void LogPanel::connectAll()
{
    m_view->viewport()->installEventFilter(this);
    m_line->viewport()->installEventFilter(this);
    connect(m_files, QOverload<int>::of(&QComboBox::activated), this, &LogPanel::chooseFile);
    connect(m_filterBar, &LogFilterBar::filterChanged, this, [this] {
        m_model->SetFilter(m_filterBar->filter());
        m_view->UpdateMarks();
    });
    connect(m_view, &LogView::followingChanged, this, &LogPanel::stateChanged);
    connect(m_view->selectionModel(), &QItemSelectionModel::currentRowChanged, this,
            &LogPanel::showCurrentLine);
    connect(m_model, &LogModel::refreshed, this, [this] {
        m_filterBar->ShowSlowLine(m_model->state().slowLine);
        updatePlaceholder();
        if (!m_view->currentIndex().isValid())
            showCurrentLine();
        Q_EMIT stateChanged();
    });
    connect(m_model, &LogModel::progressed, this, [this](int percent) {
        m_percent = percent;
        updatePlaceholder();
        Q_EMIT stateChanged();
    });
}

void LogPanel::Open(QString const& path, bool isCurrent)
{
    m_currentPath = isCurrent ? path : QString();
    {
        const QSignalBlocker blocker(m_files);
        m_files->clear();
        m_files->addItem(QFileInfo(path).fileName(), path);
    }
    showFile(path);
}

void LogPanel::showFile(QString const& path)
{
    m_files->setToolTip(PlainToolTip(path));
    m_files->setAccessibleDescription(path);
    m_model->Open(path, RunningLogParser(), path == m_currentPath);
    updatePlaceholder();
}

void LogPanel::fillFileList()
{
    const QSignalBlocker blocker(m_files);
    m_files->clear();
    const QStringList files = LogFileList::FilesOf(path());
    for (QString const& file : files) {
        const QFileInfo info(file);
        const QString size = info.exists() ? FileSizeText(info.size()) : tr("does not exist");
        m_files->addItem(tr("%1 (%2)").arg(info.fileName(), size), file);
        m_files->setItemData(m_files->count() - 1, PlainToolTip(file), Qt::ToolTipRole);
    }
    m_files->setCurrentIndex(m_files->findData(path()));
}

void LogPanel::chooseFile(int position)
{
    const QString file = m_files->itemData(position).toString();
    if (file != path())
        showFile(file);
}

void LogPanel::Reload()
{
    m_model->Reload();
}

void LogPanel::SetPaused(bool paused)
{
    m_model->SetPaused(paused);
    Q_EMIT stateChanged();
}

bool LogPanel::isPaused() const
{
    return m_model->isPaused();
}

void LogPanel::SetFollowing(bool following)
{
    m_view->SetFollowing(following);
}

bool LogPanel::isFollowing() const
{
    return m_view->isFollowing();
}

void LogPanel::SetEarlierRuns(bool shown)
{
    m_filterBar->SetEarlierRuns(shown);
}

bool LogPanel::showsEarlierRuns() const
{
    return m_filterBar->filter().earlierRuns();
}

void LogPanel::SetTextFont(QFont const& font)
{
    const auto timeWidth = [this] {
        return QFontMetricsF(m_view->font())
            .boundingRect(QStringLiteral("2000-00-00 00:00:00.000"))
            .width();
    };
    const qreal before = timeWidth();
    QList<int> widths = columnWidths();
    m_view->setFont(font);
    m_line->setFont(font);
    const qreal factor = timeWidth() / before;
    for (int& width : widths)
        width = qRound(width * factor);
    SetColumnWidths(widths);
}

// A read-only text would zoom by itself, and the table would scroll.
bool LogPanel::eventFilter(QObject* object, QEvent* event)
{
    if (event->type() != QEvent::Wheel)
        return QWidget::eventFilter(object, event);
    auto const* wheel = static_cast<QWheelEvent const*>(event);
    if (!(wheel->modifiers() & Qt::ControlModifier))
        return false;
    m_wheel += wheel->angleDelta().y();
    const int steps = m_wheel / QWheelEvent::DefaultDeltasPerStep;
    m_wheel -= steps * QWheelEvent::DefaultDeltasPerStep;
    if (steps != 0)
        Q_EMIT zoomRequested(steps);
    return true;
}

void LogPanel::AddBar(QWidget* bar)
{
    auto* all = static_cast<QVBoxLayout*>(layout());
    all->insertWidget(all->indexOf(m_splitter), bar);
}

void LogPanel::FocusFilter()
{
    m_filterBar->FocusText();
}

void LogPanel::ClearFilter()
{
    m_filterBar->Clear();
}

void LogPanel::CopySelected()
{
    reportCopied(m_view->CopySelected());
}

void LogPanel::CopyAsMarkdown()
{
    const QList<int> rows = m_view->SelectedRows();
    copyRows(rows, LinesAsText::Markdown(*m_model, rows));
}

void LogPanel::CopyAsCsv()
{
    const QList<int> rows = m_view->SelectedRows();
    copyRows(rows, LinesAsText::Csv(*m_model, rows));
}

void LogPanel::copyRows(QList<int> const& rows, QString const& text)
{
    const auto count = std::count_if(rows.begin(), rows.end(),
                                     [this](int row) { return m_model->LineStart(row) >= 0; });
    if (count > 0)
        QGuiApplication::clipboard()->setText(text);
    reportCopied(static_cast<int>(count));
}

QVector<qint64> LogPanel::LineStarts() const
{
    QVector<qint64> starts;
    starts.reserve(m_model->rowCount());
    for (int row = 0; row < m_model->rowCount(); ++row) {
        const qint64 start = m_model->LineStart(row);
        if (start >= 0) // not a heading
            starts.append(start);
    }
    return starts;
}

void LogPanel::reportCopied(int count)
{
    if (count == 0)
        Q_EMIT messageReported(tr("No lines selected"));
    else if (count >= LogView::MaximumCopiedLines)
        Q_EMIT messageReported(tr("Copied only the first %L1 selected lines").arg(count));
    else
        Q_EMIT messageReported(count == 1 ? tr("1 line copied")
                                          : tr("%L1 lines copied").arg(count));
}

void LogPanel::SelectAll()
{
    m_view->selectAll();
}

void LogPanel::GoToProblem(int step)
{
    const LogView::Jump jump = m_view->GoToProblem(step);
    if (jump == LogView::Jump::None) {
        Q_EMIT messageReported(tr("No warnings or errors"));
        return;
    }
    m_view->setFocus();
    if (jump == LogView::Jump::Wrapped)
        Q_EMIT messageReported(step > 0 ? tr("Continued from the top")
                                        : tr("Continued from the bottom"));
}

QString LogPanel::path() const
{
    return m_model->path();
}

QString LogPanel::summary() const
{
    if (m_model->isReading() && m_percent < 100)
        return tr("Reading: %1%").arg(m_percent);
    LogUpdate const& state = m_model->state();
    const QString separator = QStringLiteral("  %1  ").arg(QChar(0xb7)); // middle dot
    const QLocale locale;
    const auto lines = static_cast<qlonglong>(state.lines);
    qlonglong shown = m_model->rowCount();
    if (state.rows->earlier > 0)
        shown -= 2; // headings
    const QString all = lines == 1 ? tr("1 line") : tr("%1 lines").arg(locale.toString(lines));
    QString text = shown < lines ? tr("%1 of %2").arg(locale.toString(shown), all) : all;
    const auto problems = static_cast<qlonglong>(state.rows->problems);
    text += separator +
            (problems == 1 ? tr("1 problem") : tr("%1 problems").arg(locale.toString(problems)));
    if (isPaused())
        text += separator + tr("paused");
    return text;
}

void LogPanel::updatePlaceholder()
{
    LogUpdate const& state = m_model->state();
    if (m_model->isReading())
        m_view->SetPlaceholder(m_percent < 100 ? tr("Reading: %1%").arg(m_percent) : QString());
    else if (!state.error.isEmpty())
        m_view->SetPlaceholder(tr("Cannot read %1:\n%2").arg(path(), state.error));
    else if (!state.exists)
        m_view->SetPlaceholder(
            tr("%1 does not exist.\nIt is shown here as soon as it is created.").arg(path()));
    else if (state.lines > 0)
        m_view->SetPlaceholder(tr("No lines match the filter.\nClear it with Ctrl+Shift+F."));
    else
        m_view->SetPlaceholder(tr("The log is empty.\nNew lines appear here as they are written."));
}

void LogPanel::showCurrentLine()
{
    const QModelIndex current = m_view->currentIndex();
    m_line->setPlainText(current.isValid() ? m_model->LineText(current.row(), LogIndex::LineLimit)
                                           : QString());
}

QList<int> LogPanel::columnWidths() const
{
    QList<int> widths;
    for (int column = 0; column < LogModel::MessageColumn; ++column)
        widths.append(m_view->columnWidth(column));
    return widths;
}

void LogPanel::SetColumnWidths(QList<int> const& widths)
{
    for (int column = 0; column < LogModel::MessageColumn && column < widths.size(); ++column) {
        if (widths.at(column) >= 10)
            m_view->setColumnWidth(column, widths.at(column));
    }
}

QList<int> LogPanel::paneSizes() const
{
    return m_splitter->sizes();
}

void LogPanel::SetPaneSizes(QList<int> const& sizes)
{
    if (sizes.size() == m_splitter->count())
        m_splitter->setSizes(sizes);
}

} // namespace Velocor
