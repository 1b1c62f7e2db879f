// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsEdit.h"
#include "app/settingsfile/SettingsFilter.h"
#include "app/settingsfile/TypedText.h"
#include "app/window/settings/SettingsRows.h"

#include <QAbstractItemModel>
#include <QHash>
#include <QPair>

#include <memory>
#include <vector>

namespace Velocor {

/// A settings document as a tree: sections at the top, their keys and values below, those that a
/// filter shows. What an edit changes stays shown until the filter is set again. GUI thread.
///
/// Cells show the start of a long text and its size; Qt::EditRole has all of it. The model only
/// changes by Apply() and SetDocument(): SettingsCommands decides what may be changed.
class SettingsModel : public QAbstractItemModel
{
    Q_OBJECT

public:
    enum Column { NameColumn, ValueColumn, ColumnCount };
    enum Role { KindRole = Qt::UserRole };

    /// The number of characters up to which a cell shows a text in full and may be edited in place.
    /// Qt lays out the whole text each time the cell is drawn.
    static constexpr int MaximumCellLength = 1000;

    /// Where an index is in the document.
    struct Place
    {
        int section = -1;
        int item = -1; ///< -1 for the section itself
    };

    /// A cell whose text contains another.
    struct Match
    {
        Place place;
        Column column = NameColumn;
    };

    explicit SettingsModel(QObject* parent = nullptr) : QAbstractItemModel(parent) {}

    /// Shows another document, filtered as before.
    void SetDocument(SettingsDocument const& document);
    SettingsDocument const& document() const { return m_document; }

    /// The values to which DefaultOf() refers. Those that differ are bold.
    void SetDefaults(SettingsValues const& defaults);
    bool hasDefaults() const { return !m_defaults.isEmpty(); }

    /// The default of an item; a null text if there is none.
    QString DefaultOf(Place place) const;

    /// Whether an item has a default, and another value.
    bool DiffersFromDefault(Place place) const;

    /// What is in the file, for a filter that is set later.
    void SetSaved(SettingsDocument const& saved) { m_saved = saved; }

    /// Shows only some of the keys, from now on. Emits `modelReset` if these are others than
    /// before.
    ///
    /// @return whether they are
    bool SetFilter(SettingsFilter const& filter);
    SettingsFilter const& filter() const { return m_filter; }

    /// The number of keys that are shown.
    int shownCount() const;

    /// Changes the document, and emits `applied`. What is changed is shown.
    ///
    /// @return what takes the change back
    SettingsEdit Apply(SettingsEdit const& edit);

    /// Whether a section has items that are not shown.
    bool HidesItemsOf(int section) const;

    /// The items of a section that are shown, in their order.
    QVector<Place> ShownItemsOf(int section) const;

    /// The cell of a place; invalid if there is none, or it is not shown.
    QModelIndex IndexOf(Place place, Column column = NameColumn) const;

    /// The next item that is shown, in whatever section; invalid if there is none.
    ///
    /// @param step  1, or -1 for the previous one
    QModelIndex ItemBeside(QModelIndex const& index, int step) const;

    /// The cells that are shown and whose text contains another in any letter case, in the order of
    /// the tree; of a row, only the first.
    std::vector<Match> FindAll(QString const& text) const;

    /// Makes the value of a row count as one of a kind, until another document is shown. The
    /// choice is that of its section and key, whatever the value becomes.
    void ChooseKind(QModelIndex const& index, ValueKind kind);

    /// Takes such a choice back: the kind is guessed from the value, as at first.
    void GuessKind(QModelIndex const& index);

    /// Whether the kind of a row's value was chosen.
    bool HasChosenKind(QModelIndex const& index) const;

    /// The kind of the value of a row; of a section, text.
    static ValueKind KindOf(QModelIndex const& index);

    /// Whether the value of a row is edited in a dialog, because of its kind, its length or its
    /// line breaks.
    static bool HasDialog(QModelIndex const& index);

    static Place PlaceOf(QModelIndex const& index);
    static bool IsSection(QModelIndex const& index);

    /// The text of a cell, however long.
    static QString FullText(QModelIndex const& index);

    /// Whether the cell shows only the start of its text.
    static bool IsLong(QModelIndex const& index);

    QModelIndex index(int row, int column,
                      QModelIndex const& parent = QModelIndex()) const override;
    QModelIndex parent(QModelIndex const& index) const override;
    int rowCount(QModelIndex const& parent = QModelIndex()) const override;
    int columnCount(QModelIndex const& parent = QModelIndex()) const override;
    QVariant data(QModelIndex const& index, int role = Qt::DisplayRole) const override;
    QVariant headerData(int section, Qt::Orientation orientation,
                        int role = Qt::DisplayRole) const override;
    Qt::ItemFlags flags(QModelIndex const& index) const override;

Q_SIGNALS:
    /// What an edit has changed; of a removal, what is there now.
    void applied(QModelIndex const& index);

private:
    /// A section of the document, and which of its items are shown. Indexes of items refer to it,
    /// so they hold while other sections come, go and move.
    struct SectionRows
    {
        int section = 0;
        SettingsRows items;
    };

    SettingsEdit applyInsertion(SettingsEdit const& edit);
    SettingsEdit applyRemoval(SettingsEdit const& edit);
    SettingsEdit applyMove(SettingsEdit const& edit);
    SettingsEdit applyText(SettingsEdit const& edit);
    void show(Place place);
    SettingsFilter::Shown shownRows() const;
    bool hasRows(SettingsFilter::Shown const& shown) const;
    void setRows(SettingsFilter::Shown shown);
    void renumber();
    SettingsRows& shownBeside(SettingsEdit const& edit);
    int itemCount(int sectionRow) const;
    QString text(QModelIndex const& index) const;
    ValueKind kind(Place place) const;
    QVariant valueData(Place place, int role) const;
    QPair<QString, QString> namesOf(QModelIndex const& index) const;
    QVariant lookOf(QModelIndex const& index, int role) const;

    SettingsDocument m_document;
    QHash<QPair<QString, QString>, ValueKind> m_chosenKinds; ///< by section and key
    SettingsValues m_defaults;
    SettingsDocument m_saved;
    SettingsFilter m_filter;
    SettingsRows m_shownSections;
    std::vector<std::unique_ptr<SectionRows>> m_rows; ///< of each section
};

} // namespace Velocor
