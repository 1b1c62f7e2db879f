// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMainWindow>

/// The program's top-level window: who the program is and where its files lie.
///
/// Reads the application object's properties and the log once, when it is made; so make it after
/// both are set up.
class MainWindow : public QMainWindow
{
    Q_OBJECT

public:
    explicit MainWindow(QWidget* parent = nullptr);
    ~MainWindow() override;
};
