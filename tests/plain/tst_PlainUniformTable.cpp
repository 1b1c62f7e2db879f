// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares UniformTable with QTableView, whose rows are set to the same height: what keys, clicks
// and changes of the model do, where cells are, and how they are painted.

#include "app/window/widgets/UniformTable.h"
#include "plain/NumberedModel.h"
#include "plain/Program.h"

#include <QApplication>
#include <QHeaderView>
#include <QImage>
#include <QScrollBar>
#include <QtTest>

using namespace Velocor;

class tst_PlainUniformTable : public QObject
{
    Q_OBJECT

private slots:
    void tables();
    void moreRowsThanPixels();
};

namespace {

constexpr int Columns = 4;
constexpr int RowHeight = 17;

class Uniform : public UniformTable
{
public:
    int heading = -1; // spans all columns

protected:
    bool isSpanning(int row) const override { return row == heading; }
};

class Tables : public Program::Pair
{
public:
    Tables()
    {
        m_uniform.SetRowHeight(RowHeight);
        m_plain.verticalHeader()->hide();
        m_plain.verticalHeader()->setMinimumSectionSize(1);
        m_plain.verticalHeader()->setSectionResizeMode(QHeaderView::Fixed);
        m_plain.verticalHeader()->setDefaultSectionSize(RowHeight);
        m_plain.setShowGrid(false);
        m_plain.setVerticalScrollMode(QAbstractItemView::ScrollPerItem);
        m_plain.setHorizontalScrollMode(QAbstractItemView::ScrollPerPixel);
        m_model.InsertNumbered(0, 30);
        for (QTableView* view : views()) {
            view->setModel(&m_model);
            view->setSelectionBehavior(QAbstractItemView::SelectRows);
            view->setSelectionMode(QAbstractItemView::ExtendedSelection);
            view->setEditTriggers(QAbstractItemView::NoEditTriggers);
            view->setTabKeyNavigation(false);
            view->setFocusPolicy(Qt::NoFocus); // which only one could have
            view->setAlternatingRowColors(true);
            view->horizontalHeader()->setStretchLastSection(true);
            view->resize(300, 200);
            view->show();
            view->setCurrentIndex(m_model.index(0, 0)); // the focus would do so in one of them
        }
    }

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(32);
        if (kind < 12)
            pressKey();
        else if (kind < 18)
            click();
        else if (kind < 20)
            changeRows();
        else if (kind < 22)
            resize();
        else if (kind == 22)
            changeColumns();
        else if (kind == 23)
            setHeading();
        else if (kind < 26)
            scroll();
        else if (kind < 29)
            scrollTo();
        else
            look();
        QCoreApplication::processEvents();
        compare();
    }

    void finish()
    {
        settle();
        same("painted the same", image(m_uniform) == image(m_plain), true);
    }

private:
    QVector<QTableView*> views() { return {&m_uniform, &m_plain}; }

    void pressKey()
    {
        static Qt::Key const keys[] = {Qt::Key_Down, Qt::Key_Up,  Qt::Key_PageDown, Qt::Key_PageUp,
                                       Qt::Key_Home, Qt::Key_End, Qt::Key_Left,     Qt::Key_Right};
        static Qt::KeyboardModifier const modifiers[] = {Qt::NoModifier, Qt::NoModifier,
                                                         Qt::ShiftModifier, Qt::ControlModifier};
        const Qt::Key key = m_draws->oneOf(keys);
        const Qt::KeyboardModifier modifier = m_draws->oneOf(modifiers);
        tell("key #, modifier #", int(key), int(modifier));
        for (QTableView* view : views())
            QTest::keyClick(view, key, modifier);
    }

    void click()
    {
        static Qt::KeyboardModifier const modifiers[] = {Qt::NoModifier, Qt::NoModifier,
                                                         Qt::ShiftModifier, Qt::ControlModifier};
        const QPoint at = point();
        const Qt::KeyboardModifier modifier = m_draws->oneOf(modifiers);
        tell("click at #, #, modifier #", at.x(), at.y(), int(modifier));
        for (QTableView* view : views())
            QTest::mouseClick(view->viewport(), Qt::LeftButton, modifier, at);
    }

