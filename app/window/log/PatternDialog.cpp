// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/PatternDialog.h"

#include "app/window/log/LogModel.h"
#include "app/window/log/PatternModel.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QDialogButtonBox>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QTreeView>
#include <QVBoxLayout>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int LongestFilteredPattern = 500; // characters
constexpr int LeastLines = 6;               // in view, with the titles and the scroll bar
constexpr int WidestPatternColumn = 220;    // pixels, but for the pattern itself

} // namespace

PatternDialog::PatternDialog(LogModel const& model, QWidget* parent)
    : FittingDialog(parent), m_patterns(new PatternModel(this)), m_list(new QTreeView),
      m_state(NewPlainLabel()), m_isOwn(!model.parser().fileType().isForeign)
{
    setWindowTitle(tr("Message Patterns"));
    setWindowFlags(windowFlags() & ~Qt::WindowContextHelpButtonHint);
    m_state->setAccessibleName(tr("What has been counted"));
    makeList();
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(m_list);
    layout->addWidget(m_state);
    layout->addLayout(makeButtons());
    m_first->setDefault(true); // once it is in the dialog
    resize(760, 420);
    m_list->setFocus();
    startCounter(model);
}

PatternDialog::~PatternDialog()
{
    // The list would still tell that its model and its rows are gone.
    m_list->selectionModel()->disconnect(this);
    m_patterns->disconnect(this);
    m_counter->Stop();
    m_thread.quit();
    m_thread.wait();
}

void PatternDialog::makeList()
{
    m_list->setAccessibleName(tr("Message patterns"));
    m_list->setModel(m_patterns);
    m_list->setLayoutDirection(Qt::LeftToRight);
    KeepLeftToRight(m_list->header());
    m_list->setRootIsDecorated(false);
    m_list->setMinimumHeight(LeastLines * m_list->fontMetrics().lineSpacing());
    m_list->setUniformRowHeights(true);
    m_list->setAlternatingRowColors(true);
    m_list->setAllColumnsShowFocus(true);
    m_list->setSortingEnabled(true);
    m_list->sortByColumn(PatternModel::CountColumn, Qt::DescendingOrder);
    connect(m_list, &QTreeView::doubleClicked, this, [this] { goTo(false); });
    connect(m_list->selectionModel(), &QItemSelectionModel::currentChanged, this,
            &PatternDialog::update);
    connect(m_patterns, &PatternModel::modelReset, this, &PatternDialog::update);
}

QLayout* PatternDialog::makeButtons()
{
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Close);
    m_first = buttons->addButton(tr("Go to &First"), QDialogButtonBox::ActionRole);
    m_last = buttons->addButton(tr("Go to &Last"), QDialogButtonBox::ActionRole);
    m_filter = buttons->addButton(tr("F&ilter"), QDialogButtonBox::ActionRole);
    m_stop = buttons->addButton(tr("&Stop Counting"), QDialogButtonBox::ActionRole);
    RemoveButtonIcons(buttons);
    connect(m_first, &QPushButton::clicked, this, [this] { goTo(false); });
    connect(m_last, &QPushButton::clicked, this, [this] { goTo(true); });
    connect(m_filter, &QPushButton::clicked, this, &PatternDialog::filter);
    connect(m_stop, &QPushButton::clicked, this, [this] {
        m_isStopped = true;
        m_counter->Stop();
    });
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* layout = new QVBoxLayout;
    layout->addWidget(buttons);
    return layout;
}

void PatternDialog::startCounter(LogModel const& model)
{
    m_rows = model.state().rows->size();
    m_counter = new PatternCounter(model.source(), model.parser(), model.state().rows);
    m_counter->moveToThread(&m_thread);
    connect(&m_thread, &QThread::started, m_counter, &PatternCounter::Count);
    connect(&m_thread, &QThread::finished, m_counter, &QObject::deleteLater);
    connect(m_counter, &PatternCounter::counted, this, &PatternDialog::take);
    m_state->setText(tr("Counting\u2026"));
    update();
    m_thread.start();
}

void PatternDialog::take(std::shared_ptr<CountedPatterns const> const& counted)
{
    const bool isFirst = m_patterns->rowCount() == 0;
    const int current = m_list->currentIndex().row();
    const PatternList::Pattern chosen =
        current >= 0 ? m_patterns->pattern(current) : PatternList::Pattern();
    m_patterns->SetCounted(counted);
    if (m_patterns->rowCount() > 0)
        select(current >= 0 ? std::max(0, m_patterns->RowOf(chosen)) : 0);
    if (isFirst || counted->isComplete)
        setWidths();
    m_state->setText(stateText(*counted));
    m_stop->setEnabled(!counted->isComplete && !m_isStopped);
}

QString PatternDialog::stateText(CountedPatterns const& counted) const
{
    const QString found = tr("%L1 patterns in %L2 entries")
                              .arg(static_cast<qulonglong>(counted.patterns.size()))
                              .arg(static_cast<qulonglong>(counted.entries));
    if (counted.isComplete)
        return found;
    const auto percent = static_cast<int>(counted.rows * 100 / std::max<size_t>(m_rows, 1));
    return m_isStopped ? tr("%1; stopped at %2%").arg(found).arg(percent)
                       : tr("%1; counting, %2%").arg(found).arg(percent);
}

void PatternDialog::select(int row)
{
    m_list->setCurrentIndex(m_patterns->index(row, 0));
}

// As wide as the rows in view need.
void PatternDialog::setWidths()
{
    for (int column = 0; column < PatternModel::PatternColumn; ++column) {
        m_list->resizeColumnToContents(column);
        m_list->setColumnWidth(column, std::min(m_list->columnWidth(column), WidestPatternColumn));
    }
}

void PatternDialog::update()
{
    const int row = m_list->currentIndex().row();
    m_first->setEnabled(row >= 0);
    m_last->setEnabled(row >= 0);
    m_filter->setEnabled(row >= 0 && !PatternList::IsRest(m_patterns->pattern(row)));
}

void PatternDialog::goTo(bool isLast)
{
    const int row = m_list->currentIndex().row();
    if (row < 0)
        return;
    PatternList::Pattern const& pattern = m_patterns->pattern(row);
    m_start = isLast ? pattern.lastPlace : pattern.firstPlace;
    m_answer = GoToEntry;
    accept();
}

// The message of an entry of the log's own ends its line.
void PatternDialog::filter()
{
    QString const& text = m_patterns->pattern(m_list->currentIndex().row()).text;
    m_expression = MessagePattern::Expression(text.left(LongestFilteredPattern));
    if (m_isOwn && text.size() <= LongestFilteredPattern)
        m_expression += QLatin1Char('$');
    m_answer = Filter;
    accept();
}

} // namespace Velocor
