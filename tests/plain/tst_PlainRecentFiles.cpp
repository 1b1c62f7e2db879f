// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares lists of recent files with a plain model, a list of texts, through random programs.

#include "app/AppUtils.h"
#include "plain/Program.h"

#include <QListWidget>
#include <QMenu>
#include <QtTest>

class tst_PlainRecentFiles : public QObject
{
    Q_OBJECT

private slots:
    void programs();
};

namespace {

// The list itself, rather than one string.
class PlainList
{
public:
    QStringList entries{""};

    bool add(QString const& file, int maximum)
    {
        if (file.isEmpty())
            return false;
        remove(file);
        entries.prepend(file);
        keep(maximum);
        return true;
    }

    bool forget(QString const& file, int maximum)
    {
        if (file.isEmpty() || !remove(file))
            return false;
        keep(maximum);
        return true;
    }

private:
    bool remove(QString const& file)
    {
        const int at = entries.indexOf(file);
        if (at >= 0)
            entries.removeAt(at);
        return at >= 0;
    }

    // Through its text, because a name may hold the separator.
    void keep(int maximum)
    {
        while (entries.size() > qMax(0, maximum))
            entries.removeLast();
        entries = entries.join('|').split('|');
    }
};

class RecentFiles : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        static char const* const names[] = {"a", "b", "c", "d", "A", "", "a|b", "a b", "|", "&x"};
        const int kind = draws.below(32);
        const QString file =
            draws.once(4) ? QString("/f%1").arg(draws.below(15)) : QString(draws.oneOf(names));
        const int maximum = draws.once(3) ? draws.below(14) - 1 : 10;
        bool changed = false;
        bool plainChanged = false;
        if (kind < 16) {
            draws.tell([&] {
                return QString("AddToMRUList(%1, list, %2)")
                    .arg(Program::quoted(file))
                    .arg(maximum);
            });
            changed = AppUtils::AddToMRUList(file, m_list, maximum);
            plainChanged = m_plain.add(file, maximum);
        } else if (kind < 22) {
            draws.tell(
                [&] { return QString("RemoveFromMRUList(%1, list)").arg(Program::quoted(file)); });
            changed = AppUtils::RemoveFromMRUList(file, m_list);
            plainChanged = m_plain.forget(file, 10);
        } else if (kind < 30) {
            const int op = draws.below(4);
            draws.tell([&] {
                return QString("UpdateMRUList(%1, list, %2, %3)")
                    .arg(Program::quoted(file))
                    .arg(maximum)
                    .arg(op);
            });
            changed = AppUtils::UpdateMRUList(file, m_list, maximum, AppUtils::MRUOpCode(op));
            plainChanged = op == 0   ? m_plain.add(file, maximum)
                           : op == 1 ? m_plain.forget(file, maximum)
                                     : false;
        } else if (kind == 30) {
            static char const* const lists[] = {
                "", "a", "a|", "|", "b|a|c|b", "||a|a", "1|2|3|4|5|6|7|8|9|10|11|12|a"};
            m_list = draws.oneOf(lists);
            draws.tell([&] { return QString("list = %1").arg(Program::quoted(m_list)); });
            m_plain.entries = m_list.split('|');
        } else if (draws.once(16)) {
            draws.tell([] { return QString("SetupMRUMenu(), SetupMRUListWidget()"); });
            show();
        }
        same("result", changed, plainChanged);
        same("list", m_list, m_plain.entries.join('|'));
        same("null", m_list.isNull(), false);
    }

    void finish() {}

private:
    // Both over what an earlier list has left in them.
    void show()
    {
        static QMenu& menu = *new QMenu; // not deleted after the application
        static QListWidget& widget = *new QListWidget;
        menu.setEnabled(false);
        widget.setEnabled(false);
        same("menu", AppUtils::SetupMRUMenu(&menu, m_list), true);
        same("widget", AppUtils::SetupMRUListWidget(&widget, m_list), true);
        QStringList actions;
        for (QAction const* action : menu.actions())
            actions.append(action->text());
        QStringList items;
        for (int row = 0; row < widget.count(); ++row)
            items.append(widget.item(row)->text());
        same("actions", actions, m_plain.entries);
        same("items", items, m_plain.entries);
        same("enabled", menu.isEnabled() && widget.isEnabled(), true);
    }

    QString m_list = QLatin1String("");
    PlainList m_plain;
};

} // namespace

void tst_PlainRecentFiles::programs()
{
    Program::compare<RecentFiles>("recent files", Rounds::count(300000, 1000000, 10000000), 40);
}

QTEST_MAIN(tst_PlainRecentFiles)
#include "tst_PlainRecentFiles.moc"