    QPoint point()
    {
        const QSize size = m_plain.viewport()->size();
        const int y = m_draws->below(size.height());
        return QPoint(m_draws->below(size.width()), y);
    }

    void changeRows()
    {
        const int rows = m_model.rowCount();
        const int at = m_draws->below(rows + 1);
        const int most = m_draws->once(8) ? rows : 8;
        const int count = 1 + m_draws->below(most);
        if (m_draws->once(2)) {
            const int removed = qMin(qMin(count, rows - at), rows - 1);
            tell("remove # rows at #", removed, at);
            m_model.removeRows(at, removed);
        } else {
            tell("insert # rows at #", count, at);
            m_model.InsertNumbered(at, count);
        }
        QCoreApplication::processEvents();
    }

    void resize()
    {
        const QSize size(60 + m_draws->below(500), 60 + m_draws->below(400));
        tell("resize to #, #", size.width(), size.height());
        for (QTableView* view : views())
            view->resize(size);
    }

    void changeColumns()
    {
        const int column = m_draws->below(Columns);
        const int width = 30 + m_draws->below(200);
        // Not the current one, which QTableView leaves in ways of its own.
        const bool isHidden =
            m_draws->once(2) && column > 0 && column != m_plain.currentIndex().column();
        tell("column #: width #, hidden #", column, width, isHidden);
        for (QTableView* view : views()) {
            view->setColumnHidden(column, isHidden);
            if (!isHidden)
                view->setColumnWidth(column, width);
            view->resize(view->size() + QSize(1, 0)); // QTableView's bar may be out of date
        }
    }

    // Only for a moment: QTableView remembers the column in which such a row was entered.
    void setHeading()
    {
        const int row = m_draws->below(m_model.rowCount());
        if (row == m_plain.currentIndex().row())
            return;
        tell("heading: #", row);
        m_plain.setSpan(row, 0, 1, Columns);
        m_uniform.heading = row;
        for (QTableView* view : views())
            view->viewport()->update();
        look();
        const QModelIndex heading = m_model.index(row, 0);
        same("heading", text(m_uniform.visualRect(heading)), text(m_plain.visualRect(heading)));
        settle();
        same("painted with a heading", image(m_uniform) == image(m_plain), true);
        m_plain.clearSpans();
        m_uniform.heading = -1;
        for (QTableView* view : views())
            view->viewport()->update();
    }

    void scroll()
    {
        const int down = m_draws->below(m_model.rowCount() + 1);
        const int right = m_draws->below(100);
        tell("scroll to #, #", right, down);
        for (QTableView* view : views()) {
            view->verticalScrollBar()->setValue(down);
            view->horizontalScrollBar()->setValue(right);
        }
    }

    void scrollTo()
    {
        if (m_model.rowCount() == 0)
            return;
        static QAbstractItemView::ScrollHint const hints[] = {
            QAbstractItemView::EnsureVisible, QAbstractItemView::PositionAtTop,
            QAbstractItemView::PositionAtBottom, QAbstractItemView::PositionAtCenter};
        const int row = m_draws->below(m_model.rowCount());
        const QAbstractItemView::ScrollHint hint = m_draws->oneOf(hints);
        tell("scroll to row #, hint #", row, int(hint));
        for (QTableView* view : views())
            view->scrollTo(m_model.index(row, 0), hint);
    }

    void look()
    {
        if (m_model.rowCount() == 0)
            return;
        const QModelIndex index =
            m_model.index(m_draws->below(m_model.rowCount()), m_draws->below(Columns));
        tell("look at row #, column #", index.row(), index.column());
        same("cell", text(m_uniform.visualRect(index)), text(m_plain.visualRect(index)));
        const QPoint at = point() - QPoint(0, m_draws->below(100));
        same("cell at", text(m_uniform.indexAt(at)), text(m_plain.indexAt(at)));
        same("row at", m_uniform.rowAt(at.y()), m_plain.rowAt(at.y()));
        same("column hint", sizeHint(m_uniform, index.column()), sizeHint(m_plain, index.column()));
    }

    static int sizeHint(QTableView& view, int column)
    {
        view.resizeColumnToContents(column);
        return view.columnWidth(column);
    }

