// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/MainWindow.h"

#include "common/log/TorkLog.h"

#include <QCoreApplication>
#include <QFormLayout>
#include <QLabel>
#include <QVariant>

namespace {

QString Property(char const* name)
{
    return QCoreApplication::instance()->property(name).toString();
}

QString LogFile()
{
    TorkLog* log = TorkLog::logger();
    return log ? log->newLogFileName() : QString();
}

void AddRow(QFormLayout* layout, QString const& caption, QString const& text)
{
    auto* value = new QLabel(text);
    value->setTextFormat(Qt::PlainText);
    value->setTextInteractionFlags(Qt::TextSelectableByMouse | Qt::TextSelectableByKeyboard);
    value->setAccessibleName(caption);

    auto* label = new QLabel(caption + QLatin1Char(':'));
    label->setBuddy(value);
    layout->addRow(label, value);
}

} // namespace

MainWindow::MainWindow(QWidget* parent) : QMainWindow(parent)
{
    setWindowTitle(Property("caption"));

    auto* content = new QWidget;
    auto* layout = new QFormLayout(content);
    layout->setContentsMargins(24, 24, 24, 24);
    layout->setHorizontalSpacing(16);
    layout->setVerticalSpacing(10);
    AddRow(layout, tr("Organization"), QCoreApplication::organizationName());
    AddRow(layout, tr("Product"), QCoreApplication::applicationName());
    AddRow(layout, tr("Installation"), Property("RootPath"));
    AddRow(layout, tr("Data"), Property("DataPath"));
    AddRow(layout, tr("Documents"), Property("DocPath"));
    AddRow(layout, tr("Log file"), LogFile());
    setCentralWidget(content);
}

MainWindow::~MainWindow() = default;
