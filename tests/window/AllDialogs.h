// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "WindowParts.h"

#include "app/UserMessages.h"
#include "app/window/settings/DifferenceDialog.h"
#include "app/window/settings/FileListDialog.h"
#include "app/window/settings/LineDialog.h"
#include "app/window/settings/SizeDialog.h"
#include "app/window/settings/ValueDialog.h"
#include "app/window/settings/WindowPlaceDialog.h"

#include <QDialog>

/// The dialogs of the window, one after the other. Its log must have an entry, and its second tab
/// must be a settings file.
class AllDialogs
{
public:
    /// @param translated  the text of a menu item in the language of the window
    AllDialogs(Velocor::MainWindow& window, std::function<QString(QString const&)> translated)
        : m_window(window), m_translated(std::move(translated))
    {}

    /// The rows of a test, without columns: one for each dialog, with its name.
    static QStringList names()
    {
        QStringList all = ofLogs() + ofSettings();
        return all << "difference"
                   << "file list"
                   << "line"
                   << "size"
                   << "value"
                   << "window place"
                   << "message"
                   << "unsaved changes";
    }

    /// Opens a dialog, calls a function with it, and closes it.
    void with(QString const& name, std::function<void(QDialog*)> const& work)
    {
        if (ofLogs().contains(name)) {
            tabs()->setCurrentIndex(0);
            WindowParts::View(m_window)->GoToRow(0);
            if (name == "A&ll Marks...")
                action("&Mark")->trigger();
            trigger(name, work);
        } else if (ofSettings().contains(name)) {
            tabs()->setCurrentIndex(1);
            trigger(name, work);
        } else if (name == "message") {
            whenShown(work);
            CriticalMessage(&m_window, "/home/ada: " + m_translated("Not a number"), true);
        } else if (name == "unsaved changes") {
            tabs()->setCurrentIndex(1);
            auto* tree = tabs()->currentWidget()->findChild<QTreeView*>();
            QTest::keyClick(tree, Qt::Key_D, Qt::ControlModifier);
            trigger("&Close Tab", work);
        } else {
            const std::unique_ptr<QDialog> dialog(ofValue(name));
            dialog->show();
            if (QTest::qWaitForWindowExposed(dialog.get(), WindowTest::Patience))
                work(dialog.get());
        }
    }

private:
    static QStringList ofLogs()
    {
        return {"Log Se&ttings...", "Save Re&port...",     "&Go To...",
                "N&ote...",         "A&ll Marks...",       "&Highlight Rules...",
                "&Patterns...",     "&Keyboard Shortcuts", "&About %1"};
    }

    static QStringList ofSettings() { return {"&What Will Be Written...", "Sa&ved States..."}; }

    Velocor::FileTabs* tabs() { return m_window.findChild<Velocor::FileTabs*>(); }

    QAction* action(QString const& text)
    {
        QString wanted = m_translated(text);
        if (wanted.contains("%1"))
            wanted = wanted.arg("Velocor");
        const QList<QAction*> all = m_window.findChildren<QAction*>();
        for (QAction* action : all) {
            if (action->text().section('\t', 0, 0) == wanted)
                return action;
        }
        qFatal("no %s", qPrintable(wanted));
    }

    static void whenShown(std::function<void(QDialog*)> const& work)
    {
        WindowTest::whenShown<QDialog>([work](QDialog* dialog) {
            work(dialog);
            dialog->reject();
        });
    }

    void trigger(QString const& name, std::function<void(QDialog*)> const& work)
    {
        whenShown(work);
        action(name)->trigger();
    }

    static QDialog* ofValue(QString const& name)
    {
        using namespace Velocor;
        if (name == "file list")
            return new FileListDialog("S / k", {"/home/ada/a.cfg", "b.cfg"});
        if (name == "line")
            return new LineDialog(1, 10);
        if (name == "size")
            return new SizeDialog("S / k", QSize(1, 2));
        if (name == "value")
            return new ValueDialog("S / k", "a\nb");
        if (name == "window place")
            return new WindowPlaceDialog("S / k", QPoint(1, 2), QSize(3, 4));
        auto* dialog = new DifferenceDialog("S", nullptr);
        dialog->SetSides({"1", SettingsDocument(), "a"}, {"2", SettingsDocument(), "b"});
        dialog->AllowTakeOver();
        return dialog;
    }

    Velocor::MainWindow& m_window;
    std::function<QString(QString const&)> m_translated;
};
