// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogLineParser.h"

#include "app/logfile/ForeignLine.h"

#include <QTranslator>
#include <QtTest>

#include <random>

using namespace Velocor;

Q_DECLARE_METATYPE(LogEntry::Severity)

class tst_LogLineParser : public QObject
{
    Q_OBJECT

private slots:
    void parse_data();
    void parse();
    void startsOfLines_data();
    void startsOfLines();
    void resolution();
    void foreignFile_data();
    void foreignFile();
    void wideLine();
    void translatedLog();
    void settings_data();
    void settings();
    void anyBytes();
};

void tst_LogLineParser::parse_data()
{
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<bool>("isEntry");
    QTest::addColumn<QString>("time");
    QTest::addColumn<LogEntry::Severity>("severity");
    QTest::addColumn<QString>("elapsed");
    QTest::addColumn<QString>("message");

    const QByteArray stamp("2025-03-03 09:02:11.031");
    const QString time(stamp);
    const auto entry = [&](char const* name, QByteArray const& rest, LogEntry::Severity severity,
                           QString const& elapsed, QString const& message) {
        QTest::newRow(name) << QByteArray(stamp + ' ' + rest) << true << time << severity << elapsed
                            << message;
    };
    const auto noEntry = [](char const* name, QByteArray const& line) {
        QTest::newRow(name) << line << false << QString() << LogEntry::None << QString()
                            << QString::fromLatin1(line);
    };

    entry("trace", "Trace hello", LogEntry::Trace, "", "hello");
    entry("notification", "Notification hello", LogEntry::Notification, "", "hello");
    entry("warning", "Warning hello", LogEntry::Warning, "", "hello");
    entry("error", "Error hello", LogEntry::Error, "", "hello");
    entry("fatal", "Fatal hello", LogEntry::Fatal, "", "hello");
    entry("empty message", "Trace ", LogEntry::Trace, "", "");
    entry("cut after the name", "Trace", LogEntry::Trace, "", "");
    entry("blanks in front of the message stay", "Trace   x", LogEntry::Trace, "", "  x");
    entry("elapsed time", "Trace dT:[250] x", LogEntry::Trace, "250", "x");
    entry("negative elapsed time", "Trace dT:[-86399999] x", LogEntry::Trace, "-86399999", "x");
    entry("elapsed time alone", "Trace dT:[250] ", LogEntry::Trace, "250", "");
    entry("elapsed time at the end of a line", "Trace dT:[250]", LogEntry::Trace, "250", "");
    entry("elapsed time of the greatest length", "Trace dT:[" + QByteArray(476, '1') + "] x",
          LogEntry::Trace, QString(476, '1'), "x");
    entry("elapsed time beyond that", "Trace dT:[" + QByteArray(478, '1') + "] x", LogEntry::Trace,
          "", "dT:[" + QString(478, '1') + "] x");
    entry("elapsed time that is a minus", "Trace dT:[-] x", LogEntry::Trace, "", "dT:[-] x");
    entry("elapsed time without brackets", "Trace dT: x", LogEntry::Trace, "", "dT: x");
    entry("elapsed time without its start", "Trace dT:x12] x", LogEntry::Trace, "", "dT:x12] x");
    entry("elapsed time with another prefix", "Trace dt:[12] x", LogEntry::Trace, "", "dt:[12] x");
    entry("neither a name nor a message", " ", LogEntry::None, "", "");
    entry("elapsed time cut off", "Trace dT:", LogEntry::Trace, "", "dT:");
    entry("elapsed time without its end", "Trace dT:[250", LogEntry::Trace, "", "dT:[250");
    entry("elapsed time without number", "Trace dT:[] x", LogEntry::Trace, "", "dT:[] x");
    entry("elapsed time that a text follows", "Trace dT:[1]x", LogEntry::Trace, "", "dT:[1]x");
    entry("severity without a name", " x", LogEntry::None, "", "x");
    entry("severity name in the message", "Trace Error x", LogEntry::Trace, "", "Error x");
    entry("Latin-1", "Trace caf\xE9", LogEntry::Trace, "", QString::fromLatin1("caf\xE9"));

    noEntry("empty line", "");
    noEntry("plain text", "no stamp here");
    noEntry("severity name in plain text", "the last Error was this");
    noEntry("severity name as part of a word", stamp + " Traces x");
    noEntry("severity name far to the right", QByteArray(200, '1') + " Error x");
    noEntry("severity name after the longest stamp", QByteArray(80, '1') + " Error x");
    noEntry("severity name after a letter", "x Error y");
    noEntry("elapsed time without a stamp", "dT:[12] x");
    noEntry("severity name right after a stamp", stamp + "-Trace x");
    noEntry("stamp alone", stamp);
    noEntry("what make writes", "make: *** [Makefile:12: all] Error 1");

    const QByteArray longest(79, '1');
    QTest::newRow("the longest stamp")
        << QByteArray(longest + " Error x") << true << QString(longest) << LogEntry::Error << ""
        << "x";
    QTest::newRow("elapsed time after any stamp")
        << QByteArray("Mon 3rd Warning dT:[5] x") << true << "Mon 3rd" << LogEntry::Warning << "5"
        << "x";

    QTest::newRow("any stamp with a digit counts")
        << QByteArray("Mon 3rd Warning x") << true << "Mon 3rd" << LogEntry::Warning << ""
        << "x";
    QTest::newRow("empty stamp") << QByteArray(" Warning x") << true << "" << LogEntry::Warning
                                 << ""
                                 << "x";
}

