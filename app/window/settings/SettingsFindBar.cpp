// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsFindBar.h"

#include "app/settingsfile/SettingsFilter.h"
#include "app/window/settings/SettingsModel.h"
#include "app/window/settings/SettingsTree.h"
#include "app/window/widgets/FlowLayout.h"
#include "app/window/widgets/PlainText.h"

#include <QKeyEvent>
#include <QLabel>
#include <QLineEdit>
#include <QToolButton>

#include <algorithm>
#include <iterator>

namespace Velocor {

namespace {

// A section comes before its items.
bool IsBefore(SettingsModel::Match const& match, SettingsModel::Place place)
{
    return match.place.section != place.section ? match.place.section < place.section
                                                : match.place.item < place.item;
}

bool IsAt(SettingsModel::Match const& match, SettingsModel::Place place)
{
    return match.place.section == place.section && match.place.item == place.item;
}

} // namespace

SettingsFindBar::SettingsFindBar(SettingsTree* tree, SettingsModel const* model, QWidget* parent)
    : QWidget(parent), m_tree(tree), m_model(model), m_text(new QLineEdit),
      m_onlyMatches(makeSwitch(tr("&Only Matches"),
                               tr("Show only the sections and keys that match (Alt+O)"))),
      m_onlyChanged(makeSwitch(tr("&Changed"),
                               tr("Show only values that are not yet saved like that (Alt+C)"))),
      m_onlyDiffering(makeSwitch(tr("Not &Default"),
                                 tr("Show only values that differ from their default (Alt+D)"))),
      m_result(NewPlainLabel())
{
    m_text->setPlaceholderText(tr("Find in names and values"));
    m_text->setAccessibleName(tr("Find in names and values"));
    m_text->setClearButtonEnabled(true);
    m_text->setAcceptDrops(false); // leave dropped files to the window
    m_result->setAccessibleName(tr("Result of the search"));
    QToolButton* previous = makeButton(QString(QChar(0x2191)), tr("Find previous"),
                                       tr("Go to the previous match (Shift+F3)"));
    QToolButton* next =
        makeButton(QString(QChar(0x2193)), tr("Find next"), tr("Go to the next match (F3)"));
    QToolButton* close =
        makeButton(QString(QChar(0xd7)), tr("Close the find bar"), tr("Close (Esc)"));
    connect(previous, &QToolButton::clicked, this, [this] { FindNext(-1); });
    connect(next, &QToolButton::clicked, this, [this] { FindNext(1); });
    connect(close, &QToolButton::clicked, this, &SettingsFindBar::Close);
    connect(m_text, &QLineEdit::textChanged, this, &SettingsFindBar::search);
    m_soon.setSingleShot(true);
    m_soon.setInterval(0); // one command may change many values
    connect(&m_soon, &QTimer::timeout, this, &SettingsFindBar::showResult);
    connect(m_model, &SettingsModel::applied, this, &SettingsFindBar::noteChange);
    connect(m_model, &SettingsModel::modelReset, this, &SettingsFindBar::noteChange);
    connect(m_tree->selectionModel(), &QItemSelectionModel::currentChanged, &m_soon,
            QOverload<>::of(&QTimer::start));

    auto* layout = new FlowLayout(6, this);
    layout->addWidget(m_text);
    layout->addWidget(m_onlyMatches);
    layout->addWidget(m_onlyChanged);
    layout->addWidget(m_onlyDiffering);
    layout->addWidget(m_result);
    layout->addWidget(previous);
    layout->addWidget(next);
    layout->addWidget(close);
    hide();
}

QToolButton* SettingsFindBar::makeButton(QString const& text, QString const& name,
                                         QString const& toolTip)
{
    auto* button = new QToolButton;
    button->setText(text);
    button->setAutoRaise(true);
    button->setAccessibleName(name);
    button->setToolTip(PlainToolTip(toolTip));
    return button;
}

QToolButton* SettingsFindBar::makeSwitch(QString const& text, QString const& toolTip)
{
    QToolButton* button = makeButton(text, QString(text).remove(QLatin1Char('&')), toolTip);
    button->setCheckable(true);
    connect(button, &QToolButton::toggled, this, &SettingsFindBar::search);
    return button;
}

void SettingsFindBar::Open()
{
    const bool wasHidden = isHidden();
    show();
    if (wasHidden)
        Refresh();
    showResult();
    m_text->setFocus();
    m_text->selectAll();
}

void SettingsFindBar::Close()
{
    hide();
    if (!m_model->filter().isEmpty())
        m_tree->SetFilter(SettingsFilter());
    m_tree->setFocus();
}

SettingsFilter SettingsFindBar::filter() const
{
    SettingsFilter filter;
    if (!isHidden()) {
        filter.text = m_onlyMatches->isChecked() ? m_text->text() : QString();
        filter.onlyChanged = m_onlyChanged->isChecked();
        filter.onlyDiffering = m_onlyDiffering->isChecked() && m_onlyDiffering->isEnabled();
    }
    return filter;
}

void SettingsFindBar::Refresh()
{
    m_onlyDiffering->setEnabled(m_model->hasDefaults());
    if (!filter().isEmpty() || !m_model->filter().isEmpty())
        search();
}

// Without a filter, only the current row changes.
void SettingsFindBar::search()
{
    m_isStale = true;
    const SettingsFilter wanted = filter();
    if (wanted.isEmpty() && m_model->filter().isEmpty()) {
        find(1, true);
        return;
    }
    m_tree->SetFilter(wanted);
    find(1, true);
}

void SettingsFindBar::FindNext(int step)
{
    if (m_text->text().isEmpty())
        Open();
    else
        find(step, false);
}

// Around the end, so the only match is found even if it is where one is.
void SettingsFindBar::find(int step, bool fromCurrent)
{
    std::vector<SettingsModel::Match> const& all = matches();
    if (!all.empty()) {
        const SettingsModel::Place place = SettingsModel::PlaceOf(m_tree->currentIndex());
        auto match = std::lower_bound(all.begin(), all.end(), place, IsBefore);
        const bool isCurrent = match != all.end() && IsAt(*match, place);
        if (step < 0 && !(isCurrent && fromCurrent))
            match = std::prev(match == all.begin() ? all.end() : match);
        else if (step > 0 && isCurrent && !fromCurrent)
            ++match;
        if (match == all.end())
            match = all.begin();
        m_tree->GoTo(m_model->IndexOf(match->place, match->column));
    }
    showResult();
}

// None without a text.
std::vector<SettingsModel::Match> const& SettingsFindBar::matches()
{
    if (m_isStale) {
        const QString text = m_text->text();
        m_matches = text.isEmpty() ? std::vector<SettingsModel::Match>() : m_model->FindAll(text);
        m_isStale = false;
    }
    return m_matches;
}

void SettingsFindBar::noteChange()
{
    m_isStale = true;
    m_soon.start();
}

void SettingsFindBar::showResult()
{
    if (!isHidden())
        m_result->setText(resultText());
}

// Of a text, its matches; otherwise what the switches show.
QString SettingsFindBar::resultText()
{
    if (m_text->text().isEmpty()) {
        if (m_model->filter().isEmpty())
            return QString();
        return m_model->rowCount() == 0 ? tr("No match")
                                        : tr("%Ln key(s)", nullptr, m_model->shownCount());
    }
    std::vector<SettingsModel::Match> const& all = matches();
    if (all.empty())
        return tr("No match");
    const SettingsModel::Place place = SettingsModel::PlaceOf(m_tree->currentIndex());
    const auto match = std::lower_bound(all.begin(), all.end(), place, IsBefore);
    const auto count = static_cast<int>(all.size());
    if (match == all.end() || !IsAt(*match, place))
        return tr("%Ln match(es)", nullptr, count);
    return tr("%L1 of %L2").arg(match - all.begin() + 1).arg(count);
}

void SettingsFindBar::keyPressEvent(QKeyEvent* event)
{
    const bool isShifted = event->modifiers().testFlag(Qt::ShiftModifier);
    const int key = event->key();
    if (key == Qt::Key_Escape)
        Close();
    else if (key == Qt::Key_Return || key == Qt::Key_Enter || key == Qt::Key_F3)
        FindNext(isShifted ? -1 : 1);
    else if (event->matches(QKeySequence::Find))
        Open();
    else
        QWidget::keyPressEvent(event);
}

} // namespace Velocor
