// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/settingsfile/SettingsEdit.h"
#include "app/settingsfile/TypedText.h"

#include <QAbstractItemModel>
#include <QHash>
#include <QPair>

#include <memory>
#include <vector>

namespace Velocor {

/// A settings document as a tree: sections at the top, their keys and values below. GUI thread.
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

    explicit SettingsModel(QObject* parent = nullptr) : QAbstractItemModel(parent) {}

    /// Shows another document.
    void SetDocument(SettingsDocument const& document);
    SettingsDocument const& document() const { return m_document; }

    /// The values to which DefaultOf() refers. Those that differ are bold.
    void SetDefaults(SettingsValues const& defaults);
    bool hasDefaults() const { return !m_defaults.isEmpty(); }

    /// The default of an item, whichever its column; a null text if there is none.
    QString DefaultOf(QModelIndex const& index) const;

    /// Whether an item has a default, and another value.
    bool DiffersFromDefault(QModelIndex const& index) const;

    /// Changes the document, and emits `applied`.
    ///
    /// @return what takes the change back
    SettingsEdit Apply(SettingsEdit const& edit);

    /// The cell of a place; invalid if there is none.
    QModelIndex IndexOf(Place place, Column column = NameColumn) const;

    /// The next item, in whatever section; invalid if there is none.
    ///
    /// @param step  1, or -1 for the previous one
    QModelIndex ItemBeside(Place place, int step) const;

    /// The next cell whose text contains another in any letter case, around the end; of a row, the
    /// first. Invalid if there is none.
    ///
    /// @param from  a place of the document, or the first one if it is invalid
    /// @param step  1, or -1 for the previous one
    /// @param withFrom  whether to look at that place first instead of last
    QModelIndex Find(QString const& text, Place from, int step, bool withFrom) const;

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
    SettingsEdit applyMove(SettingsEdit const& edit);
    SettingsEdit applyText(SettingsEdit const& edit);
    void renumber();
    QString text(QModelIndex const& index) const;
    ValueKind kind(Place place) const;
    QVariant valueData(Place place, int role) const;
    QPair<QString, QString> namesOf(QModelIndex const& index) const;
    QVariant lookOf(QModelIndex const& index, int role) const;
    Place rowBeside(Place place, int step) const;
    QModelIndex matchIn(Place place, QString const& text) const;

    SettingsDocument m_document;
    QHash<QPair<QString, QString>, ValueKind> m_chosenKinds; ///< by section and key
    SettingsValues m_defaults;
    /// The row of each section. Indexes of items refer to that of their section, so they hold
    /// while other sections come, go and move.
    std::vector<std::unique_ptr<int>> m_rows;
};

} // namespace Velocor