void tst_LogLineParser::parse()
{
    QFETCH(QByteArray, line);
    const LogEntry entry = LogLineParser().Parse(line);
    QTEST(entry.isEntry, "isEntry");
    QTEST(entry.time, "time");
    QTEST(entry.severity, "severity");
    QTEST(entry.elapsed, "elapsed");
    QTEST(entry.message, "message");
}

void tst_LogLineParser::startsOfLines_data()
{
    QTest::addColumn<QByteArray>("line");
    for (char const* line :
         {"2025-03-03 09:02:11.031 Trace dT:[-12] x", "2025-03-03 09:02:11.031  x",
          "2025-03-03 09:02:11.5 Error dT:[12]", "Mon 3rd Warning dT:[5] x", " Fatal x"})
        QTest::newRow(line) << QByteArray(line);
}

// What follows the bytes of a line in memory does not matter.
void tst_LogLineParser::startsOfLines()
{
    QFETCH(QByteArray, line);
    const LogLineParser parser;
    for (int length = 0; length <= line.size(); ++length) {
        const QByteArray start(line.constData(), length);
        const LogLineParser::Parts alone = parser.Find(start.constData(), length);
        const LogLineParser::Parts parts = parser.Find(line.constData(), length);
        QCOMPARE(parts.isEntry, alone.isEntry);
        QCOMPARE(parts.timeLength, alone.timeLength);
        QCOMPARE(parts.timeKey, alone.timeKey);
        QCOMPARE(parts.severity, alone.severity);
        QCOMPARE(parts.elapsed, alone.elapsed);
        QCOMPARE(parts.elapsedLength, alone.elapsedLength);
        QCOMPARE(parts.message, alone.message);
        QVERIFY(parts.message <= length);
    }
}

// That of the format that the stamp has.
void tst_LogLineParser::resolution()
{
    const LogLineParser parser({"hh:mm", "hh:mm:ss"}, {});
    const auto resolutionOf = [&](QByteArray const& line) {
        return parser.Find(line.constData(), line.size()).resolution;
    };
    QCOMPARE(resolutionOf("09:02 Trace x"), 60000);
    QCOMPARE(resolutionOf("09:02:11 Trace x"), 1000);
    QCOMPARE(resolutionOf("2025-03-03 09:02:11.031 Trace x"), 1);
}

void tst_LogLineParser::foreignFile_data()
{
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<bool>("isForeign");
    QTest::newRow("date and time") << QByteArray("2026-03-03T09:02:11Z ERROR x") << true;
    QTest::newRow("time alone") << QByteArray("[09:02:11] ERROR x") << true;
    QTest::newRow("milliseconds") << QByteArray("2026-03-03 09:02:11,031 WARN x") << true;
    QTest::newRow("as the log writes it in an unknown format")
        << QByteArray("Mon 3rd Notification x") << false;
}

// Lines that are not another program's may be the log's own.
void tst_LogLineParser::foreignFile()
{
    QFETCH(QByteArray, line);
    QFETCH(bool, isForeign);
    LogFileType type;
    type.isForeign = true;
    type.latest = QDate(2026, 3, 3);
    LogLineParser parser;
    parser.SetFileType(type);
    const LogLineParser::Parts parts = parser.Find(line.constData(), line.size());
    const LogLineParser::Parts own = parser.FindOwn(line.constData(), line.size());
    const ForeignLine foreign = ForeignLine::Read(line.constData(), line.size(), type.latest);
    QCOMPARE(foreign.isEntry, isForeign);
    QVERIFY(parts.isEntry);
    QCOMPARE(parts.severity, isForeign ? foreign.severity : own.severity);
    QCOMPARE(parts.timeLength, isForeign ? foreign.time.length : own.timeLength);
    QCOMPARE(parts.timeKey, isForeign ? foreign.timeKey : own.timeKey);
    QCOMPARE(parts.hasDate, isForeign ? foreign.hasDate : own.hasDate);
    QCOMPARE(parts.resolution, isForeign ? foreign.resolution : own.resolution);
    QCOMPARE(parts.message, isForeign ? foreign.message.start : own.message);
}

