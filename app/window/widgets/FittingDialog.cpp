// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/widgets/FittingDialog.h"

#include "app/window/widgets/TallArea.h"

#include <QDialogButtonBox>
#include <QGuiApplication>
#include <QLabel>
#include <QScreen>
#include <QStyle>
#include <QVBoxLayout>
#include <QWindow>

#include <algorithm>

namespace Velocor {

namespace {

int LeastHeight(QLayout* layout, int width)
{
    const int least = layout->totalMinimumSize().height();
    return layout->hasHeightForWidth() ? std::max(least, layout->totalHeightForWidth(width))
                                       : least;
}

} // namespace

void FittingDialog::setVisible(bool visible)
{
    if (visible && !isVisible() && layout())
        fit();
    QDialog::setVisible(visible);
}

QSize FittingDialog::Room() const
{
    QWidget const* parent = parentWidget() ? parentWidget()->window() : nullptr;
    QScreen const* screen = parent && parent->windowHandle() ? parent->windowHandle()->screen()
                                                             : QGuiApplication::primaryScreen();
    const int title = style()->pixelMetric(QStyle::PM_TitleBarHeight, nullptr, this);
    return screen ? screen->availableSize() - QSize(0, title)
                  : QSize(QWIDGETSIZE_MAX, QWIDGETSIZE_MAX);
}

void FittingDialog::fit()
{
    const QSize room = Room();
    ensurePolished();
    narrow(room.width());
    const QSize usual = testAttribute(Qt::WA_Resized) ? size() : layout()->totalSizeHint();
    const int least = layout()->totalMinimumSize().width();
    const int width = std::min(room.width(), std::max(usual.width(), least));
    const int height = LeastHeight(layout(), width);
    if (height > room.height())
        makeScroll();
    const QSize fitting(height > room.height() ? room.width() : width,
                        std::min(room.height(), std::max(usual.height(), height)));
    if (fitting != usual)
        resize(fitting);
}

void FittingDialog::narrow(int width)
{
    if (layout()->totalMinimumSize().width() > width) {
        const QList<QLabel*> labels = findChildren<QLabel*>();
        for (QLabel* label : labels)
            label->setWordWrap(true);
        // Qt would do it after this.
        const QList<QLayout*> layouts = findChildren<QLayout*>();
        for (QLayout* inner : layouts)
            inner->invalidate();
    }
    if (layout()->totalMinimumSize().width() > width) {
        const QList<QDialogButtonBox*> boxes = findChildren<QDialogButtonBox*>();
        for (QDialogButtonBox* box : boxes)
            box->setOrientation(Qt::Vertical);
    }
}

// A widget that changes its parent loses the focus.
void FittingDialog::makeScroll()
{
    QWidget* focused = focusWidget();
    QLayout* inner = layout();
    inner->setSizeConstraint(QLayout::SetDefaultConstraint);
    auto* content = new QWidget;
    content->setLayout(inner);
    auto* outer = new QVBoxLayout(this);
    outer->setContentsMargins(0, 0, 0, 0);
    outer->addWidget(new TallArea(content));
    if (focused)
        focused->setFocus();
}

} // namespace Velocor
