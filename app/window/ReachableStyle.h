// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QProxyStyle>

namespace Velocor {

/// The desktop's style with controls that everybody can hit and read, and that have a name: Fusion
/// makes check boxes, menu titles and some buttons a few pixels too low, and the placeholders of
/// fields and selected rows too pale; Qt's own buttons in fields and tool bars have only an icon.
class ReachableStyle : public QProxyStyle
{
    Q_OBJECT

public:
    /// The least width and height of what can be clicked, in pixels independent of the scale.
    static constexpr int LeastTarget = 24;

    using QProxyStyle::polish;
    void polish(QWidget* widget) override;
    void unpolish(QWidget* widget) override;

    /// Changes only colors whose contrast is too low.
    void polish(QPalette& palette) override;

    QSize sizeFromContents(ContentsType type, QStyleOption const* option, QSize const& size,
                           QWidget const* widget) const override;

    /// Fields and check boxes have a frame that can be seen in any colors.
    ///
    /// The part with the keyboard focus has a frame, also where Fusion shows nothing, as on lists,
    /// or tints the text.
    void drawComplexControl(ComplexControl control, QStyleOptionComplex const* option,
                            QPainter* painter, QWidget const* widget) const override;

    void drawPrimitive(PrimitiveElement element, QStyleOption const* option, QPainter* painter,
                       QWidget const* widget) const override;

    void drawControl(ControlElement element, QStyleOption const* option, QPainter* painter,
                     QWidget const* widget) const override;

    /// Icons and check boxes grow with the text beside them.
    int pixelMetric(PixelMetric metric, QStyleOption const* option = nullptr,
                    QWidget const* widget = nullptr) const override;

    int styleHint(StyleHint hint, QStyleOption const* option, QWidget const* widget,
                  QStyleHintReturn* returned) const override;

    QRect subElementRect(SubElement element, QStyleOption const* option,
                         QWidget const* widget) const override;

    bool eventFilter(QObject* watched, QEvent* event) override;
};

} // namespace Velocor
