// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LevelNames.h"

#include "support/GuardedBytes.h"

#include <QtTest>

using namespace Velocor;

Q_DECLARE_METATYPE(LogEntry::Severity)

namespace {

constexpr auto Trace = LogEntry::Trace;
constexpr auto Notification = LogEntry::Notification;
constexpr auto Warning = LogEntry::Warning;
constexpr auto Error = LogEntry::Error;
constexpr auto Fatal = LogEntry::Fatal;
constexpr auto None = LogEntry::None;

LogEntry::Severity Named(QByteArray const& name, LevelNames::Match match)
{
    GuardedBytes guarded;
    return LevelNames::Named(guarded.Put(name, true), name.size(), match);
}

bool IsEveryday(QByteArray const& name)
{
    GuardedBytes guarded;
    return LevelNames::IsEveryday(guarded.Put(name, true), name.size());
}

} // namespace

class tst_LevelNames : public QObject
{
    Q_OBJECT

private slots:
    void names_data();
    void names();
    void noNames_data();
    void noNames();
    void twoNames();
    void letters();
    void symbols_data();
    void symbols();
    void numbers_data();
    void numbers();
};

void tst_LevelNames::names_data()
{
    QTest::addColumn<LogEntry::Severity>("severity");
    QTest::addColumn<bool>("isEveryday");
    const auto rows = [](LogEntry::Severity severity, bool isEveryday, QList<QByteArray> names) {
        for (QByteArray const& name : names)
            QTest::newRow(name.constData()) << severity << isEveryday;
    };
    rows(Fatal, false, {"EMERG", "CRIT", "CRITICAL", "FATAL"});
    rows(Fatal, true, {"EMERGENCY", "PANIC", "ALERT"});
    rows(Error, false, {"ERROR", "ERR"});
    rows(Error, true, {"SEVERE"});
    rows(Warning, false, {"WARNING", "WARN", "WRN"});
    rows(Notification, false, {"NOTIFICATION", "INFO", "INF", "INFORMATIONAL"});
    rows(Notification, true, {"NOTICE", "NOTE", "INFORMATION", "LOG", "SUCCESS", "CONFIG"});
    rows(Trace, false,
         {"DEBUG", "DEBUG1", "DEBUG2", "DEBUG3", "DEBUG4", "DEBUG5", "DBG", "TRACE", "TRC",
          "VERBOSE"});
    rows(Trace, true, {"FINE", "FINER", "FINEST"});
}

void tst_LevelNames::names()
{
    QFETCH(LogEntry::Severity, severity);
    QFETCH(bool, isEveryday);
    const QByteArray upper(QTest::currentDataTag());
    QCOMPARE(Named(upper, LevelNames::Match::UpperCase), severity);
    QCOMPARE(Named(upper, LevelNames::Match::AnyCase), severity);
    QCOMPARE(IsEveryday(upper), isEveryday);
    const QByteArray lower = upper.toLower();
    const QByteArray mixed = upper.left(1) + lower.mid(1);
    for (QByteArray const& name : {lower, mixed}) {
        QCOMPARE(Named(name, LevelNames::Match::AnyCase), severity);
        QCOMPARE(Named(name, LevelNames::Match::UpperCase), None);
        QCOMPARE(LevelNames::Named(name.constData(), name.size()), severity);
        QCOMPARE(IsEveryday(name), isEveryday);
    }
}

void tst_LevelNames::noNames_data()
{
    QTest::addColumn<QByteArray>("name");
    QTest::newRow("empty") << QByteArray();
    QTest::newRow("too long") << QByteArray("ERRORS");
    QTest::newRow("too short") << QByteArray("ER");
    QTest::newRow("a zero byte after it") << QByteArray("NOTE\0", 5);
    QTest::newRow("a zero byte, and another name") << QByteArray("ERR\0WARN", 8);
    QTest::newRow("a character above the small letters") << QByteArray("{RROR");
}

