// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/PlacesPanel.h"

#include "app/runninglog/RunningLog.h"
#include "app/window/ApplicationProperty.h"
#include "app/window/widgets/ElidedLabel.h"
#include "app/window/widgets/PlainText.h"

#include <QClipboard>
#include <QCoreApplication>
#include <QDesktopServices>
#include <QFileInfo>
#include <QGuiApplication>
#include <QHBoxLayout>
#include <QLabel>
#include <QScrollArea>
#include <QScrollBar>
#include <QToolButton>
#include <QUrl>
#include <QVBoxLayout>

#include <algorithm>

namespace Velocor {

namespace {

constexpr int LeastWidth = 200; // pixels

} // namespace

PlacesPanel::PlacesPanel(QString const& settingsFile, QWidget* parent)
    : QWidget(parent), m_scroller(new QScrollArea)
{
    auto* content = new QWidget;
    m_layout = new QVBoxLayout(content);
    m_layout->setContentsMargins(12, 10, 12, 10);
    m_layout->setSpacing(2);
    addValue(tr("Organization"), QCoreApplication::organizationName(), false);
    addValue(tr("Product"), QCoreApplication::applicationName(), false);
    addValue(tr("Installation"), ApplicationProperty("RootPath"), true);
    addValue(tr("Data"), ApplicationProperty("DataPath"), true);
    addValue(tr("Documents"), ApplicationProperty("DocPath"), true);
    addValue(tr("Log file"), RunningLog::FileName(), true);
    addValue(tr("Settings file"), settingsFile, true);
    m_layout->addStretch(1);

    m_scroller->setAccessibleName(tr("Identity and places"));
    m_scroller->setFrameShape(QFrame::NoFrame);
    m_scroller->setWidgetResizable(true);
    m_scroller->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    m_scroller->setFocusPolicy(Qt::NoFocus);
    m_scroller->setWidget(content);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(m_scroller);
}

// It only scrolls up and down. Values are elided, captions and buttons are not.
QSize PlacesPanel::minimumSizeHint() const
{
    const int width = m_scroller->widget()->minimumSizeHint().width() +
                      m_scroller->verticalScrollBar()->sizeHint().width();
    return QSize(std::max(LeastWidth, width), QWidget::minimumSizeHint().height());
}

void PlacesPanel::addValue(QString const& caption, QString const& text, bool isPlace)
{
    auto* value = new ElidedLabel(Qt::ElideMiddle);
    value->setText(LeftToRight(text));
    value->setAccessibleName(caption);
    value->setAccessibleDescription(text);
    value->setToolTip(PlainToolTip(LeftToRight(text)));
    value->setSizePolicy(QSizePolicy::Ignored, QSizePolicy::Preferred);

    QLabel* label = NewPlainLabel(caption);
    QFont bold = label->font();
    bold.setBold(true);
    label->setFont(bold);
    auto* row = new QHBoxLayout;
    row->setSpacing(4);
    row->addWidget(label, 1);
    m_layout->addLayout(row);
    m_layout->addWidget(value);
    m_layout->addSpacing(10);

    if (isPlace)
        addButton(tr("Open"), tr("Open: %1").arg(caption), tr("Show in the file manager"), row,
                  [this, text] { openPlace(text); });
    addButton(tr("Copy"), tr("Copy: %1").arg(caption), tr("Copy to the clipboard"), row,
              [this, caption, text] { copy(caption, text); });
}

void PlacesPanel::addButton(QString const& text, QString const& name, QString const& toolTip,
                            QLayout* row, std::function<void()> const& work)
{
    auto* button = new QToolButton;
    button->setText(text);
    button->setAccessibleName(name);
    button->setToolTip(PlainToolTip(toolTip));
    button->setFocusPolicy(Qt::TabFocus);
    connect(button, &QToolButton::clicked, this, work);
    row->addWidget(button);
}

bool PlacesPanel::OpenPlace(QString const& path)
{
    const QFileInfo info(path);
    const QString folder = info.isDir() ? info.absoluteFilePath() : info.absolutePath();
    return !path.isEmpty() && QFileInfo(folder).isDir() &&
           QDesktopServices::openUrl(QUrl::fromLocalFile(folder));
}

void PlacesPanel::openPlace(QString const& path)
{
    if (!OpenPlace(path))
        Q_EMIT messageReported(tr("Cannot open %1: it does not exist, or there is no file manager")
                                   .arg(LeftToRight(path)));
}

void PlacesPanel::copy(QString const& caption, QString const& text)
{
    QGuiApplication::clipboard()->setText(text);
    Q_EMIT messageReported(tr("Copied: %1").arg(caption));
}

} // namespace Velocor
