// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/LogPanel.h"

#include "app/logfile/LogFileList.h"
#include "app/logfile/LogIndex.h"
#include "app/window/log/ActivityStrip.h"
#include "app/window/log/CurrentLine.h"
#include "app/window/log/GoToDialog.h"
#include "app/window/log/HighlightRules.h"
#include "app/window/log/LineNumberMargin.h"
#include "app/window/log/LogFileBox.h"
#include "app/window/log/LogFilterBar.h"
#include "app/window/log/LogFindBar.h"
#include "app/window/log/LogGoTo.h"
#include "app/window/log/LogMarkStore.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogOverview.h"
#include "app/window/log/LogStateText.h"
#include "app/window/log/LogTableMenu.h"
#include "app/window/log/LogView.h"
#include "app/window/log/PatternDialog.h"
#include "app/window/log/ProgramsButton.h"
#include "app/window/log/RunningLogParser.h"
#include "app/window/log/WheelZoom.h"
#include "app/window/widgets/NoticeBar.h"
#include "app/window/widgets/PlainText.h"

#include <QFileDialog>
#include <QFileInfo>
#include <QHBoxLayout>
#include <QKeyEvent>
#include <QLabel>
#include <QSplitter>

#include <algorithm>

namespace Velocor {

LogPanel::LogPanel(QWidget* parent)
    : QWidget(parent), m_model(new LogModel(this)), m_view(new LogView(m_model)),
      m_numbers(new LineNumberMargin(m_view)), m_activity(new ActivityStrip(m_model, m_view)),
      m_overview(new LogOverview(m_model, m_view)), m_files(new LogFileBox),
      m_programs(new ProgramsButton), m_filterBar(new LogFilterBar), m_findBar(new LogFindBar),
      m_line(new CurrentLine), m_splitter(new QSplitter(Qt::Vertical)),
      m_find(new FindControl(m_model, m_view, m_findBar, this)),
      m_marks(new MarkControl(m_model, m_view, this)),
      m_copier(new LineCopier(m_model, m_view, this)), m_goTo(new LogGoTo(m_model, this))
{
    makeLayout();
    connectParts();
    connectView();
    connectModel();
}

// Not a focus proxy: coming from the widget before this one, Tab would skip all up to the table.
void LogPanel::focusInEvent(QFocusEvent*)
{
    m_view->setFocus();
}

QWidget* LogPanel::makeTable()
{
    // A log reads from left to right in any language.
    auto* rows = new QWidget;
    rows->setLayoutDirection(Qt::LeftToRight);
    auto* row = new QHBoxLayout(rows);
    row->setContentsMargins(0, 0, 0, 0);
    row->setSpacing(0);
    row->addWidget(m_view, 1);
    row->addWidget(m_overview);

    auto* table = new QWidget;
    auto* layout = new QVBoxLayout(table);
    layout->setContentsMargins(0, 0, 0, 2);
    layout->setSpacing(6);
    layout->addWidget(rows, 1);
    layout->addWidget(m_findBar);
    return table;
}

void LogPanel::makeLayout()
{
    QLabel* label = NewPlainLabel(tr("&File:"));
    label->setBuddy(m_files);
    auto* top = new QHBoxLayout;
    top->setSpacing(8);
    top->addWidget(label);
    top->addWidget(m_files, 1);
    top->addWidget(m_programs);
    m_programs->hide();

    m_splitter->setAccessibleName(tr("Log entries and current line"));
    m_splitter->setChildrenCollapsible(false);
    m_splitter->addWidget(makeTable());
    m_splitter->addWidget(m_line);
    m_splitter->setStretchFactor(0, 1);
    m_splitter->setSizes({400, m_line->UsualHeight()});

    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(8, 8, 8, 8);
    layout->setSpacing(6);
    layout->addLayout(top);
    layout->addWidget(m_filterBar);
    layout->addWidget(m_activity);
    layout->addWidget(m_splitter, 1);
}

void LogPanel::connectParts()
{
    connect(m_files, &LogFileBox::fileChosen, this,
            [this](QString const& file) { showFile(file, false); });
    connect(m_files, &LogFileBox::allChosen, this, [this] { SetAllFiles(true); });
    connect(m_files, &LogFileBox::familyChosen, this, [this] { SetFamily(true); });
    connect(m_programs, &ProgramsButton::hiddenChanged, this,
            [this] { m_model->SetHiddenLogs(m_programs->hidden()); });
    connect(m_programs, &ProgramsButton::addRequested, this, &LogPanel::askForLogs);
    connect(m_filterBar, &LogFilterBar::filterChanged, this, [this] {
        m_model->SetFilter(m_filterBar->filter());
        m_view->UpdateMarks();
    });
    connect(m_line, &CurrentLine::filterRequested, this,
            [this](QString const& text) { m_filterBar->FilterBy(text); });
    connect(m_line, &CurrentLine::hideRequested, this,
            [this](QString const& text) { m_filterBar->Hide(text); });
    connect(m_line, &CurrentLine::highlightRequested, this, &LogPanel::highlight);
    connect(m_find, &FindControl::messageReported, this, &LogPanel::messageReported);
    connect(m_copier, &LineCopier::messageReported, this, &LogPanel::messageReported);
    connect(m_marks, &MarkControl::messageReported, this, &LogPanel::messageReported);
    connect(m_marks, &MarkControl::changed, this,
            [this] { m_overview->SetMarked(m_marks->rows()); });
    connect(m_find, &FindControl::foundChanged, this,
            [this] { m_overview->SetFound(m_find->hits()); });
    // Not the line, in which the user may have selected something.
    connect(m_marks, &MarkControl::changed, this, [this] { m_line->SetNote(m_marks->note()); });
    connect(m_goTo, &LogGoTo::arrived, this, [this](int row, QString const& message) {
        if (row >= 0)
            m_view->GoToRow(row);
        if (!message.isEmpty())
            Q_EMIT messageReported(message);
    });
    connect(m_activity, &ActivityStrip::messageReported, this, &LogPanel::messageReported);
    connect(m_activity, &ActivityStrip::spanChosen, this,
            [this](LogSpan const& span) { m_filterBar->SetSpan(span); });
    connect(m_goTo, &LogGoTo::started, this, &LogPanel::messageReported);
}

void LogPanel::connectView()
{
    auto* zoom = new WheelZoom(this);
    zoom->Watch(m_view->viewport());
    zoom->Watch(m_numbers);
    zoom->Watch(m_line->viewport());
    connect(zoom, &WheelZoom::zoomRequested, this, &LogPanel::zoomRequested);
    connect(m_view, &LogView::menuRequested, this, &LogPanel::showMenu);
    connect(m_view, &LogView::followingChanged, this, &LogPanel::stateChanged);
    connect(m_view->selectionModel(), &QItemSelectionModel::currentRowChanged, this,
            &LogPanel::showCurrentLine);
}

void LogPanel::connectModel()
{
    connect(m_model, &LogModel::refreshed, this, [this] {
        m_filterBar->ShowSlowLine(m_model->state().slowLine);
        m_filterBar->ShowCounts(m_model->state().counts);
        updatePlaceholder();
        showContent();
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
    m_files->Open(path);
    showFile(path, false);
}

void LogPanel::showFile(QString const& path, bool isAll, bool isFamily)
{
    m_files->SetShown(path, isAll, isFamily);
    m_programs->setVisible(isFamily);
    const LogEncoding kept = m_store ? m_store->Encoding(path) : LogEncoding::Automatic;
    if (kept != LogEncoding::Automatic)
        m_model->SetEncoding(kept);
    if (isFamily) {
        const QList<ProgramLog> logs = familyLogs();
        m_programs->SetLogs(logs);
        m_model->OpenFamily(path, logs, RunningLogParser(), m_programs->hidden());
    } else {
        m_model->Open(path, RunningLogParser(), path == m_currentPath, isAll);
    }
    m_marks->Load();
    updatePlaceholder();
    Q_EMIT stateChanged();
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
    const QString problem = m_store ? m_store->SetEncoding(path(), encoding) : QString();
    if (!problem.isEmpty())
        Q_EMIT messageReported(problem);
}

void LogPanel::SetMarkStore(LogMarkStore* store)
{
    m_store = store;
    m_marks->SetStore(store);
}

void LogPanel::SetAllFiles(bool shown)
{
    if (shown != showsAllFiles())
        showFile(LogFileList::CurrentOf(path()), shown);
}

bool LogPanel::showsAllFiles() const
{
    return m_model->isAll() && !m_model->isFamily();
}

void LogPanel::SetFamily(bool shown)
{
    if (shown != showsFamily())
        showFile(LogFileList::CurrentOf(path()), shown, shown);
}

bool LogPanel::showsFamily() const
{
    return m_model->isFamily();
}

// Also the log of this tab, wherever it is.
QList<ProgramLog> LogPanel::familyLogs() const
{
    QList<ProgramLog> logs = ProgramLogs::In(ProgramLogs::FamilyFolder());
    const QStringList others = QStringList(LogFileList::CurrentOf(path())) + m_added;
    for (QString const& other : others) {
        const bool isKnown = std::any_of(logs.begin(), logs.end(), [&other](ProgramLog const& log) {
            return QFileInfo(log.path) == QFileInfo(other);
        });
        if (!isKnown)
            logs.append({ProgramLogs::NameOf(other), other});
    }
    return logs;
}

void LogPanel::AddToFamily(QStringList const& paths)
{
    for (QString const& file : paths)
        m_added.append(LogFileList::CurrentOf(QFileInfo(file).absoluteFilePath()));
    m_added.removeDuplicates();
    if (showsFamily())
        showFile(path(), true, true);
}

void LogPanel::askForLogs()
{
    const QStringList paths =
        QFileDialog::getOpenFileNames(this, tr("Add Logs"), QFileInfo(path()).absolutePath());
    if (!paths.isEmpty())
        AddToFamily(paths);
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
    m_line->SetTextFont(font);
    const qreal factor = timeWidth() / before;
    for (int& width : widths)
        width = qRound(width * factor);
    SetColumnWidths(widths);
}

void LogPanel::SetLineWrap(bool wrapped)
{
    m_view->SetLineWrap(wrapped);
}

void LogPanel::SetLineNumbers(bool shown)
{
    m_numbers->SetShown(shown);
}

void LogPanel::SetActivity(bool shown)
{
    m_activity->SetShown(shown);
}

void LogPanel::SetSince(bool shown)
{
    m_view->SetSince(shown);
}

void LogPanel::SetLeastGap(qint64 span)
{
    m_view->SetLeastGap(span);
}

void LogPanel::SetFoldsRepeats(bool folds)
{
    m_model->SetFoldsRepeats(folds);
}

void LogPanel::measure(bool isFromCurrent)
{
    if (m_view->MeasureFrom(isFromCurrent ? m_view->CurrentRow() : -1))
        Q_EMIT sinceRequested();
    else
        Q_EMIT messageReported(tr("This line has no time"));
}

void LogPanel::AddBar(QWidget* bar)
{
    auto* all = static_cast<QVBoxLayout*>(layout());
    all->insertWidget(all->indexOf(m_splitter), bar);
}

QList<QWidget*> LogPanel::Panes() const
{
    return {m_filterBar, m_activity, m_view, m_findBar, m_line};
}

void LogPanel::FocusFilter()
{
    m_filterBar->FocusText();
}

void LogPanel::FocusRequired()
{
    m_filterBar->FocusRequired();
}

void LogPanel::FocusHidden()
{
    m_filterBar->FocusHidden();
}

void LogPanel::ClearFilter()
{
    m_filterBar->Clear();
}

void LogPanel::OpenFind()
{
    m_findBar->Open();
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
    const int current = m_view->CurrentRow();
    GoToDialog dialog(static_cast<qint64>(m_model->state().lines), current >= 0, this);
    if (dialog.exec() != QDialog::Accepted)
        return;
    m_view->setFocus();
    m_goTo->Find(dialog.place(), m_view->CurrentRow());
}

void LogPanel::ShowPatterns()
{
    PatternDialog dialog(*m_model, this);
    dialog.exec();
    if (dialog.answer() == PatternDialog::Filter)
        m_filterBar->FilterByExpression(dialog.expression());
    const int row =
        dialog.answer() == PatternDialog::GoToEntry ? m_model->RowNear(dialog.start()) : -1;
    if (row >= 0)
        m_view->GoToRow(row);
    m_view->setFocus();
}

void LogPanel::SetFilterHistory(std::shared_ptr<QStringList> const& history)
{
    m_filterBar->SetHistory(history);
}

void LogPanel::SetHighlightRules(std::shared_ptr<HighlightRules> const& rules)
{
    m_rules = rules;
    m_view->SetHighlightRules(rules);
}

void LogPanel::highlight(QString const& text)
{
    if (m_rules && !text.isEmpty())
        Q_EMIT messageReported(m_rules->Add(text));
}

void LogPanel::showMenu(QPoint const& position, QModelIndex const& cell)
{
    auto* menu = new LogTableMenu(cell, m_copier, m_filterBar, m_marks, this);
    connect(menu, &LogTableMenu::highlightRequested, this, &LogPanel::highlight);
    connect(menu, &LogTableMenu::measureRequested, this, &LogPanel::measure);
    menu->popup(position);
}

QVector<qint64> LogPanel::LineStarts() const
{
    QVector<qint64> starts;
    starts.reserve(m_model->logRowCount());
    LogRows::Reader reader(*m_model->state().rows);
    for (int row = 0; row < m_model->logRowCount(); ++row) {
        const qint64 start = reader.start(static_cast<size_t>(row));
        if (start >= 0) // not a heading
            starts.append(start);
    }
    return starts;
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
    const QString wrapped =
        step > 0 ? tr("Continued from the top") : tr("Continued from the bottom");
    Q_EMIT messageReported(jump == LogView::Jump::Wrapped ? wrapped : QString());
}

QString LogPanel::path() const
{
    return m_model->path();
}

QString LogPanel::summary() const
{
    const int row = m_view->CurrentRow();
    return LogStateText::Summary(*m_model, m_percent, row, m_view->LineNumber(row));
}

void LogPanel::updatePlaceholder()
{
    const QString placeholder = LogStateText::Placeholder(*m_model, m_percent);
    m_view->SetPlaceholder(placeholder);
    const QString description =
        m_model->rowCount() > 0 ? LogStateText::Summary(*m_model, m_percent, -1, 0) : placeholder;
    if (description != m_view->accessibleDescription())
        m_view->setAccessibleDescription(description);
}

void LogPanel::showContent()
{
    const QString notice = LogStateText::ContentNotice(*m_model);
    if (!m_content && notice.isEmpty())
        return;
    if (!m_content) {
        m_content = new NoticeBar(tr("Kind of file"));
        AddBar(m_content);
    }
    m_content->SetState(notice);
}

void LogPanel::showCurrentLine()
{
    const QModelIndex current = m_view->currentIndex();
    m_line->SetText(current.isValid()
                        ? m_model->EntryText(m_view->CurrentRow(), LogIndex::LineLimit)
                        : QString());
    m_line->SetNote(m_marks->note());
    Q_EMIT stateChanged(); // the number of the line
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
