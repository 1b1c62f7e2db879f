// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Random commands on a settings document. Undone, they give the bytes that were there before, after
// each of them; redone, the same as the first time. The tree's model is checked along the way.

#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/settings/SettingsCommands.h"
#include "plain/Rounds.h"

#include <QAbstractItemModelTester>
#include <QCryptographicHash>
#include <QtTest>

#include <cstdio>
#include <random>

using namespace Velocor;

namespace {

// Of how many edits the bytes are remembered once.
constexpr int Interval = 50;

class Edits
{
public:
    explicit Edits(quint32 seed) : m_random(seed)
    {
        SettingsDocument document;
        document.rootName = "R";
        for (int i = 0; i < 3; ++i)
            document.sections.append({QString("S%1").arg(i), {{"a", "1"}, {"b", "2"}}});
        model.SetDocument(document);
    }

    void next()
    {
        // About as much is removed as is added, so the document stays small.
        const int sections = model.rowCount();
        switch (below(11)) {
        case 0:
            if (sections < 12)
                commands.AddSection();
            break;
        case 1:
        case 2:
            commands.AddKey(anyRow());
            break;
        case 3:
            if (sections < 12)
                commands.Duplicate(anyRow());
            break;
        case 4:
        case 5:
            commands.Remove({anyRow(), anyRow()});
            break;
        case 6:
        case 7:
            commands.Move(anyRow(), below(2) == 0 ? 1 : -1);
            break;
        case 8:
            setText(anyRow(), QString("n%1").arg(below(8)));
            break;
        default:
            setText(anyRow().sibling(anyRow().row(), SettingsModel::ValueColumn), value());
            break;
        }
    }

    QByteArray bytes() const
    {
        return QCryptographicHash::hash(SettingsFileWriter::ToBytes(model.document()),
                                        QCryptographicHash::Sha1);
    }

    SettingsModel model;
    SettingsCommands commands{&model};

private:
    int below(int limit) { return static_cast<int>(m_random() % static_cast<unsigned>(limit)); }

    QModelIndex anyRow()
    {
        if (model.rowCount() == 0)
            return QModelIndex();
        const QModelIndex section = model.index(below(model.rowCount()), 0);
        const int items = model.rowCount(section);
        return items == 0 || below(4) == 0 ? section : model.index(below(items), 0, section);
    }

    void setText(QModelIndex const& cell, QString const& text)
    {
        if (cell.isValid() && model.flags(cell) & Qt::ItemIsEditable)
            commands.SetText(cell, text);
    }

    QString value()
    {
        static char const* const values[] = {"", "v", "R&D", "%1", "]]>", " ", "a\nb"};
        return QString::fromLatin1(values[below(7)]) + QString::number(below(3));
    }

    std::mt19937 m_random;
};

} // namespace

class tst_PlainSettingsEdits : public QObject
{
    Q_OBJECT

private slots:
    void modelIsConsistent();
    void undoneAndRedone();
};

void tst_PlainSettingsEdits::modelIsConsistent()
{
    Edits edits(Rounds::seed());
    const QAbstractItemModelTester tester(&edits.model,
                                          QAbstractItemModelTester::FailureReportingMode::QtTest);
    QUndoStack* stack = edits.commands.undoStack();
    const int count = Rounds::count(1000, 20000);
    for (int i = 0; i < count && !QTest::currentTestFailed(); ++i) {
        // Indexes that are held while rows come, go and move.
        const QPersistentModelIndex held(edits.model.IndexOf({edits.model.rowCount() - 1, 0}));
        const QString text = held.data(Qt::EditRole).toString();
        edits.next();
        if (held.isValid() && stack->undoText().startsWith("Move"))
            QCOMPARE(held.data(Qt::EditRole).toString(), text);
        if (i % 7 == 0)
            stack->undo();
    }
}

void tst_PlainSettingsEdits::undoneAndRedone()
{
    Edits edits(Rounds::seed() + 1);
    QUndoStack* stack = edits.commands.undoStack();
    const int count = Rounds::count(20000, 1000000);
    QHash<int, QByteArray> bytes{{0, edits.bytes()}}; // by the number of commands done
    int most = 0;
    while (stack->index() < count) {
        const int before = stack->index();
        edits.next();
        QVERIFY(stack->index() - before <= 1);
        if (stack->index() % Interval == 0)
            bytes.insert(stack->index(), edits.bytes());
        most = std::max(most, edits.model.rowCount());
    }
    bytes.insert(count, edits.bytes());
    QVERIFY(most > 3);

    const auto check = [&] {
        if (bytes.contains(stack->index()))
            QCOMPARE(edits.bytes().toHex(), bytes.value(stack->index()).toHex());
    };
    while (stack->canUndo() && !QTest::currentTestFailed()) {
        stack->undo();
        check();
    }
    while (stack->canRedo() && !QTest::currentTestFailed()) {
        stack->redo();
        check();
    }
    QCOMPARE(stack->index(), count);
    std::printf("plain settings edits: %d edits undone and redone, the bytes compared %d times\n",
                count, 2 * int(bytes.size()) - 2);
    std::fflush(stdout);
}

QTEST_GUILESS_MAIN(tst_PlainSettingsEdits)
#include "tst_PlainSettingsEdits.moc"
