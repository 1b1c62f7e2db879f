// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/WindowPlaceDialog.h"

#include "app/settingsfile/TypedText.h"
#include "app/window/settings/SizeDialog.h"
#include "app/window/widgets/PlainText.h"
#include "app/window/widgets/TextDialog.h"

#include <QCoreApplication>
#include <QDialogButtonBox>
#include <QFormLayout>
#include <QGuiApplication>
#include <QLabel>
#include <QPainter>
#include <QScreen>
#include <QSpinBox>

#include <algorithm>
#include <limits>

namespace Velocor {

namespace {

constexpr int PictureWidth = 320;  // pixels
constexpr int TitleBarHeight = 30; // of the window in the picture, in pixels of the desktop

} // namespace

/// The desktop with one window on it.
class WindowPicture : public QWidget
{
    Q_DECLARE_TR_FUNCTIONS(Velocor::WindowPicture)

public:
    WindowPicture()
    {
        QRect desktop;
        const QList<QScreen*> screens = QGuiApplication::screens();
        for (QScreen const* screen : screens)
            desktop |= screen->geometry();
        m_desktop = desktop.size();
        setFixedSize(PictureWidth,
                     PictureWidth * m_desktop.height() / std::max(1, m_desktop.width()) + 1);
        setAccessibleName(tr("Picture of the desktop"));
    }

    void ShowWindow(QPoint position, QSize windowSize)
    {
        m_window = QRectF(position, QSizeF(windowSize));
        update();
    }

protected:
    void paintEvent(QPaintEvent*) override
    {
        const qreal scale = qreal(width() - 1) / std::max(1, m_desktop.width());
        QPainter painter(this);
        painter.setPen(palette().color(QPalette::WindowText));
        painter.fillRect(rect(), palette().color(QPalette::Dark));
        painter.drawRect(rect().adjusted(0, 0, -1, -1));
        painter.scale(scale, scale);
        painter.setPen(QPen(palette().color(QPalette::WindowText), 0));
        painter.fillRect(m_window, palette().color(QPalette::Base));
        QRectF bar = m_window;
        bar.setHeight(std::min(bar.height(), qreal(TitleBarHeight)));
        painter.fillRect(bar, palette().color(QPalette::Highlight));
        painter.drawRect(m_window);
    }

private:
    QSize m_desktop;
    QRectF m_window;
};

WindowPlaceDialog::WindowPlaceDialog(QString const& name, QPoint const& position, QSize const& size,
                                     QWidget* parent)
    : FittingDialog(parent),
      m_x(NewPixelField(tr("From the left"), std::numeric_limits<int>::min(), position.x())),
      m_y(NewPixelField(tr("From the top"), std::numeric_limits<int>::min(), position.y())),
      m_width(NewPixelField(tr("Width"), 0, size.width())),
      m_height(NewPixelField(tr("Height"), 0, size.height())), m_picture(new WindowPicture),
      m_place(NewPlainLabel())
{
    setWindowTitle(tr("Edit Window Place"));
    QLabel* heading = NewPlainLabel(name);
    heading->setWordWrap(true);
    m_place->setWordWrap(true);
    m_place->setAccessibleName(tr("Where the window opens"));
    auto* buttons = new QDialogButtonBox(QDialogButtonBox::Ok | QDialogButtonBox::Cancel);
    RemoveButtonIcons(buttons);
    connect(buttons, &QDialogButtonBox::accepted, this, &QDialog::accept);
    connect(buttons, &QDialogButtonBox::rejected, this, &QDialog::reject);
    auto* layout = new QFormLayout(this);
    layout->addRow(heading);
    AddPixelField(layout, tr("From the &left"), m_x);
    AddPixelField(layout, tr("From the &top"), m_y);
    AddPixelField(layout, tr("&Width"), m_width);
    AddPixelField(layout, tr("&Height"), m_height);
    layout->addRow(m_picture);
    layout->addRow(m_place);
    layout->addRow(buttons);
    for (QSpinBox* field : {m_x, m_y, m_width, m_height})
        connect(field, static_cast<void (QSpinBox::*)(int)>(&QSpinBox::valueChanged), this,
                &WindowPlaceDialog::showPlace);
    showPlace();
    m_x->setFocus();
    m_x->selectAll();
}

QPoint WindowPlaceDialog::position() const
{
    return QPoint(m_x->value(), m_y->value());
}

QSize WindowPlaceDialog::size() const
{
    return QSize(m_width->value(), m_height->value());
}

void WindowPlaceDialog::showPlace()
{
    QPoint fitted;
    QSize fittedSize;
    TypedText::ToWindowPlace(TypedText::FromWindowPlace(position(), size()), fitted, fittedSize);
    m_picture->ShowWindow(fitted, fittedSize);
    m_place->setText(tr("On this desktop, the window opens at %1, %2 with %3 by %4 pixels")
                         .arg(fitted.x())
                         .arg(fitted.y())
                         .arg(fittedSize.width())
                         .arg(fittedSize.height()));
}

} // namespace Velocor
