// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

namespace Velocor {

class FileTabs;
class WindowSettings;

/// The font of all logs: its size, and whether its characters are equally wide.
///
/// Unless it was changed, it follows the desktop's settings.
class TextFont : public QObject
{
    Q_OBJECT

public:
    /// @param tabs  get the font whenever it changes; not owned
    explicit TextFont(FileTabs* tabs);

    /// Restores what Save() stored. A size out of range is limited to the range.
    void Restore(WindowSettings& settings);
    void Save(WindowSettings& settings) const;

    /// Makes the text larger by a number of steps, or smaller if it is negative, down to a minimum
    /// and up to a maximum.
    void Enlarge(int steps);

    /// Goes back to the desktop's text size.
    void ResetSize();

    void SetMonospaced(bool monospaced);
    bool isMonospaced() const { return m_monospaced; }

Q_SIGNALS:
    /// The size that was set, for the status bar.
    void messageReported(QString const& text);

private:
    void setZoom(int zoom);
    void update();

    FileTabs* m_tabs;
    int m_zoom = 0; // steps from the desktop's text size
    bool m_monospaced = false;
};

} // namespace Velocor
