// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QScrollBar>

#include <functional>

namespace Velocor {

/// A vertical scroll bar that paints only when it looks different: in a large log that is followed,
/// most new lines move its slider by less than a pixel.
class SteadyScrollBar : public QScrollBar
{
    Q_OBJECT

public:
    explicit SteadyScrollBar(QWidget* parent = nullptr);

    /// Does what changes range and value, and paints only if both together look different.
    void UpdateOnceAfter(std::function<void()> const& change);

protected:
    void sliderChange(SliderChange change) override;

private:
    // What is painted.
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

    bool m_isUpdatingLater = false;
    Look m_look;
};

} // namespace Velocor
