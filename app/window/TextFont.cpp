// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/TextFont.h"

#include "app/window/FileTabs.h"
#include "app/window/WindowSettings.h"

#include <QApplication>
#include <QFontDatabase>
#include <QFontInfo>

#include <cmath>

namespace Velocor {

namespace {

constexpr int MaximumZoom = 12; // steps
constexpr qreal ZoomStep = 1.1;

} // namespace

TextFont::TextFont(FileTabs* tabs) : m_tabs(tabs) {}

void TextFont::Restore(WindowSettings& settings)
{
    m_monospaced = settings.Flag(QStringLiteral("monospaced"), false);
    m_zoom = qBound(-MaximumZoom, settings.Text(QStringLiteral("zoom")).toInt(), MaximumZoom);
    update();
}

void TextFont::Save(WindowSettings& settings) const
{
    settings.SetFlag(QStringLiteral("monospaced"), m_monospaced);
    settings.SetText(QStringLiteral("zoom"), QString::number(m_zoom));
}

void TextFont::Enlarge(int steps)
{
    setZoom(m_zoom + steps);
}

void TextFont::ResetSize()
{
    setZoom(0);
}

void TextFont::SetMonospaced(bool monospaced)
{
    m_monospaced = monospaced;
    update();
}

void TextFont::setZoom(int zoom)
{
    m_zoom = qBound(-MaximumZoom, zoom, MaximumZoom);
    update();
    Q_EMIT messageReported(tr("Text size: %1%").arg(qRound(100 * std::pow(ZoomStep, m_zoom))));
}

// The default font, if nothing has been changed, follows the desktop's settings.
void TextFont::update()
{
    if (m_zoom == 0 && !m_monospaced) {
        m_tabs->SetTextFont(QFont());
        return;
    }
    const QFont normal = QApplication::font("QAbstractItemView");
    QFont font = m_monospaced ? QFontDatabase::systemFont(QFontDatabase::FixedFont) : normal;
    font.setPointSizeF(QFontInfo(normal).pointSizeF() * std::pow(ZoomStep, m_zoom));
    m_tabs->SetTextFont(font);
}

} // namespace Velocor
