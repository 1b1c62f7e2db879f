// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QVector>
#include <QWidget>

class QHBoxLayout;
class QVBoxLayout;

namespace Velocor {

/// Program identity and file locations, with buttons to copy them or open the file manager.
class PlacesPanel : public QWidget
{
    Q_OBJECT

public:
    /// @param settingsFile  the window's settings file
    explicit PlacesPanel(QString const& settingsFile, QWidget* parent = nullptr);

    /// Adds the buttons. Call once; separate from construction, so that the first paint is quick.
    void AddButtons();

    /// Shows a folder, or the folder of a file, in the system's file manager.
    ///
    /// @return false if the folder does not exist or there is no file manager
    static bool OpenPlace(QString const& path);

Q_SIGNALS:
    /// The result of a button click, for the status bar.
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
