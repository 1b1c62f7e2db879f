// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "WindowParts.h"

#include "app/window/settings/SettingsEditor.h"

#include <QTreeView>

/// A program's surroundings, and a window that shows a settings file in its current tab.
class ShownSettings : public WindowTest
{
public:
    explicit ShownSettings(QByteArray const& content = WindowParts::Settings)
        : file(folder() + "some.cfg")
    {
        if (!TestFiles::write(file, content))
            qFatal("the settings file cannot be written");
        window = show();
        window->OpenFile(file);
        editor = window->findChild<Velocor::FileTabs*>()->currentEditor();
        tree = WindowParts::Child<QTreeView>(editor, "Settings");
    }

    const QString file;
    std::unique_ptr<Velocor::MainWindow> window;
    Velocor::SettingsEditor* editor = nullptr;
    QTreeView* tree = nullptr;
};
