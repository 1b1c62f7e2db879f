// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/FindControl.h"

#include "app/window/log/LogFindBar.h"
#include "app/window/log/LogModel.h"
#include "app/window/log/LogSearch.h"
#include "app/window/log/LogView.h"
#include "app/window/widgets/Announcer.h"
#include "app/window/widgets/PlainText.h"

#include <QItemSelectionModel>

namespace Velocor {

namespace {

constexpr int MaximumSaidLength = 200;

} // namespace

FindControl::FindControl(LogModel* model, LogView* view, LogFindBar* bar, QObject* parent)
    : QObject(parent), m_model(model), m_view(view), m_bar(bar),
      m_search(new LogSearch(model, this))
{
    connect(bar, &LogFindBar::textChanged, this, &FindControl::applyText);
    connect(bar, &LogFindBar::stepRequested, this, &FindControl::Next);
    connect(bar, &LogFindBar::closed, view, [view] { view->setFocus(); });
    connect(m_search, &LogSearch::changed, this, &FindControl::showFound);
    connect(view->selectionModel(), &QItemSelectionModel::currentRowChanged, this,
            &FindControl::showFound);
}

void FindControl::applyText()
{
    const LogFilter text = m_bar->text();
    m_wantedStep = 0;
    m_search->SetText(text);
    m_view->SetFound(text);
    showFound();
}

void FindControl::Next(int step)
{
    if (m_bar->isHidden() || !m_bar->hasText()) {
        const bool mayGoOn = m_bar->hasText();
        m_bar->Open();
        if (!mayGoOn)
            return;
    }
    m_bar->Apply();
    m_wantedStep = step;
    goToFound();
    showFound();
}

// Keeps waiting while the next hit is not known yet.
void FindControl::goToFound()
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
        if (m_search->text().hasText() && m_search->slowLine() == 0) {
            Q_EMIT messageReported(tr("Not found"));
            Announcer::Say(m_view, tr("Not found"));
        }
        return;
    }
    m_view->GoToRow(row);
    const QString wrapped =
        step > 0 ? tr("Continued from the top") : tr("Continued from the bottom");
    Q_EMIT messageReported(answer == LogSearch::Answer::Wrapped ? wrapped : QString());
    if (!m_view->hasFocus()) // then, it is said as the current row
        Announcer::Say(m_view, Shortened(m_model->MessageText(row), MaximumSaidLength));
}

void FindControl::showFound()
{
    goToFound();
    m_bar->ShowSlowLine(m_search->slowLine());
    m_bar->ShowCount(countText());
    Q_EMIT foundChanged();
}

std::shared_ptr<std::vector<int> const> const& FindControl::hits() const
{
    return m_search->hits();
}

QString FindControl::countText() const
{
    const auto count = static_cast<int>(m_search->hits()->size());
    const int number = m_search->NumberOf(m_view->CurrentRow());
    if (!m_search->text().hasText() || m_search->slowLine() > 0)
        return QString();
    if (!m_search->isComplete() && m_search->percent() < 99)
        return tr("Searching: %1%").arg(m_search->percent());
    if (count == 0)
        return m_search->isComplete() ? tr("Not found") : QString();
    if (number > 0)
        return tr("%L1 of %L2").arg(number).arg(count);
    return tr("%Ln line(s)", nullptr, count);
}

} // namespace Velocor
