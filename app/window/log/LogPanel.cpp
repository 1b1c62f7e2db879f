// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogPanel.h"

#include "app/logfile/LogFileList.h"
#include "app/logfile/LogIndex.h"
#include "app/window/log/GoToDialog.h"
#include "app/window/log/LinesAsText.h"
#include "app/window/log/LogFilterBar.h"
#include "app/window/log/LogFindBar.h"
#include "app/window/log/LogGoTo.h"
#include "app/window/log/LogMarks.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogSearch.h"
#include "app/window/log/LogView.h"
#include "app/window/log/NoteDialog.h"
#include "app/window/log/RunningLogParser.h"
#include "app/window/log/TickScrollBar.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/FileSizeText.h"
#include "app/window/widgets/PlainText.h"

#include <QClipboard>
#include <QComboBox>
#include <QFileInfo>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QLocale>
#include <QMenu>
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
      m_filterBar(new LogFilterBar), m_findBar(new LogFindBar),
      m_search(new LogSearch(m_model, this)), m_goTo(new LogGoTo(m_model, this)),
      m_marks(new LogMarks(m_model, this)), m_splitter(new QSplitter(Qt::Vertical))
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

    m_note = new ElidedLabel(Qt::ElideRight);
    m_note->setAccessibleName(tr("Note on the current line"));
    m_note->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);
    m_note->hide();

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

    auto* table = new QWidget;
    auto* tableLayout = new QVBoxLayout(table);
    tableLayout->setContentsMargins(0, 0, 0, 2);
    tableLayout->setSpacing(6);
    tableLayout->addWidget(m_view, 1);
    tableLayout->addWidget(m_findBar);

    auto* current = new QWidget;
    auto* currentLayout = new QVBoxLayout(current);
    currentLayout->setContentsMargins(0, 0, 0, 0);
    currentLayout->setSpacing(4);
    currentLayout->addWidget(m_note);
    currentLayout->addWidget(m_line, 1);

    m_splitter->setAccessibleName(tr("Log entries and current line"));
    m_splitter->setChildrenCollapsible(false);
    m_splitter->addWidget(table);
    m_splitter->addWidget(current);
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
    connect(m_findBar, &LogFindBar::textChanged, this, &LogPanel::applyFind);
    connect(m_findBar, &LogFindBar::stepRequested, this, &LogPanel::FindNext);
    connect(m_findBar, &LogFindBar::closed, this, [this] { m_view->setFocus(); });
    connect(m_goTo, &LogGoTo::arrived, this, [this](int row, QString const& message) {
        if (row >= 0)
            m_view->GoToRow(row);
        if (!message.isEmpty())
            Q_EMIT messageReported(message);
    });
    connect(m_goTo, &LogGoTo::started, this, &LogPanel::messageReported);
    connect(m_marks, &LogMarks::changed, this, &LogPanel::showMarks);
    m_line->setContextMenuPolicy(Qt::CustomContextMenu);
    connect(m_line, &QWidget::customContextMenuRequested, this, &LogPanel::showLineMenu);
    connect(m_view, &LogView::menuRequested, this, &LogPanel::showMenu);
    connect(m_search, &LogSearch::changed, this, &LogPanel::showFound);
    connect(m_view, &LogView::followingChanged, this, &LogPanel::stateChanged);
    connect(m_view->selectionModel(), &QItemSelectionModel::currentRowChanged, this,
            &LogPanel::showCurrentLine);
    connect(m_view->selectionModel(), &QItemSelectionModel::currentRowChanged, this,
            &LogPanel::showFound);
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
    m_marks->Load();
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

void LogPanel::SetEncoding(LogEncoding encoding)
{
    m_model->SetEncoding(encoding);
    Q_EMIT stateChanged();
}

