// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Random commands on a settings document. Undone, they give the bytes that were there before, after
// each of them; redone, the same as the first time. The tree's model is checked along the way, with
// filters that come and go.

#include "app/settingsfile/CaselessText.h"
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
        model.SetSaved(document);
        model.SetDefaults({{{"S1", "a"}, "3"}, {{"S2", "n1"}, "v0"}});
        model.SetDocument(document);
    }

    void next()
    {
        // About as much is removed as is added, so the document stays small.
        const int sections = model.rowCount();
        switch (below(12)) {
        case 11:
            model.SetFilter(anyFilter());
            break;
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

    // None in every other case.
    SettingsFilter anyFilter()
    {
        SettingsFilter filter;
        if (below(2) == 0)
            return filter;
        static char const* const texts[] = {"", "a", "N", "1", "key", "s2", "nowhere"};
        filter.text = QString::fromLatin1(texts[below(7)]);
        filter.onlyChanged = below(4) == 0;
        filter.onlyDiffering = below(4) == 0;
        return filter;
    }

    QString value()
    {
        static char const* const values[] = {"", "v", "R&D", "%1", "]]>", " ", "a\nb"};
        return QString::fromLatin1(values[below(7)]) + QString::number(below(3));
    }

    std::mt19937 m_random;
};

// The keys that are shown, as "section/key=value".
QStringList ShownKeys(SettingsModel const& model)
{
    QStringList keys;
    for (int i = 0; i < model.rowCount(); ++i) {
        const QModelIndex section = model.index(i, 0);
        const QString name = section.data(Qt::EditRole).toString();
        keys.append(name);
        for (int j = 0; j < model.rowCount(section); ++j)
            keys.append(QString("%1/%2=%3")
                            .arg(name, model.index(j, 0, section).data().toString(),
                                 model.index(j, 1, section).data().toString()));
    }
    return keys;
}

// One key after the other, as the words of the filter bar say it.
QStringList FilteredPlainly(SettingsModel const& model, SettingsDocument const& saved,
                            SettingsValues const& defaults)
{
    SettingsFilter const& filter = model.filter();
    const auto contains = [&](QString const& text) {
        return text.contains(filter.text, Qt::CaseInsensitive);
    };
    QStringList keys;
    for (SettingsDocument::Section const& section : model.document().sections) {
        QStringList of;
        for (SettingsDocument::Item const& item : section.items) {
            if (!contains(section.name) && !contains(item.key) && !contains(item.value))
                continue;
            if (filter.onlyChanged && saved.Value(section.name, item.key, "missing") == item.value)
                continue;
            const QString byDefault = defaults.value({section.name, item.key});
            if (filter.onlyDiffering && (byDefault.isNull() || byDefault == item.value))
                continue;
            of.append(QString("%1/%2=%3").arg(section.name, item.key, item.value));
        }
        const bool isAskedFor =
            contains(section.name) && !filter.onlyChanged && !filter.onlyDiffering;
        if (isAskedFor || !of.isEmpty())
            keys << section.name << of;
    }
    return keys;
}

} // namespace

class tst_PlainSettingsEdits : public QObject
{
    Q_OBJECT

private slots:
    void modelIsConsistent();
    void filterHidesTheOthers();
    void textInAnyCase();
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

void tst_PlainSettingsEdits::filterHidesTheOthers()
{
    Edits edits(Rounds::seed() + 2);
    const SettingsDocument saved = edits.model.document();
    const SettingsValues defaults{{{"S1", "a"}, "3"}, {{"S2", "n1"}, "v0"}};
    const int count = Rounds::count(3000, 200000);
    int hidden = 0;
    for (int i = 0; i < count; ++i) {
        edits.next();
        if (i % 3 != 0)
            continue;
        edits.model.SetFilter(edits.model.filter());
        const QStringList shown = ShownKeys(edits.model);
        QCOMPARE(shown, FilteredPlainly(edits.model, saved, defaults));
        SettingsModel whole;
        whole.SetDocument(edits.model.document());
        hidden += shown == ShownKeys(whole) ? 0 : 1;
    }
    QVERIFY(hidden > count / 30);
    std::printf("plain settings filter: %d filters compared, %d of which hid keys\n", count / 3,
                hidden);
    std::fflush(stdout);
}

// Every code unit as a text of one letter, and random texts of few letters.
void tst_PlainSettingsEdits::textInAnyCase()
{
    std::mt19937 random(Rounds::seed() + 3);
    const QString few =
        QString::fromUtf8("aAsS\u017fkK\u212a\u00df\u1e9e\u0130i\u0131I \u03c3\u03c2\u03a3");
    const int count = Rounds::count(2000, 0x10000 * 2);
    int found = 0;
    for (int i = 0; i < count; ++i) {
        const bool isLetter = i % 2 == 0;
        const int code = Rounds::isFull() ? i / 2 : static_cast<int>(random() % 0x600);
        QString text(QChar(static_cast<ushort>(code)));
        for (int more = isLetter ? 0 : static_cast<int>(random() % 3); more > 0; --more)
            text.append(few.at(static_cast<int>(random() % unsigned(few.size()))));
        const CaselessText wanted(text);
        QStringList others{QString(), text, text.toUpper(), text.toLower(), text.toCaseFolded()};
        for (int j = 0; j < 20; ++j) {
            QString other;
            for (int length = static_cast<int>(random() % 6); length > 0; --length)
                other.append(random() % 3 == 0
                                 ? text.at(0).toUpper()
                                 : few.at(static_cast<int>(random() % unsigned(few.size()))));
            others.append(other);
        }
        for (QString const& other : qAsConst(others)) {
            const bool isIn = other.contains(text, Qt::CaseInsensitive);
            QVERIFY2(wanted.IsIn(other) == isIn, qPrintable(text + " in " + other));
            found += isIn ? 1 : 0;
        }
    }
    QVERIFY(found > count);
    std::printf("plain text in any case: %d texts, found %d times\n", count, found);
    std::fflush(stdout);
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
