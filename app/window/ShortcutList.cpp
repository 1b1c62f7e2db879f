// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/ShortcutList.h"

#include "app/window/settings/SettingsTextPage.h"
#include "app/window/settings/SettingsTree.h"

#include <QAbstractButton>
#include <QAction>
#include <QCoreApplication>
#include <QMainWindow>
#include <QMap>
#include <QMenu>
#include <QMenuBar>
#include <QTabWidget>

namespace Velocor {

namespace {

constexpr int KeysWidth = 18; // characters

QString KeyLine(QKeySequence const& keys, QString const& text)
{
    return QStringLiteral("  ") + keys.toString(QKeySequence::NativeText).leftJustified(KeysWidth) +
           text + QLatin1Char('\n');
}

QString Heading(QString text)
{
    return text.remove(QLatin1Char('&')) + QLatin1Char('\n');
}

QString MenuLines(QMenu const* menu)
{
    QString lines;
    const QList<QAction*> actions = menu->actions();
    for (QAction const* action : actions) {
        if (action->menu())
            lines += MenuLines(action->menu());
        else if (!action->shortcut().isEmpty())
            lines += KeyLine(action->shortcut(), action->statusTip());
    }
    return lines;
}

// Every tab has its own buttons.
QString ButtonLines(QMainWindow const* window)
{
    QMap<QKeySequence, QString> texts;
    const QList<QAbstractButton*> buttons = window->findChildren<QAbstractButton*>();
    for (QAbstractButton const* button : buttons) {
        if (!button->shortcut().isEmpty() && !button->text().contains(QLatin1Char('&')))
            texts.insert(button->shortcut(), button->accessibleName());
    }
    QString lines;
    for (auto text = texts.constBegin(); text != texts.constEnd(); ++text)
        lines += KeyLine(text.key(), text.value());
    return lines;
}

QString TabLines(QMainWindow const* window)
{
    QString lines;
    const QList<QAction*> actions = window->findChild<QTabWidget*>()->actions();
    for (QAction const* action : actions)
        lines += KeyLine(action->shortcut(), action->text());
    return lines;
}

QString SettingsLines()
{
    QString lines;
    const QVector<SettingsCommand> all = SettingsTree::AllCommands();
    for (SettingsCommand const& command : all)
        lines += KeyLine(command.keys.first(), command.statusTip);
    const QVector<SettingsTextCommand> ofText = SettingsTextPage::AllCommands();
    for (SettingsTextCommand const& command : ofText)
        lines += KeyLine(command.key, command.statusTip);
    return lines;
}

} // namespace

QString ShortcutList(QMainWindow const* window)
{
    QString list;
    const QList<QAction*> menus = window->menuBar()->actions();
    for (QAction const* menu : menus)
        list += Heading(menu->text()) + MenuLines(menu->menu()) + QLatin1Char('\n');
    list += QCoreApplication::translate("ShortcutList", "Settings files\n") + SettingsLines() +
            QLatin1Char('\n');
    list += QCoreApplication::translate("ShortcutList", "Tabs\n") + TabLines(window) +
            QLatin1Char('\n');
    return list + QCoreApplication::translate("ShortcutList", "Buttons\n") + ButtonLines(window);
}

} // namespace Velocor