LogEncoding LogPanel::chosenEncoding() const
{
    return m_model->chosenEncoding();
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

void LogPanel::OpenFind()
{
    m_findBar->Open();
}

void LogPanel::applyFind()
{
    const LogFilter text = m_findBar->text();
    m_wantedStep = 0;
    m_search->SetText(text);
    m_view->SetFound(text);
    showFound();
}

void LogPanel::FindNext(int step)
{
    if (m_findBar->isHidden() || !m_findBar->hasText()) {
        const bool mayGoOn = m_findBar->hasText();
        m_findBar->Open();
        if (!mayGoOn)
            return;
    }
    m_findBar->Apply();
    m_wantedStep = step;
    goToFound();
    showFound();
}

// Keeps waiting while the next hit is not known yet.
void LogPanel::goToFound()
{
    const int step = m_wantedStep;
    if (step == 0)
        return;
    int row = -1;
    const LogSearch::Answer answer = m_search->Next(m_view->StartRow(step), step, row);
    if (answer == LogSearch::Answer::Unknown)
        return;
    m_wantedStep = 0;
    if (answer == LogSearch::Answer::None) {
        if (m_search->text().hasText() && m_search->slowLine() == 0)
            Q_EMIT messageReported(tr("Not found"));
        return;
    }
    m_view->GoToRow(row);
    if (answer == LogSearch::Answer::Wrapped)
        Q_EMIT messageReported(step > 0 ? tr("Continued from the top")
                                        : tr("Continued from the bottom"));
}

void LogPanel::showFound()
{
    goToFound();
    m_findBar->ShowSlowLine(m_search->slowLine());
    m_view->ticks()->SetTicks(TickScrollBar::Found, m_search->hits());
    const auto count = static_cast<int>(m_search->hits()->size());
    const int number = m_search->NumberOf(m_view->currentIndex().row());
    QString text;
    if (!m_search->text().hasText() || m_search->slowLine() > 0)
        text = QString();
    else if (!m_search->isComplete() && m_search->percent() < 99)
        text = tr("Searching: %1%").arg(m_search->percent());
    else if (count == 0)
        text = m_search->isComplete() ? tr("Not found") : QString();
    else if (number > 0)
        text = tr("%L1 of %L2").arg(number).arg(count);
    else
        text = count == 1 ? tr("1 line") : tr("%L1 lines").arg(count);
    m_findBar->ShowCount(text);
}

void LogPanel::keyPressEvent(QKeyEvent* event)
{
    if (event->key() == Qt::Key_Escape && !m_findBar->isHidden())
        m_findBar->Close();
    else
        QWidget::keyPressEvent(event);
}

void LogPanel::AskGoTo()
{
    const int current = m_view->currentIndex().row();
    GoToDialog dialog(static_cast<qint64>(m_model->state().lines), current >= 0, this);
    if (dialog.exec() != QDialog::Accepted)
        return;
    m_view->setFocus();
    m_goTo->Find(dialog.place(), m_view->currentIndex().row());
}

void LogPanel::SetMarkStore(LogMarkStore* store)
{
    m_marks->SetStore(store);
}

void LogPanel::report(QString const& message)
{
    if (!message.isEmpty())
        Q_EMIT messageReported(message);
}

void LogPanel::ToggleMark()
{
    report(m_marks->Toggle(m_view->currentIndex().row()));
}

void LogPanel::AskNote()
{
    const QPersistentModelIndex current = m_view->currentIndex();
    if (!current.isValid()) {
        report(tr("Select a line first"));
        return;
    }
    NoteDialog dialog(m_marks->NoteOf(current.row()), this);
    if (dialog.exec() == QDialog::Accepted)
        report(m_marks->SetNote(current.row(), dialog.note()));
}

void LogPanel::GoToMark(int step)
{
    std::vector<int> const& rows = *m_marks->rows();
    if (rows.empty()) {
        report(tr("No marks in the lines shown"));
        return;
    }
    const int from = m_view->StartRow(step);
    const auto after = std::upper_bound(rows.begin(), rows.end(), from);
    const auto before = std::lower_bound(rows.begin(), rows.end(), from);
    const bool isAhead = step > 0 ? after != rows.end() : before != rows.begin();
    if (step > 0)
        m_view->GoToRow(isAhead ? *after : rows.front());
    else
        m_view->GoToRow(isAhead ? *(before - 1) : rows.back());
    m_view->setFocus();
    if (!isAhead)
        report(step > 0 ? tr("Continued from the top") : tr("Continued from the bottom"));
}

void LogPanel::showMarks()
{
    m_view->ticks()->SetTicks(TickScrollBar::Marked, m_marks->rows());
    m_view->viewport()->update();
    showNote(); // not the line, in which the user may have selected something
}

void LogPanel::SetFilterHistory(std::shared_ptr<QStringList> const& history)
{
    m_filterBar->SetHistory(history);
}

// The names of severities are translated, so their cells stand for the severity itself.
void LogPanel::filterBy(QModelIndex const& cell, bool isHiding)
{
    if (!cell.isValid())
        return;
    if (cell.column() == LogModel::SeverityColumn) {
        const auto severity =
            static_cast<LogEntry::Severity>(cell.data(LogModel::SeverityRole).toInt());
        if (isHiding)
            m_filterBar->Hide(severity);
        else
            m_filterBar->FilterBy(severity);
        return;
    }
    const QString text = cell.data().toString();
    if (text.isEmpty())
        return;
    if (isHiding)
        m_filterBar->Hide(text);
    else
        m_filterBar->FilterBy(text);
}

// For a part of the line, which cannot be selected in the table.
void LogPanel::showLineMenu(QPoint const& position)
{
    QMenu* menu = m_line->createStandardContextMenu();
    menu->setAttribute(Qt::WA_DeleteOnClose);
    const QString selected = m_line->textCursor().selectedText();
    menu->addSeparator();
    QAction* filter = menu->addAction(tr("&Filter by This"), this,
                                      [this, selected] { m_filterBar->FilterBy(selected); });
    QAction* hide =
        menu->addAction(tr("&Hide This"), this, [this, selected] { m_filterBar->Hide(selected); });
    filter->setEnabled(!selected.isEmpty());
    hide->setEnabled(!selected.isEmpty());
    menu->popup(m_line->mapToGlobal(position));
}

void LogPanel::showMenu(QPoint const& position, QModelIndex const& cell)
{
    auto* menu = new QMenu(this);
    menu->setAttribute(Qt::WA_DeleteOnClose);
    menu->addAction(tr("&Copy"), this, &LogPanel::CopySelected);
    menu->addSeparator();
    const QPersistentModelIndex clicked = cell;
    menu->addAction(tr("&Filter by This"), this, [this, clicked] { filterBy(clicked, false); });
    menu->addAction(tr("&Hide This"), this, [this, clicked] { filterBy(clicked, true); });
    menu->addSeparator();
    const bool isMarked = m_marks->isMarked(m_view->currentIndex().row());
    menu->addAction(isMarked ? tr("Remove &Mark") : tr("&Mark"), this, &LogPanel::ToggleMark);
    menu->addAction(tr("&Note..."), this, &LogPanel::AskNote);
    menu->popup(position);
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
    const bool isReading = m_model->isReading() && m_percent < 100;
    LogUpdate const& state = m_model->state();
    if (isReading && !state.isPartial)
        return tr("Reading: %1%").arg(m_percent);
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
    if (isReading)
        text += separator + tr("%1% read").arg(m_percent);
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
    m_line->setPlainText(current.isValid() ? m_model->EntryText(current.row(), LogIndex::LineLimit)
                                           : QString());
    showNote();
}

void LogPanel::showNote()
{
    const QString note = m_marks->NoteOf(m_view->currentIndex().row());
    m_note->setText(note.isEmpty() ? QString() : tr("Note: %1").arg(note));
    m_note->setToolTip(PlainToolTip(note));
    m_note->setVisible(!note.isEmpty());
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
