// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QScrollBar>

#include <functional>
#include <memory>
#include <vector>

namespace Velocor {

/// A vertical scroll bar with ticks where certain rows are.
class TickScrollBar : public QScrollBar
{
    Q_OBJECT

public:
    enum Kind { Found, Marked, KindCount };

    explicit TickScrollBar(QWidget* parent = nullptr);

    /// The color of a kind of ticks, readable on the palette's background.
    static QColor Color(Kind kind, QPalette const& palette);

    /// Sets the rows of one kind.
    ///
    /// @param rows  ascending
    void SetTicks(Kind kind, std::shared_ptr<std::vector<int> const> const& rows);

    /// Sets the number of rows that the whole bar stands for.
    void SetRowCount(int count);

    /// Does what changes range and value, and paints only if both together look different.
    void UpdateOnceAfter(std::function<void()> const& change);

protected:
    void paintEvent(QPaintEvent* event) override;
    void sliderChange(SliderChange change) override;

private:
    // What is painted, apart from the ticks.
    struct Look
    {
        QRect slider;
        bool isAtStart = false;
        bool isAtEnd = false;

        bool operator==(Look const& other) const
        {
            return slider == other.slider && isAtStart == other.isAtStart &&
                   isAtEnd == other.isAtEnd;
        }
    };
    Look currentLook() const;

    std::shared_ptr<std::vector<int> const> m_ticks[KindCount];
    int m_rowCount = 0;
    bool m_isUpdatingLater = false;
    Look m_look;
};

} // namespace Velocor
