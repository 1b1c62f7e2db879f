// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares what is on the screen after random changes of a table, which moves what it has painted
// and paints the rest, with the same after all has been painted again.

#include "app/window/log/LogModel.h"
#include "app/window/log/LogView.h"
#include "app/window/widgets/UniformTable.h"
#include "plain/NumberedModel.h"
#include "plain/Program.h"
#include "support/DemoLog.h"
#include "support/TestFiles.h"

#include <QCursor>
#include <QHeaderView>
#include <QPainter>
#include <QScreen>
#include <QScrollBar>
#include <QStandardItemModel>
#include <QStyledItemDelegate>
#include <QTemporaryDir>
#include <QWindow>
#include <QtTest>

using namespace Velocor;

class tst_PlainPainting : public QObject
{
    Q_OBJECT

private slots:
    static void initTestCase() { Program::useMemoryForFiles(); }
    void tables();
    void logs();
};

namespace {

constexpr int Columns = 3;
constexpr int Patience = 20000; // milliseconds

// What is on the screen. A layout that was put off has others to follow it.
QImage Shown(QWidget const& window)
{
    for (int i = 0; i < 3; ++i)
        QCoreApplication::processEvents();
    return window.windowHandle()->screen()->grabWindow(window.winId()).toImage();
}

void PaintAll(QWidget& window)
{
    const QList<QWidget*> parts = window.findChildren<QWidget*>();
    for (QWidget* part : parts)
        part->update();
    window.update();
}

class Painting : public Program::Pair
{
public:
    void finish() {}

protected:
    void comparePixels(QAbstractItemView& view)
    {
        const QImage shown = Shown(view);
        PaintAll(view);
        const QImage painted = Shown(view);
        same("something is painted", shown.isNull(), false);
        same("pixels that differ", text(differing(shown, painted)), text(QRect()));
    }

    static QRect differing(QImage const& one, QImage const& other)
    {
        if (one.size() != other.size())
            return one.rect() | other.rect();
        QRect area;
        for (int y = 0; y < one.height(); ++y) {
            for (int x = 0; x < one.width(); ++x) {
                if (!isLike(one.pixel(x, y), other.pixel(x, y)))
                    area |= QRect(x, y, 1, 1);
            }
        }
        return area;
    }

    // The shades of smooth edges depend on the position, but only in their last bit.
    static bool isLike(QRgb one, QRgb other)
    {
        return qAbs(qRed(one) - qRed(other)) <= 1 && qAbs(qGreen(one) - qGreen(other)) <= 1 &&
               qAbs(qBlue(one) - qBlue(other)) <= 1;
    }

    static QString text(QRect const& area)
    {
        return QString("%1 %2 %3 %4")
            .arg(area.x())
            .arg(area.y())
            .arg(area.width())
            .arg(area.height());
    }

    void pressKey(QAbstractItemView& view)
    {
        static Qt::Key const keys[] = {Qt::Key_Down, Qt::Key_Up,     Qt::Key_PageDown,
                                       Qt::Key_Home, Qt::Key_PageUp, Qt::Key_End};
        static Qt::KeyboardModifier const modifiers[] = {Qt::NoModifier, Qt::ShiftModifier};
        const Qt::Key key = m_draws->oneOf(keys);
        const Qt::KeyboardModifier modifier = m_draws->oneOf(modifiers);
        tell("key #, modifier #", int(key), int(modifier));
        QTest::keyClick(&view, key, modifier);
    }

    void click(QAbstractItemView& view)
    {
        static Qt::KeyboardModifier const modifiers[] = {Qt::NoModifier, Qt::ShiftModifier,
                                                         Qt::ControlModifier};
        const int y = m_draws->below(view.viewport()->height());
        const Qt::KeyboardModifier modifier = m_draws->oneOf(modifiers);
        tell("click at #, modifier #", y, int(modifier));
        QTest::mouseClick(view.viewport(), Qt::LeftButton, modifier, QPoint(20, y));
    }

    void resize(QWidget& view)
    {
        const QSize size(120 + m_draws->below(500), 60 + m_draws->below(400));
        tell("resize to #, #", size.width(), size.height());
        view.resize(size);
    }

    // Mostly a little.
    void scroll(QAbstractItemView& view)
    {
        QScrollBar* const bar = view.verticalScrollBar();
        const int step = m_draws->below(13) - 6;
        const int row = m_draws->once(3) ? m_draws->below(bar->maximum() + 1) : bar->value() + step;
        tell("scroll to #", row);
        bar->setValue(row);
    }

