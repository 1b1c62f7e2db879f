// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The program with the smallest useful window: the same startup steps, and labels with the identity
// and the locations. The difference from the real window is the cost of its own content.

#include "app/AppPaths.h"
#include "app/WithoutOpenGl_p.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QFormLayout>
#include <QLabel>
#include <QMainWindow>

namespace {

QLabel* PropertyLabel(char const* name)
{
    return new QLabel(QCoreApplication::instance()->property(name).toString());
}

QWidget* Places()
{
    auto* content = new QWidget;
    auto* layout = new QFormLayout(content);
    layout->addRow(QStringLiteral("Organization:"), new QLabel(QApplication::organizationName()));
    layout->addRow(QStringLiteral("Product:"), new QLabel(QApplication::applicationName()));
    layout->addRow(QStringLiteral("Installation:"), PropertyLabel("RootPath"));
    layout->addRow(QStringLiteral("Data:"), PropertyLabel("DataPath"));
    layout->addRow(QStringLiteral("Documents:"), PropertyLabel("DocPath"));
    layout->addRow(QStringLiteral("Log file:"), new QLabel(TorkLog::logger()->newLogFileName()));
    return content;
}

} // namespace

int main(int argc, char** argv)
{
    Velocor::WithoutOpenGl withoutOpenGl;
    QApplication application(argc, argv);
    withoutOpenGl.End();
    AppPaths::SetOrganizationAndProduct();
    TorkLog::initialize(QStringLiteral("velocor"));
    application.setProperty("caption", QStringLiteral("Velocor"));

    QMainWindow window;
    window.setCentralWidget(Places());
    window.resize(1080, 680); // as large as the real one: the size of the window has a cost too
    window.show();
    return QApplication::exec();
}