    void compare()
    {
        same("current cell", text(m_uniform.currentIndex()), text(m_plain.currentIndex()));
        same("horizontal bar", text(m_uniform.horizontalScrollBar()),
             text(m_plain.horizontalScrollBar()));
        same("selected rows", selected(m_uniform), selected(m_plain));
        same("vertical bar", text(m_uniform.verticalScrollBar()),
             text(m_plain.verticalScrollBar()));
        same("viewport", text(m_uniform.viewport()->geometry()),
             text(m_plain.viewport()->geometry()));
        same("header", text(m_uniform.horizontalHeader()->geometry()),
             text(m_plain.horizontalHeader()->geometry()));
    }

    static QString text(QRect const& rect)
    {
        return rect.isEmpty() ? QString("empty")
                              : QString("%1 %2 %3 %4")
                                    .arg(rect.x())
                                    .arg(rect.y())
                                    .arg(rect.width())
                                    .arg(rect.height());
    }

    static QString text(QModelIndex const& index)
    {
        return QString("%1 %2").arg(index.row()).arg(index.column());
    }

    static QString text(QScrollBar const* bar)
    {
        return QString("%1 of %2, page %3, shown %4")
            .arg(bar->value())
            .arg(bar->maximum())
            .arg(bar->pageStep())
            .arg(bar->isVisible());
    }

    static QString selected(QTableView const& view)
    {
        QStringList rows;
        for (int row = 0; row < view.model()->rowCount(); ++row) {
            if (view.selectionModel()->isRowSelected(row, QModelIndex()))
                rows.append(QString::number(row));
        }
        return rows.join(' ');
    }

    // A column that fits its contents may make a scroll bar needless, which the layout after that
    // finds out.
    static void settle()
    {
        for (int layout = 0; layout < 3; ++layout)
            QCoreApplication::processEvents();
    }

    // Without the focus, which only one can have.
    static QImage image(QTableView& view)
    {
        QCoreApplication::processEvents();
        if (QWidget* focused = QApplication::focusWidget())
            focused->clearFocus();
        return view.viewport()->grab().toImage();
    }

    NumberedModel m_model{0, Columns};
    Uniform m_uniform;
    QTableView m_plain;
};

} // namespace

void tst_PlainUniformTable::tables()
{
    Program::compare<Tables>("uniform table", Rounds::count(1500, 50000, 500000), 60);
}

// Together they are higher than an int can tell, which QTableView cannot show.
void tst_PlainUniformTable::moreRowsThanPixels()
{
    class Rows : public QAbstractTableModel
    {
    public:
        int rowCount(QModelIndex const& parent = QModelIndex()) const override
        {
            return parent.isValid() ? 0 : 1000000000;
        }
        int columnCount(QModelIndex const& /*parent*/ = QModelIndex()) const override { return 1; }
        QVariant data(QModelIndex const& index, int role) const override
        {
            return role == Qt::DisplayRole ? QVariant(index.row()) : QVariant();
        }
    };
    Rows rows;
    Uniform table;
    table.SetRowHeight(RowHeight);
    table.setModel(&rows);
    table.resize(300, 200);
    table.show();
    QCoreApplication::processEvents();
    const QModelIndex first = rows.index(0, 0);
    const QModelIndex middle = rows.index(500000000, 0);
    const QModelIndex last = rows.index(rows.rowCount() - 1, 0);
    QCOMPARE(table.visualRect(first).top(), 0);
    QVERIFY(table.visualRect(last).top() > 1000000);
    table.scrollToBottom();
    QCOMPARE(table.visualRect(last).bottom() + 1, table.viewport()->height());
    QCOMPARE(table.rowAt(table.viewport()->height() - 1), last.row());
    QVERIFY(table.visualRect(first).top() < -1000000);
    table.scrollTo(middle, QAbstractItemView::PositionAtTop);
    QCOMPARE(table.visualRect(middle).top(), 0);
    QCOMPARE(table.rowAt(0), middle.row());
    QVERIFY(table.visualRect(first).top() < -1000000);
    QVERIFY(table.visualRect(last).top() > 1000000);
    table.grab();
}

QTEST_MAIN(tst_PlainUniformTable)
#include "tst_PlainUniformTable.moc"