void tst_LogLineParser::wideLine()
{
    LogFileType type;
    type.encoding = LogEncoding::Utf16Be;
    LogLineParser parser;
    parser.SetFileType(type);
    QByteArray line;
    for (char c : QByteArray("2025-03-03 09:02:11.031 Error \xE9"))
        line += '\0' + QByteArray(1, c);
    const LogEntry entry = parser.Parse(line);
    QCOMPARE(entry.time, QString("2025-03-03 09:02:11.031"));
    QCOMPARE(entry.severity, LogEntry::Error);
    QCOMPARE(entry.message, QString(QChar(0xE9)));
}

// A program may translate the framework's texts; what the window shows is in none of its logs.
void tst_LogLineParser::translatedLog()
{
    class Translator : public QTranslator
    {
    public:
        QString translate(char const* context, char const* text, char const*, int) const override
        {
            const QString name = QString(text).replace("Error", "Fehler");
            return qstrcmp(context, "QObject") == 0 ? name : name + " shown";
        }
        bool isEmpty() const override { return false; }
    };
    Translator translator;
    QCoreApplication::installTranslator(&translator);
    const LogLineParser parser;
    for (char const* name : {"Error", "Fehler"}) {
        const LogEntry entry = parser.Parse(QByteArray("2025-03-03 09:02:11.031 ") + name + " x");
        QCOMPARE(entry.severity, LogEntry::Error);
        QCOMPARE(entry.message, QString("x"));
    }
    QCOMPARE(parser.Parse("2025-03-03 09:02:11.031 Fehler shown").message, QString("shown"));
}

void tst_LogLineParser::settings_data()
{
    QTest::addColumn<QString>("format");
    QTest::addColumn<QString>("prefix");
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<QString>("time");
    QTest::addColumn<QString>("elapsed");
    QTest::addColumn<QString>("message");

    QTest::newRow("own format") << "dd.MM. hh:mm"
                                << "dT:" << QByteArray("03.03. 09:02 Trace x") << "03.03. 09:02"
                                << ""
                                << "x";
    QTest::newRow("the default format as well")
        << "dd.MM. hh:mm"
        << "dT:" << QByteArray("2025-03-03 09:02:11.031 Trace x") << "2025-03-03 09:02:11.031"
        << ""
        << "x";
    QTest::newRow("a severity name in the stamp")
        << "'Error' hh:mm"
        << "dT:" << QByteArray("Error 09:02 Trace x") << "Error 09:02"
        << ""
        << "x";
    QTest::newRow("own prefix with a blank")
        << "hh:mm"
        << "it took " << QByteArray("09:02 Trace it took [3] x") << "09:02"
        << "3"
        << "x";
    QTest::newRow("own prefix without a number")
        << "hh:mm"
        << "it took " << QByteArray("09:02 Trace it took long") << "09:02"
        << ""
        << "it took long";
    QTest::newRow("own prefix at the start of a line")
        << "hh:mm"
        << "x Error " << QByteArray("x Error [3] y") << ""
        << ""
        << "x Error [3] y";
    QTest::newRow("empty settings")
        << ""
        << "" << QByteArray("2025-03-03 09:02:11.031 Trace dT:[3] x") << "2025-03-03 09:02:11.031"
        << "3"
        << "x";
}

void tst_LogLineParser::settings()
{
    QFETCH(QString, format);
    QFETCH(QString, prefix);
    QFETCH(QByteArray, line);
    const LogEntry entry = LogLineParser({format}, {prefix}).Parse(line);
    QTEST(entry.time, "time");
    QTEST(entry.elapsed, "elapsed");
    QTEST(entry.message, "message");
}

// No bytes are read beyond the line, and the parts always add up. Also meant for the sanitizers.
void tst_LogLineParser::anyBytes()
{
    std::mt19937 random(1);
    const LogLineParser parser({"dddd, d MMMM yyyy h:mm:ss AP"}, {"t["});
    const QByteArray seed(
        "2025-03-03 09:02:11.031 Trace dT:[250] x Monday, 3 March 2025 9:30:00 PM "
        "Error t[[1] y");
    for (int i = 0; i < 20000; ++i) {
        QByteArray line =
            seed.mid(static_cast<int>(random() % 90), static_cast<int>(random() % 90));
        for (int change = static_cast<int>(random() % 4); change > 0 && !line.isEmpty(); --change)
            line[static_cast<int>(random() % static_cast<unsigned>(line.size()))] =
                static_cast<char>(random());
        const QByteArray exact(line.constData(), line.size());
        const LogLineParser::Parts parts = parser.Find(exact.constData(), exact.size());
        QVERIFY(parts.timeLength >= 0 && parts.timeLength <= exact.size());
        QVERIFY(parts.message >= parts.timeLength && parts.message <= exact.size());
        QVERIFY(parts.elapsed + parts.elapsedLength <= exact.size());
        QVERIFY(parser.Parse(exact).message.size() == exact.size() - parts.message);
    }
}

QTEST_GUILESS_MAIN(tst_LogLineParser)
#include "tst_LogLineParser.moc"
