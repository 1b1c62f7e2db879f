// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SavedStatesDialog.h"

#include "app/settingsfile/SettingsDifference.h"
#include "app/settingsfile/SettingsFileReader.h"
#include "app/window/widgets/FileSizeText.h"
#include "app/window/widgets/PlainText.h"

#include <QFileInfo>
#include <QHBoxLayout>
#include <QHeaderView>
#include <QLabel>
#include <QPushButton>
#include <QTreeWidget>

namespace Velocor {

namespace {

enum Column { TimeColumn, SizeColumn, ChangeColumn };

constexpr int MaximumNamedRows = 4;
constexpr int MaximumRowName = 60; // characters

// What changed from one state to the next.
QString ChangeText(SettingsDocument const& before, SettingsDocument const& after)
{
    if (!after.isParsed)
        return SavedStatesDialog::tr("Damaged: %1").arg(after.error);
    if (!before.isParsed)
        return SavedStatesDialog::tr("Mended");
    const SettingsDifference difference = SettingsDifference::Between(before, after);
    QStringList names;
    for (SettingsDifference::Row const& row : difference.rows) {
        if (!row.isSame())
            names.append(
                Shortened(row.isSection() ? row.section : row.section + QLatin1Char('/') + row.key,
                          MaximumRowName));
    }
    if (names.isEmpty())
        return SavedStatesDialog::tr("Only text that is no value");
    const int more = names.size() - MaximumNamedRows;
    QString text = QStringList(names.mid(0, MaximumNamedRows)).join(QLatin1String(", "));
    if (more > 0)
        text += SavedStatesDialog::tr(" and %1 more").arg(more);
    return text;
}

} // namespace

SavedStatesDialog::SavedStatesDialog(SavedStates const& states, QString const& path,
                                     bool canCompare, QWidget* parent)
    : FittingDialog(parent), m_states(states), m_path(path), m_canCompare(canCompare),
      m_heading(NewPlainLabel()), m_list(new QTreeWidget),
      m_compare(makeButton(tr("&Compare..."), tr("Show what differs from the editor"),
                           &SavedStatesDialog::compare)),
      m_bringBack(makeButton(tr("&Bring Back"), tr("Show this state in the editor; can be undone"),
                             &SavedStatesDialog::bringBack)),
      m_removeAll(makeButton(tr("&Remove All..."), tr("Remove all saved states of this file"),
                             &SavedStatesDialog::removeAll))
{
    setWindowTitle(tr("Saved States of %1").arg(QFileInfo(path).fileName()));
    m_heading->setWordWrap(true);
    m_heading->setAccessibleName(tr("Summary"));
    m_list->setAccessibleName(tr("Saved states"));
    m_list->header()->setAccessibleName(tr("Columns of the saved states"));
    m_list->setHeaderLabels({tr("Time"), tr("Size"), tr("What changed")});
    m_list->setRootIsDecorated(false);
    m_list->setUniformRowHeights(true);
    m_list->setAllColumnsShowFocus(true);
    connect(m_list, &QTreeWidget::currentItemChanged, this, &SavedStatesDialog::updateButtons);
    auto* close = new QPushButton(tr("C&lose"));
    close->setDefault(true);
    connect(close, &QPushButton::clicked, this, &QDialog::reject);
    auto* buttons = new QHBoxLayout;
    buttons->addWidget(m_compare);
    buttons->addWidget(m_bringBack);
    buttons->addWidget(m_removeAll);
    buttons->addStretch(1);
    buttons->addWidget(close);
    auto* layout = new QVBoxLayout(this);
    layout->addWidget(m_heading);
    layout->addWidget(m_list, 1);
    layout->addLayout(buttons);
    resize(720, 360);
    fill();
    m_list->setFocus();
}

QPushButton* SavedStatesDialog::makeButton(QString const& text, QString const& toolTip,
                                           void (SavedStatesDialog::*work)())
{
    auto* button = new QPushButton(text);
    button->setAutoDefault(false);
    button->setToolTip(PlainToolTip(toolTip));
    connect(button, &QPushButton::clicked, this, work);
    return button;
}

void SavedStatesDialog::fill()
{
    m_list->clear();
    const QVector<SavedStates::State> states = m_states.Of(m_path);
    m_heading->setText(
        states.isEmpty()
            ? tr("No state is kept yet: the last %1 are kept when the file is saved "
                 "here.")
                  .arg(SavedStates::MaximumOfFile)
            : tr("The last %1 states of the file, newest first.").arg(SavedStates::MaximumOfFile));
    SettingsDocument document =
        states.isEmpty() ? SettingsDocument() : SettingsFileReader::ReadShown(states.first().path);
    for (int i = 0; i < states.size(); ++i) {
        SavedStates::State const& state = states.at(i);
        const bool isOldest = i + 1 == states.size();
        const SettingsDocument before =
            isOldest ? SettingsDocument() : SettingsFileReader::ReadShown(states.at(i + 1).path);
        auto* item = new QTreeWidgetItem(m_list);
        item->setText(TimeColumn,
                      LeftToRight(state.time.toString(QStringLiteral("yyyy-MM-dd HH:mm:ss"))));
        item->setText(SizeColumn, FileSizeText(state.size));
        item->setText(ChangeColumn, isOldest && document.isParsed ? tr("Oldest one kept")
                                                                  : ChangeText(before, document));
        item->setData(TimeColumn, Qt::UserRole, state.path);
        document = before;
    }
    m_list->resizeColumnToContents(TimeColumn);
    m_list->resizeColumnToContents(SizeColumn);
    m_list->setCurrentItem(m_list->topLevelItem(0));
    updateButtons();
}

void SavedStatesDialog::updateButtons()
{
    const bool hasState = m_list->currentItem() != nullptr;
    m_compare->setEnabled(hasState && m_canCompare);
    m_bringBack->setEnabled(hasState);
    m_removeAll->setEnabled(hasState);
}

void SavedStatesDialog::compare()
{
    QTreeWidgetItem const* item = m_list->currentItem();
    Q_EMIT compareRequested(item->data(TimeColumn, Qt::UserRole).toString(),
                            item->text(TimeColumn));
}

void SavedStatesDialog::bringBack()
{
    QTreeWidgetItem const* item = m_list->currentItem();
    const QString path = item->data(TimeColumn, Qt::UserRole).toString();
    const QString title = item->text(TimeColumn);
    accept();
    Q_EMIT bringBackRequested(path, title);
}

// Cannot be undone, so it asks.
void SavedStatesDialog::removeAll()
{
    PlainMessageBox box(QMessageBox::Warning, this,
                        tr("Remove all saved states of %1?").arg(QFileInfo(m_path).fileName()),
                        QMessageBox::Cancel, tr("The file itself and its .bak stay as they are."));
    QPushButton const* yes = box.addButton(tr("Remove All"), QMessageBox::AcceptRole);
    box.setDefaultButton(QMessageBox::Cancel);
    box.exec();
    if (box.clickedButton() != yes)
        return;
    if (!m_states.RemoveAll(m_path))
        PlainMessageBox(QMessageBox::Critical, this, tr("Not all could be removed.")).exec();
    fill();
}

} // namespace Velocor
