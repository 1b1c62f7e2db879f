// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkScreenFit_p.h"

#include <QtTest>

#include <limits>

// What no usual screen shows: a desktop as small as the smallest window, and edges that wrap.
class tst_TorkScreenFit : public QObject
{
    Q_OBJECT

private slots:
    void fits_data();
    void fits();
};

void tst_TorkScreenFit::fits_data()
{
    QTest::addColumn<QSize>("desktop");
    QTest::addColumn<QPoint>("storedPosition");
    QTest::addColumn<QSize>("storedSize");
    QTest::addColumn<QPoint>("position");
    QTest::addColumn<QSize>("size");

    const QSize usual(1920, 1080);
    const QSize smallest(320, 200);
    const int most = std::numeric_limits<int>::max();
    const auto row = [](char const* name, QSize desktop, TorkWindowRect const& stored,
                        TorkWindowRect const& fitted) {
        QTest::newRow(name) << desktop << stored.position << stored.size << fitted.position
                            << fitted.size;
    };
    row("left edge, negative width", usual, {{0, 10}, {-1, 400}}, {{0, 10}, {-1, 400}});
    row("top edge, negative height", usual, {{10, 0}, {400, -1}}, {{10, 0}, {400, -1}});
    row("smallest, negative width", smallest, {{0, 0}, {-1, 200}}, {{0, 0}, {-1, 199}});
    row("smallest, negative height", smallest, {{0, 0}, {320, -1}}, {{0, 0}, {319, -1}});
    row("smallest, right edge wraps", smallest, {{1, 0}, {most, 200}}, {{0, 0}, {319, 199}});
    row("smallest, bottom edge wraps", smallest, {{0, 1}, {320, most}}, {{0, 0}, {319, 199}});
}

void tst_TorkScreenFit::fits()
{
    QFETCH(QSize, desktop);
    QFETCH(QPoint, storedPosition);
    QFETCH(QSize, storedSize);
    const TorkWindowRect fitted = TorkFitToDesktop(
        storedPosition.x(), storedPosition.y(), storedSize.width(), storedSize.height(), desktop);
    QTEST(fitted.position, "position");
    QTEST(fitted.size, "size");
}

QTEST_GUILESS_MAIN(tst_TorkScreenFit)

#include "tst_TorkScreenFit.moc"
