// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/HistoryTime.h"

#include "app/logfile/LogTimeReader.h"

#include <QtTest>

using namespace Velocor;

class tst_HistoryTime : public QObject
{
    Q_OBJECT

private slots:
    void everyDay();
    void unknown();
    void noTexts_data();
    void noTexts();
    void now();
};

// As an entry of that time is read, and as Qt writes it.
void tst_HistoryTime::everyDay()
{
    const LogTimeReader reader("yyyy-MM-dd hh:mm:ss.zzz");
    QTime timeOfDay(0, 0);
    for (QDate day(1996, 2, 27); day < QDate(2105, 1, 1); day = day.addDays(1)) {
        const QDateTime moment(day, timeOfDay, Qt::UTC);
        const QByteArray entry = moment.toString("yyyy-MM-dd hh:mm:ss.zzz").toLatin1();
        const qint64 time = reader.Read(entry.constData(), entry.size()).key;
        const QByteArray text = QByteArray(entry).replace(' ', 'T');
        QCOMPARE(HistoryTime::DateTime(time), moment);
        QCOMPARE(HistoryTime::Text(time), text);
        QCOMPARE(HistoryTime::FromText(text), time);
        timeOfDay = timeOfDay.addMSecs(20011007);
    }
    const QDateTime last(QDate(2026, 11, 22), QTime(23, 59, 59, 999), Qt::UTC);
    QCOMPARE(HistoryTime::DateTime(HistoryTime::FromText("2026-11-22T23:59:59.999")), last);
}

void tst_HistoryTime::unknown()
{
    QVERIFY(!HistoryTime::DateTime(-1).isValid());
    QVERIFY(HistoryTime::DateTime(0).isValid());
    QVERIFY(HistoryTime::DateTime(1).isValid());
}

void tst_HistoryTime::noTexts_data()
{
    QTest::addColumn<QByteArray>("text");
    for (char const* text : {"", "x", "7", "14:03:02", "+5m", "2026-11-22T14:03:02.007 x"})
        QTest::newRow(text) << QByteArray(text);
}

void tst_HistoryTime::noTexts()
{
    QFETCH(QByteArray, text);
    QCOMPARE(HistoryTime::FromText(text), qint64(-1));
}

// In local time.
void tst_HistoryTime::now()
{
    const QDateTime moment(QDate(2026, 11, 22), QTime(14, 3, 2, 7));
    QCOMPARE(HistoryTime::Text(HistoryTime::OfEpoch(moment.toMSecsSinceEpoch())),
             QByteArray("2026-11-22T14:03:02.007"));
    const qint64 before = HistoryTime::OfEpoch(QDateTime::currentMSecsSinceEpoch());
    const qint64 now = HistoryTime::Now();
    const qint64 after = HistoryTime::OfEpoch(QDateTime::currentMSecsSinceEpoch());
    QVERIFY(before <= now && now <= after);
}

QTEST_GUILESS_MAIN(tst_HistoryTime)
#include "tst_HistoryTime.moc"
