// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QString>
#include <QWidget>

#include <functional>

class QLayout;
class QScrollArea;
class QVBoxLayout;

namespace Velocor {

/// Program identity and file locations, with buttons to copy them or open the file manager.
class PlacesPanel : public QWidget
{
    Q_OBJECT

public:
    /// @param settingsFile  the window's settings file
    explicit PlacesPanel(QString const& settingsFile, QWidget* parent = nullptr);

    /// Shows a folder, or the folder of a file, in the system's file manager.
    ///
    /// @return false if the folder does not exist or there is no file manager
    static bool OpenPlace(QString const& path);

    QSize minimumSizeHint() const override;

Q_SIGNALS:
    /// The result of a button click, for the status bar.
    void messageReported(QString const& text);

private:
    void addValue(QString const& caption, QString const& text, bool isPlace);
    void addButton(QString const& text, QString const& name, QString const& toolTip, QLayout* row,
                   std::function<void()> const& work);
    void openPlace(QString const& path);
    void copy(QString const& caption, QString const& text);

    QVBoxLayout* m_layout;
    QScrollArea* m_scroller;
};

} // namespace Velocor
