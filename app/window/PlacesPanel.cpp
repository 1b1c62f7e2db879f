// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/PlacesPanel.h"

#include "app/runninglog/RunningLog.h"
#include "app/window/ApplicationProperty.h"
#include "app/window/widgets/PlainText.h"

#include <QClipboard>
#include <QCoreApplication>
#include <QDesktopServices>
#include <QFileInfo>
#include <QGuiApplication>
#include <QLabel>
#include <QLineEdit>
#include <QScrollArea>
#include <QToolButton>
#include <QUrl>
#include <QVBoxLayout>

namespace Velocor {

namespace {

QToolButton* MakeButton(QString const& text, QString const& name, QString const& toolTip)
{
    auto* button = new QToolButton;
    button->setText(text);
    button->setAutoRaise(true);
    button->setMaximumHeight(button->fontMetrics().height() + 8);
    button->setAccessibleName(name);
    button->setToolTip(PlainToolTip(toolTip));
    return button;
}

} // namespace

PlacesPanel::PlacesPanel(QString const& settingsFile, QWidget* parent) : QWidget(parent)
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

    auto* scroller = new QScrollArea;
    scroller->setAccessibleName(tr("Identity and places"));
    scroller->setFrameShape(QFrame::NoFrame);
    scroller->setWidgetResizable(true);
    scroller->setHorizontalScrollBarPolicy(Qt::ScrollBarAlwaysOff);
    scroller->setFocusPolicy(Qt::NoFocus);
    scroller->setWidget(content);
    auto* layout = new QVBoxLayout(this);
    layout->setContentsMargins(0, 0, 0, 0);
    layout->addWidget(scroller);
    setMinimumWidth(180);
}

void PlacesPanel::addValue(QString const& caption, QString const& text, bool isPlace)
{
    auto* value = new QLineEdit(text);
    value->setReadOnly(true);
    value->setAccessibleName(caption);
    value->setToolTip(PlainToolTip(text));
    value->setAccessibleDescription(text);
    value->setCursorPosition(0);
    QPalette flat; // sets only this role, so the others still follow the window's palette
    flat.setBrush(QPalette::Base, Qt::transparent);
    value->setPalette(flat);

    QLabel* label = NewPlainLabel(caption);
    label->setBuddy(value);

    // As high as the buttons, so that nothing moves when they are added.
    label->setMinimumHeight(fontMetrics().height() + 8);
    auto* row = new QHBoxLayout;
    row->setSpacing(2);
    row->addWidget(label, 1);
    m_layout->addLayout(row);
    m_layout->addWidget(value);
    m_layout->addSpacing(6);
    m_rows.append({row, caption, text, isPlace, value});
}

void PlacesPanel::AddButtons()
{
    for (Row const& row : qAsConst(m_rows)) {
        QToolButton* open = nullptr;
        if (row.isPlace) {
            open = MakeButton(tr("Open"), tr("Open: %1").arg(row.caption),
                              tr("Show in the file manager"));
            connect(open, &QToolButton::clicked, this, [this, row] { openPlace(row.text); });
            row.layout->addWidget(open);
        }
        QToolButton* copyButton =
            MakeButton(tr("Copy"), tr("Copy: %1").arg(row.caption), tr("Copy to the clipboard"));
        connect(copyButton, &QToolButton::clicked, this,
                [this, row] { copy(row.caption, row.text); });
        row.layout->addWidget(copyButton);
        if (open) {
            setTabOrder(row.value, open);
            setTabOrder(open, copyButton);
        } else {
            setTabOrder(row.value, copyButton);
        }
    }
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
        Q_EMIT messageReported(
            tr("Cannot open %1: it does not exist, or there is no file manager").arg(path));
}

void PlacesPanel::copy(QString const& caption, QString const& text)
{
    QGuiApplication::clipboard()->setText(text);
    Q_EMIT messageReported(tr("Copied: %1").arg(caption));
}

} // namespace Velocor