void tst_LevelNames::noNames()
{
    QFETCH(QByteArray, name);
    QCOMPARE(Named(name, LevelNames::Match::AnyCase), None);
    QCOMPARE(Named(name, LevelNames::Match::UpperCase), None);
    QVERIFY(!IsEveryday(name));
}

// The names are next to each other in memory.
void tst_LevelNames::twoNames()
{
    const QList<QByteArray> names{"EMERG", "PANIC",  "ALERT",   "CRIT", "FATAL",   "ERROR",
                                  "ERR",   "SEVERE", "WARNING", "WARN", "WRN",     "NOTICE",
                                  "NOTE",  "INFO",   "INF",     "LOG",  "SUCCESS", "CONFIG",
                                  "DEBUG", "DBG",    "TRACE",   "TRC",  "VERBOSE", "FINE"};
    for (QByteArray const& one : names) {
        for (QByteArray const& other : names)
            QCOMPARE(Named(one + '\0' + other, LevelNames::Match::UpperCase), None);
    }
}

// Small letters are none of them.
void tst_LevelNames::letters()
{
    const QHash<char, LogEntry::Severity> known{
        {'F', Fatal},        {'A', Fatal},        {'C', Fatal}, {'E', Error}, {'W', Warning},
        {'I', Notification}, {'N', Notification}, {'D', Trace}, {'T', Trace}, {'V', Trace}};
    for (int letter = 0; letter < 256; ++letter)
        QCOMPARE(LevelNames::OfLetter(char(letter)), known.value(char(letter), None));
}

void tst_LevelNames::symbols_data()
{
    QTest::addColumn<QByteArray>("symbol");
    QTest::addColumn<LogEntry::Severity>("severity");
    const auto row = [](char const* symbol, LogEntry::Severity severity) {
        QTest::newRow(symbol) << QByteArray(symbol) << severity;
    };
    row("EE", Error);
    row("WW", Warning);
    for (char const* symbol : {"II", "!!", "**", "==", "--", "++", "NI", "\?\?"})
        row(symbol, Notification);
    for (char const* symbol : {"ee", "E", "EEE", ""})
        row(symbol, None);
}

void tst_LevelNames::symbols()
{
    QFETCH(QByteArray, symbol);
    GuardedBytes guarded;
    QTEST(LevelNames::OfSymbol(guarded.Put(symbol, true), symbol.size()), "severity");
}

void tst_LevelNames::numbers_data()
{
    QTest::addColumn<qint64>("number");
    QTest::addColumn<LogEntry::Severity>("ofPriority");
    QTest::addColumn<LogEntry::Severity>("ofNumber");
    const auto row = [](qint64 number, LogEntry::Severity ofPriority, LogEntry::Severity ofNumber) {
        QTest::newRow(QByteArray::number(number).constData()) << number << ofPriority << ofNumber;
    };
    const LogEntry::Severity priorities[] = {Fatal,   Fatal,        Fatal,        Error,
                                             Warning, Notification, Notification, Trace};
    for (int priority = 0; priority < 8; ++priority)
        row(priority, priorities[priority], priorities[priority]);
    for (qint64 number : {std::numeric_limits<qint64>::min(), qint64(-1), qint64(8), qint64(9),
                          qint64(70), std::numeric_limits<qint64>::max()})
        row(number, None, None);
    const LogEntry::Severity tens[] = {Trace, Trace, Notification, Warning, Error, Fatal};
    for (int ten = 1; ten <= 6; ++ten) {
        row(10 * ten, None, tens[ten - 1]);
        row(10 * ten + 9, None, tens[ten - 1]);
    }
}

void tst_LevelNames::numbers()
{
    QFETCH(qint64, number);
    QTEST(LevelNames::OfPriority(number), "ofPriority");
    QTEST(LevelNames::OfNumber(number), "ofNumber");
}

QTEST_APPLESS_MAIN(tst_LevelNames)
#include "tst_LevelNames.moc"