    void scrollAcross(QAbstractItemView& view)
    {
        QScrollBar* const bar = view.horizontalScrollBar();
        const int x = m_draws->below(bar->maximum() + 1);
        tell("scroll across to #", x);
        bar->setValue(x);
    }
};

// Shows what is below the mouse, as some styles do.
class Hovering : public QStyledItemDelegate
{
public:
    using QStyledItemDelegate::QStyledItemDelegate;

    void paint(QPainter* painter, QStyleOptionViewItem const& option,
               QModelIndex const& index) const override
    {
        QStyledItemDelegate::paint(painter, option, index);
        if (option.state & QStyle::State_MouseOver)
            painter->drawRect(option.rect.adjusted(2, 2, -3, -3));
    }
};

class Uniform : public UniformTable
{
public:
    int heading = -1; // spans all columns

protected:
    bool isSpanning(int row) const override { return row == heading; }
};

class Tables : public Painting
{
public:
    Tables()
    {
        m_model.InsertNumbered(0, 8);
        m_view.SetRowHeight(17);
        m_view.setModel(&m_model);
        m_view.setItemDelegate(&m_delegate);
        m_view.viewport()->setAttribute(Qt::WA_Hover);
        m_view.setSelectionBehavior(QAbstractItemView::SelectRows);
        m_view.setSelectionMode(QAbstractItemView::ExtendedSelection);
        m_view.setEditTriggers(QAbstractItemView::NoEditTriggers);
        m_view.setAlternatingRowColors(true);
        m_view.horizontalHeader()->setStretchLastSection(true);
        m_view.resize(300, 200);
        QCursor::setPos(0, 0);
        m_view.show();
        Shown(m_view);
    }

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(32);
        if (kind < 10)
            append();
        else if (kind < 15)
            scroll(m_view);
        else if (kind < 18)
            pressKey(m_view);
        else if (kind < 20)
            click(m_view);
        else if (kind < 22)
            moveMouse();
        else if (kind < 24)
            change();
        else if (kind == 24)
            insertOrRemove();
        else if (kind == 25)
            resize(m_view);
        else if (kind == 26)
            scrollAcross(m_view);
        else if (kind == 27)
            setColumn();
        else if (kind == 28)
            setHeights();
        else if (kind == 29)
            setHeading();
        if (!draws.once(4)) // otherwise together with what comes next
            comparePixels(m_view);
    }

private:
    void append()
    {
        const int count = m_draws->once(10) ? 30 : 1 + m_draws->below(3);
        const bool isAtEnd = m_draws->once(2);
        tell("append #, go to the end #", count, isAtEnd);
        m_model.InsertNumbered(m_model.rowCount(), count);
        if (isAtEnd)
            m_view.scrollToBottom();
    }

    void insertOrRemove()
    {
        const int rows = m_model.rowCount();
        const int at = m_draws->below(rows + 1);
        const int count = 1 + m_draws->below(5);
        const bool isRemoved = m_draws->once(2);
        tell("remove # or insert # rows at #", isRemoved, count, at);
        if (isRemoved)
            m_model.removeRows(at, qMin(count, rows - at));
        else
            m_model.InsertNumbered(at, count);
    }

    void change()
    {
        const int row = m_draws->below(m_model.rowCount() + 1);
        const int column = m_draws->below(Columns);
        tell("change row #, column #", row, column);
        if (QStandardItem* item = m_model.item(row, column))
            item->setText(QString("changed %1").arg(++m_number));
    }

    void moveMouse()
    {
        const QPoint at(m_draws->below(200), m_draws->below(m_view.viewport()->height()));
        tell("mouse at #, #", at.x(), at.y());
        QCursor::setPos(m_view.viewport()->mapToGlobal(at));
    }

    void setColumn()
    {
        const int column = m_draws->below(Columns);
        const int width = 30 + m_draws->below(200);
        tell("column #: width #", column, width);
        m_view.setColumnWidth(column, width);
    }

    void setHeights()
    {
        const int height = 12 + m_draws->below(10);
        tell("height #", height);
        m_view.SetRowHeight(height);
    }

    void setHeading()
    {
        m_view.heading = m_draws->below(m_model.rowCount() + 1);
        tell("heading: #", m_view.heading);
        m_view.viewport()->update();
    }

    NumberedModel m_model{0, Columns};
    Hovering m_delegate;
    Uniform m_view;
    int m_number = 0;
};

