// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the cells of a log view with what the style paints for them.

#include "app/window/log/LogDelegate.h"
#include "app/window/log/LogModel.h"
#include "app/window/widgets/SeverityIcons.h"
#include "plain/Rounds.h"

#include <QApplication>
#include <QFontDatabase>
#include <QImage>
#include <QPainter>
#include <QStandardItemModel>
#include <QStyleFactory>
#include <QTableView>
#include <QtTest>

#include <cstdio>
#include <random>

using namespace Velocor;

class tst_PlainCells : public QObject
{
    Q_OBJECT

private slots:
    void cells_data();
    void cells();
};

namespace {

class PlainDelegate : public LogDelegate
{
public:
    void paint(QPainter* painter, QStyleOptionViewItem const& option,
               QModelIndex const& index) const override
    {
        QStyleOptionViewItem cell = option;
        initStyleOption(&cell, index);
        cell.widget->style()->drawControl(QStyle::CE_ItemViewItem, &cell, painter, cell.widget);
    }
};

// Also letters that combine, that join, that read from the right, that are wide or have no width,
// and that break lines.
QString const Letters = QString::fromUtf8("aWil. \t\n\xc3\xa9\xcc\x81\xd7\x90\xd7\x91\xd9\x84"
                                          "\xd8\xa7\xd9\x85\xe0\xa4\x95\xe0\xa5\x8d\xe0\xa4\xb7"
                                          "\xe0\xa4\xbf\xe4\xb8\xad\xe2\x80\x8d\xe2\x80\x8f");
QString const AsciiLetters("aWAVTofil.,:-=>!()[]0123 ");

QImage Painted(LogDelegate const& delegate, QStyleOptionViewItem const& option,
               QModelIndex const& index)
{
    QImage image(320, 60, QImage::Format_RGB32);
    image.fill(Qt::lightGray);
    QPainter painter(&image);
    delegate.paint(&painter, option, index);
    return image;
}

class Cells
{
public:
    explicit Cells(std::mt19937& random) : m_random(random), m_model(1, LogModel::ColumnCount) {}

    // What differs; empty if nothing does.
    QString compare()
    {
        const QModelIndex index = m_model.index(0, below(LogModel::ColumnCount));
        const QString text = randomText();
        m_model.setData(index, text);
        m_model.setData(index,
                        below(2) ? int(Qt::AlignLeft | Qt::AlignVCenter)
                                 : int(Qt::AlignRight | Qt::AlignVCenter),
                        Qt::TextAlignmentRole);
        m_model.setData(
            index, below(3) ? QVariant() : SeverityIcons::Icon(LogEntry::Warning, m_view.palette()),
            Qt::DecorationRole);
        const QStyleOptionViewItem option = randomOption();
        const QImage painted = Painted(m_delegate, option, index);
        const QImage plain = Painted(m_plain, option, index);
        return painted == plain ? QString()
                                : QString("\"%1\" in %2 pixels, state %3")
                                      .arg(text)
                                      .arg(option.rect.width())
                                      .arg(int(option.state));
    }

private:
    int below(int limit) { return int(m_random() % quint32(limit)); }

    QString randomText()
    {
        static int const lengths[] = {12, 12, 60, 300, 1200};
        QString text;
        // Only narrow or wide letters, or all; mostly with none of the others, or with one of them.
        const int first = below(3) ? 0 : below(AsciiLetters.size());
        const int kinds = below(3) ? AsciiLetters.size() - first : 1;
        const bool isAscii = below(2);
        for (int left = below(lengths[below(5)]); left > 0; --left)
            text +=
                isAscii ? AsciiLetters.at(first + below(kinds)) : Letters.at(below(Letters.size()));
        if (isAscii && below(4) == 0)
            text += Letters.at(below(Letters.size()));
        return text;
    }

    QStyleOptionViewItem randomOption()
    {
        QStyleOptionViewItem option;
        option.initFrom(&m_view);
        option.widget = &m_view;
        option.rect = QRect(5, 5, 1 + below(300), 8 + below(30));
        option.state = QStyle::State_None;
        for (QStyle::StateFlag flag : {QStyle::State_Enabled, QStyle::State_Active})
            option.state |= below(4) ? flag : QStyle::State_None;
        for (QStyle::StateFlag flag :
             {QStyle::State_Selected, QStyle::State_HasFocus, QStyle::State_MouseOver})
            option.state |= below(4) ? QStyle::State_None : flag;
        option.direction = below(4) ? Qt::LeftToRight : Qt::RightToLeft;
        option.textElideMode = Qt::ElideRight;
        option.showDecorationSelected = below(8) > 0;
        option.decorationSize = QSize(16, 16);
        option.decorationPosition = QStyleOptionViewItem::Left;
        option.decorationAlignment = Qt::AlignCenter;
        option.font = m_view.font();
        if (below(3) == 0)
            option.font.setFamily(m_families.at(below(m_families.size())));
        if (below(4) == 0)
            option.font.setPointSizeF(7 + below(12) / 2.0);
        option.fontMetrics = QFontMetrics(option.font);
        if (below(2))
            option.features |= QStyleOptionViewItem::Alternate;
        return option;
    }

    std::mt19937& m_random;
    const QStringList m_families = QFontDatabase().families();
    QStandardItemModel m_model;
    QTableView m_view;
    LogDelegate m_delegate;
    PlainDelegate m_plain;
};

} // namespace

void tst_PlainCells::cells_data()
{
    QTest::addColumn<QString>("style");
    for (QString const& style : {QString("Fusion"), QString("Windows")})
        QTest::newRow(qPrintable(style)) << style;
}

void tst_PlainCells::cells()
{
    QFETCH(QString, style);
    QApplication::setStyle(QStyleFactory::create(style));
    std::mt19937 random(Rounds::seed());
    Cells cells(random);
    const int count = Rounds::count(1000, 20000);
    for (int i = 0; i < count; ++i) {
        const QString difference = cells.compare();
        QVERIFY2(difference.isEmpty(), qPrintable(difference));
    }
    std::printf("plain cells: %d in the style %s\n", count, qPrintable(style));
}

QTEST_MAIN(tst_PlainCells)
#include "tst_PlainCells.moc"
