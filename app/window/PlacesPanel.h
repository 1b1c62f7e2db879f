// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QVector>
#include <QWidget>

class QHBoxLayout;
class QVBoxLayout;

namespace Velocor {

/// Who the program is and where its files lie, each to be opened in the file manager or copied.
class PlacesPanel : public QWidget
{
    Q_OBJECT

public:
    /// @param settingsFile  the window's settings file
    explicit PlacesPanel(QString const& settingsFile, QWidget* parent = nullptr);

    /// Adds the buttons, once; the panel does without them until the window has been painted.
    void AddButtons();

    /// Shows a file's folder or a folder in the system's file manager.
    ///
    /// @return false if there is no such folder or nothing to show it
    static bool OpenPlace(QString const& path);

Q_SIGNALS:
    /// A button could not do its work, or has done it.
    void messageReported(QString const& text);

private:
    void addValue(QString const& caption, QString const& text, bool isPlace);
    void openPlace(QString const& path);
    void copy(QString const& caption, QString const& text);

    struct Row
    {
        QHBoxLayout* layout;
        QString caption;
        QString text;
        bool isPlace;
        QWidget* value;
    };

    QVBoxLayout* m_layout;
    QVector<Row> m_rows;
};

} // namespace Velocor
