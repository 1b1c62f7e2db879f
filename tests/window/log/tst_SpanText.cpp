// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/log/SpanText.h"

#include <QtTest>

using namespace Velocor;

class tst_SpanText : public QObject
{
    Q_OBJECT

private slots:
    void texts_data();
    void texts();
};

void tst_SpanText::texts_data()
{
    QTest::addColumn<qint64>("span");
    QTest::addColumn<QString>("brief");
    QTest::addColumn<QString>("words");

    const auto row = [](char const* name, qint64 span, char const* brief, char const* words) {
        QTest::newRow(name) << span << QString::fromLatin1(brief) << QString::fromLatin1(words);
    };
    row("nothing", 0, "0 ms", "0 milliseconds");
    row("one millisecond", 1, "1 ms", "1 millisecond");
    row("less than a second", 999, "999 ms", "999 milliseconds");
    row("one second", 1000, "1 s", "1 second");
    row("a bit more than a second", 1001, "1.001 s", "1.001 seconds");
    row("whole seconds have no fraction", 5000, "5 s", "5 seconds");
    row("less than a minute", 59999, "59.999 s", "59.999 seconds");
    row("one minute", 60000, "1 min 00 s", "1 minute");
    row("milliseconds are cut off after a minute", 61999, "1 min 01 s", "1 minute 1 second");
    row("less than an hour", 3599999, "59 min 59 s", "59 minutes 59 seconds");
    row("one hour", 3600000, "1 h 00 min", "1 hour");
    row("seconds are cut off after an hour", 7659000, "2 h 07 min", "2 hours 7 minutes");
    row("less than a day", 86399999, "23 h 59 min", "23 hours 59 minutes");
    row("one day", 86400000, "1 d 00 h", "1 day");
    row("minutes are cut off after a day", 2 * 86400000 + 3600000 * 2 - 1, "2 d 01 h",
        "2 days 1 hour");
    row("many days", Q_INT64_C(400) * 86400000, "400 d 00 h", "400 days");
}

void tst_SpanText::texts()
{
    QFETCH(qint64, span);
    QFETCH(QString, brief);
    QFETCH(QString, words);
    QCOMPARE(SpanText::Short(span), brief);
    QCOMPARE(SpanText::Words(span), words);
    if (span > 0)
        QCOMPARE(SpanText::Short(-span), '-' + brief);
}

QTEST_APPLESS_MAIN(tst_SpanText)
#include "tst_SpanText.moc"