class Logs : public Painting
{
public:
    Logs()
    {
        write();
        m_model.Open(m_path, LogLineParser(), false);
        m_view.resize(500, 220);
        m_view.show();
        await();
    }

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(32);
        if (kind < 14)
            append();
        else if (kind < 18)
            scroll(m_view);
        else if (kind < 20)
            pressKey(m_view);
        else if (kind < 22)
            click(m_view);
        else if (kind == 22)
            startAgain();
        else if (kind == 23)
            wrap();
        else if (kind == 24)
            zoom();
        else if (kind == 25)
            resize(m_view);
        else if (kind == 26)
            filter();
        else if (kind == 27)
            mark();
        else if (kind == 28)
            find();
        else if (kind == 29)
            follow();
        else if (kind == 30)
            showGaps();
        else
            measure();
        await();
        comparePixels(m_view);
    }

private:
    void write() { same("written", TestFiles::writeOver(m_path, m_log), true); }

    // Until the last line is known as it is.
    void await()
    {
        const bool isKnown = QTest::qWaitFor(
            [&] {
                const qint64 lines =
                    m_log.count('\n') + (m_log.isEmpty() || m_log.endsWith('\n') ? 0 : 1);
                return !m_model.isReading() && m_model.state().lines == size_t(lines) &&
                       m_model.state().rows->end() == m_log.size();
            },
            Patience);
        same("the log is read", isKnown, true);
    }

    void append()
    {
        const int count = 1 + (m_draws->once(8) ? 30 : m_draws->below(3));
        const bool isWhole = !m_draws->once(6);
        tell("append # lines, the last one whole: #", count, isWhole);
        for (int i = 0; i < count; ++i)
            m_log += line();
        if (!isWhole)
            m_log.chop(1 + m_draws->below(20));
        write();
    }

    QByteArray line()
    {
        static char const* const severities[] = {"Trace", "Warning", "Error"};
        const QByteArray text = QByteArray("word ").repeated(m_draws->below(40));
        ++m_number;
        m_seconds += m_draws->once(5) ? 90 : 1;
        const QTime time = QTime(9, 0).addSecs(m_seconds);
        return DemoLog::entry(time.toString("HH:mm:ss.zzz").toLatin1().constData(),
                              m_draws->oneOf(severities),
                              QByteArray::number(m_number) + ' ' + text);
    }

    void startAgain()
    {
        tell("the log starts again");
        m_log.clear();
        m_log += line();
        write();
    }

    void wrap()
    {
        tell("wrap: #", !m_view.isWrapped());
        m_view.SetLineWrap(!m_view.isWrapped());
    }

    void zoom()
    {
        QFont font = m_view.font();
        font.setPointSize(7 + m_draws->below(8));
        tell("text of # points", font.pointSize());
        m_view.setFont(font);
    }

    void filter()
    {
        LogFilter filter;
        const bool isFiltering = m_draws->once(2);
        tell("filter: #", isFiltering);
        if (isFiltering)
            filter.SetText("3", false, false);
        m_model.SetFilter(filter);
        m_view.UpdateMarks();
    }

    void mark()
    {
        const int row = m_draws->below(m_model.rowCount());
        tell("mark row #", row);
        if (m_model.rowCount() == 0)
            return;
        m_model.SetMarks({{m_model.LineStart(row), "note"}});
        m_view.viewport()->update();
    }

    void showGaps()
    {
        const qint64 least = m_draws->once(3) ? 0 : 60000;
        tell("gaps of # milliseconds", least);
        m_view.SetLeastGap(least);
    }

    void measure()
    {
        const int row = m_draws->below(m_model.rowCount() + 1) - 1;
        tell("measure from row #", row);
        m_view.SetSince(true);
        m_view.MeasureFrom(row);
    }

    void find()
    {
        LogFilter found;
        found.SetText(m_draws->once(2) ? "word" : "1", false, false);
        tell("find another text");
        m_view.SetFound(found);
    }

    void follow()
    {
        tell("follow: #", !m_view.isFollowing());
        m_view.SetFollowing(!m_view.isFollowing());
    }

    QTemporaryDir m_folder;
    const QString m_path = m_folder.filePath("a.log");
    QByteArray m_log;
    LogModel m_model;
    LogView m_view{&m_model};
    int m_number = 0;
    int m_seconds = 0;
};

} // namespace

void tst_PlainPainting::tables()
{
    Program::compare<Tables>("painting of tables", Rounds::count(300, 20000, 200000), 60);
}

void tst_PlainPainting::logs()
{
    Program::compare<Logs>("painting of logs", Rounds::count(40, 3000, 30000), 60);
}

QTEST_MAIN(tst_PlainPainting)
#include "tst_PlainPainting.moc"
