// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QProxyStyle>

namespace Velocor {

/// The desktop's style with controls that everybody can hit, and that have a name: Fusion makes
/// check boxes, menu titles and some buttons a few pixels too low, and Qt's own buttons in fields
/// and tool bars have only an icon.
class ReachableStyle : public QProxyStyle
{
    Q_OBJECT

public:
    /// The least width and height of what can be clicked, in pixels independent of the scale.
    static constexpr int LeastTarget = 24;

    using QProxyStyle::polish;
    void polish(QWidget* widget) override;

    QSize sizeFromContents(ContentsType type, QStyleOption const* option, QSize const& size,
                           QWidget const* widget) const override;

    QRect subElementRect(SubElement element, QStyleOption const* option,
                         QWidget const* widget) const override;
};

} // namespace Velocor
