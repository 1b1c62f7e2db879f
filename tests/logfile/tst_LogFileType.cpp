// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFileType.h"

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogLineParser.h"
#include "support/GuardedBytes.h"

#include <QtTest>

using namespace Velocor;

namespace {

LogFileType TypeOf(QByteArray const& head, LogEncoding chosen = LogEncoding::Automatic)
{
    return LogFileType::Of(head, LogLineParser(), chosen, QDate(2026, 11, 25));
}

QByteArray Utf16Le(QString const& text)
{
    return QByteArray(reinterpret_cast<char const*>(text.utf16()), 2 * text.size());
}

struct Indexed
{
    QStringList rows;
    LogRows marks;
    bool hasTimes;
    bool hasSeverities;
};

// The lines that an index finds in a file, read in pieces of some bytes.
Indexed IndexOf(QByteArray const& file, int piece)
{
    LogLineParser parser;
    const LogFileType type = TypeOf(file);
    parser.SetFileType(type);
    LogIndex index(parser);
    index.Begin();
    for (int at = 0; at < file.size(); at += piece)
        index.Feed(file.constData() + at, qMin(piece, file.size() - at));
    index.End();
    Indexed result{{}, index.Rows(LogFilter()), index.hasTimes(), index.hasSeverities()};
    for (size_t row = 0; row < result.marks.size(); ++row) {
        const int start = static_cast<int>(result.marks.start(row));
        const bool isLast = row + 1 == result.marks.size();
        const int end = isLast ? file.size() : static_cast<int>(result.marks.start(row + 1));
        result.rows += parser.Text(file.mid(start, end - start));
    }
    return result;
}

} // namespace

class tst_LogFileType : public QObject
{
    Q_OBJECT

private slots:
    void owner_data();
    void owner();
    void readsNothingElse();
    void isLike();
    void encoding_data();
    void encoding();
    void chosenEncoding();
    void knownOwner();
    void content_data();
    void content();
    void controls();
    void oneRun_data();
    void oneRun();
    void everyLine_data();
    void everyLine();
    void filter_data();
    void filter();
    void columns_data();
    void columns();
};

void tst_LogFileType::owner_data()
{
    QTest::addColumn<QByteArray>("head");
    QTest::addColumn<bool>("isForeign");
    QTest::addColumn<bool>("isOwn");

    const auto row = [](char const* name, QByteArray const& head, bool isForeign, bool isOwn) {
        QTest::newRow(name) << head << isForeign << isOwn;
    };
    const QByteArray own("2026-11-22 14:03:02.123 Trace x\n");
    row("empty", "", false, false);
    row("text", "some\ntext\n", false, false);
    row("the log's own", own, false, true);
    row("the log's own, with lines of others", "Nov 22 14:03:02 host x\n" + own, false, true);
    row("the log's own in another format", "22.11.2026 14:03:02 Error x\n", false, false);
    row("the log's own with dates as others write them", "2026-11-22 14:03:02 Error x\n", false,
        false);
    row("the log's own with a stamp that is torn",
        "2026-11-22 14:03:02.12026-11-22 14:03 Error x\n", false, false);
    row("a severity that the log does not have",
        "2026-11-22 14:03:02 Error x\n"
        "2026-11-22 14:03:02 INFO x\n",
        true, false);
    row("padded severities", "2026-11-22 14:03:02.123  INFO x\n", true, false);
    row("syslog", "Nov 22 14:03:02 host x\n", true, false);
    row("JSON", "{\"level\":\"info\"}\n", true, false);
    row("only severities", "[INFO] x\n[ERROR] y\n", true, false);
    row("only severities that the log has", "1 Error x\n[ERROR] y\n", false, false);
    row("syslog, and a line that the log may have written", "Nov 22 14:03:02 host x\n1 Error x\n",
        true, false);
    row("the log's own after the start of a journal", "__CURSOR=1\n" + own, false, true);
    row("a severity at the end of a line", "2026-11-22 14:03:02.123 Trace\r\n", false, true);
    const QByteArray json("{\"level\":\"info\",\"a\":\"");
    row("an incomplete line, one byte short of all that is looked at",
        json.leftJustified(LogFileType::HeadSize - 1, 'x'), false, false);
    row("an incomplete line of all that is looked at",
        json.leftJustified(LogFileType::HeadSize, 'x'), true, false);
    row("an incomplete line", "2026-11-22 14:03:02.1", false, false);
    row("a long first line", "{\"level\":\"info\",\"a\":\"" + QByteArray(70000, 'x'), true, false);
}

void tst_LogFileType::owner()
{
    QFETCH(QByteArray, head);
    const LogFileType type = TypeOf(head.left(LogFileType::HeadSize));
    QTEST(type.isForeign, "isForeign");
    QTEST(type.isOwn, "isOwn");
    QVERIFY(!type.isJournal);
    QCOMPARE(type.latest, QDate(2026, 11, 25));
}

// An empty first line has nothing before it.
void tst_LogFileType::readsNothingElse()
{
    GuardedBytes guarded;
    for (QByteArray const& head : {QByteArray("\n"), QByteArray("\r\n"), QByteArray("\nx\r")}) {
        for (bool isAtEnd : {false, true}) {
            char const* const at = guarded.Put(head, isAtEnd);
            QVERIFY(!TypeOf(QByteArray::fromRawData(at, head.size())).isForeign);
        }
    }
}

void tst_LogFileType::isLike()
{
    const auto type = [](LogEncoding::Kind kind, bool isForeign, bool isJournal) {
        LogFileType result;
        result.encoding = kind;
        result.isForeign = isForeign;
        result.isJournal = isJournal;
        return result;
    };
    const LogFileType one = type(LogEncoding::Utf8, true, false);
    LogFileType same = one;
    same.isOwn = true; // has no effect on how lines are split
    same.latest = QDate(2026, 11, 22);
    QVERIFY(one.IsLike(same));
    QVERIFY(!one.IsLike(type(LogEncoding::Latin1, true, false)));
    QVERIFY(!one.IsLike(type(LogEncoding::Utf8, false, false)));
    QVERIFY(!one.IsLike(type(LogEncoding::Utf8, true, true)));
    QVERIFY(!one.IsLike(type(LogEncoding::Latin1, false, true)));
}

void tst_LogFileType::encoding_data()
{
    QTest::addColumn<QByteArray>("head");
    QTest::addColumn<int>("kind");

    const auto row = [](char const* name, QByteArray const& head, LogEncoding::Kind kind) {
        QTest::newRow(name) << head << int(kind);
    };
    const QString text = "caf\u00e9\n";
    const QString own = "2026-11-22 14:03:02.123 Trace " + text;
    const QString foreign = "Nov 22 14:03:02 host " + text;
    row("the log's own is Latin-1, whatever it looks like", own.toUtf8(), LogEncoding::Latin1);
    row("the log's own in another format", "1 Error " + text.toUtf8(), LogEncoding::Latin1);
    row("the log's own after an editor marked it", "\xEF\xBB\xBF" + own.toUtf8(),
        LogEncoding::Utf8);
    row("another's in UTF-8", foreign.toUtf8(), LogEncoding::Utf8);
    row("another's in Latin-1", foreign.toLatin1(), LogEncoding::Latin1);
    row("another's in UTF-16", Utf16Le(foreign), LogEncoding::Utf16Le);
    row("text in UTF-8", text.toUtf8(), LogEncoding::Utf8);
    row("text in Latin-1", text.toLatin1(), LogEncoding::Latin1);
}

void tst_LogFileType::encoding()
{
    QFETCH(QByteArray, head);
    QTEST(int(TypeOf(head).encoding.kind()), "kind");
}

void tst_LogFileType::chosenEncoding()
{
    const QByteArray text = Utf16Le("Nov 22 14:03:02 host x\n");
    const LogEncoding kinds[] = {LogEncoding::Latin1, LogEncoding::Utf8, LogEncoding::Utf16Le,
                                 LogEncoding::Utf16Be};
    for (LogEncoding kind : kinds) {
        const LogFileType type = TypeOf(text, kind);
        QCOMPARE(type.encoding.kind(), kind.kind());
        QCOMPARE(type.isForeign, kind == LogEncoding::Utf16Le);
    }
}

void tst_LogFileType::content_data()
{
    QTest::addColumn<QByteArray>("head");
    QTest::addColumn<int>("content");

    const auto row = [](char const* name, QByteArray const& head, LogFileType::Content content) {
        QTest::newRow(name) << head << int(content);
    };
    QByteArray noise;
    for (unsigned i = 0; i < 4096; ++i)
        noise += char((i * 2654435761u) >> 13);
    const QByteArray line("Nov 22 14:03:02 host x\n");
    row("text", line, LogFileType::Text);
    row("empty", "", LogFileType::Text);
    row("gzip", "\x1F\x8B\x08" + noise, LogFileType::Gzip);
    row("xz",
        QByteArray("\xFD"
                   "7zXZ\0",
                   6) +
            noise,
        LogFileType::Xz);
    row("xz, whatever follows",
        QByteArray("\xFD"
                   "7zXZ\0\1",
                   7) +
            noise,
        LogFileType::Xz);
    row("nearly xz",
        QByteArray("\xFD"
                   "7zXZ\1",
                   6) +
            noise,
        LogFileType::Binary);
    row("bzip2", "BZh91AY&SY" + noise, LogFileType::Bzip2);
    row("a line that begins like bzip2", "BZh9 is a line\n", LogFileType::Text);
    row("zstd", "\x28\xB5\x2F\xFD" + noise, LogFileType::Zstd);
    row("another binary file", noise, LogFileType::Binary);
    row("UTF-16", Utf16Le(line), LogFileType::Text);
    row("the log's own, whatever it holds", "2026-11-22 14:03:02.123 Trace x\n" + noise,
        LogFileType::Text);
    row("colors and progress", QByteArray("\x1B[1m10%\x1B[0m\b\b\b\r\n").repeated(9),
        LogFileType::Text);
    row("a control in twenty characters", "\1" + QByteArray(19, 'x'), LogFileType::Text);
    row("a control in less than twenty", "\1" + QByteArray(18, 'x'), LogFileType::Binary);
    row("controls between zeros", QByteArray("\0\1\0\1", 4) + QByteArray(70, 'x'),
        LogFileType::Binary);
    row("zeros after a power failure", line + QByteArray(4096, '\0'), LogFileType::Text);
}

void tst_LogFileType::content()
{
    QFETCH(QByteArray, head);
    QTEST(int(TypeOf(head).content), "content");
}

// Which characters text does not have.
void tst_LogFileType::controls()
{
    for (int code = 0; code < 256; ++code) {
        const bool isText = code >= 0x20 || (code >= '\a' && code <= '\r') || code == 0x1B;
        QCOMPARE(LogFileType::ContentOf(QByteArray(10, char(code)), LogEncoding::Latin1),
                 isText ? LogFileType::Text : LogFileType::Binary);
    }
}

// A torn line may look like anything.
void tst_LogFileType::knownOwner()
{
    LogLineParser parser;
    parser.SetOwn(true);
    for (char const* line :
         {"", "Nov 22 14:03:02 host x\n", "\xEF\xBB\xBF{\"level\":\"info\"}\n"}) {
        const LogFileType type =
            LogFileType::Of(line, parser, LogEncoding::Automatic, QDate(2026, 11, 25));
        QVERIFY(type.isOwn && !type.isForeign);
        QCOMPARE(type.encoding.kind(), LogEncoding::Latin1);
        QCOMPARE(LogFileType::Of(line, parser, LogEncoding::Utf8, QDate()).encoding.kind(),
                 LogEncoding::Utf8);
    }
}

void tst_LogFileType::oneRun_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::newRow("clock set back") << QByteArray("2026-11-22 14:03:02 INFO a\nmore\n"
                                                  "2026-11-20 14:03:02 INFO b\n");
    QTest::newRow("turn of the year") << QByteArray("Dec 31 23:59:59 host a\nmore\n"
                                                    "Jan  1 00:00:01 host b\n");
    QTest::newRow("midnight") << QByteArray("23:59:59 INFO a\nmore\n00:00:01 INFO b\n");
    QTest::newRow("started again") << QByteArray("[  100.000000] a\nmore\n[    0.000000] b\n");
    QTest::newRow("the log's own stamps") << QByteArray("2026-11-22 14:03:02.123 INFO a\nmore\n"
                                                        "2026-11-20 14:03:02.123 INFO b\n");
}

void tst_LogFileType::oneRun()
{
    QFETCH(QByteArray, file);
    const Indexed index = IndexOf(file, 4096);
    QCOMPARE(index.marks.earlier(), size_t(0));
    QCOMPARE(index.marks.size(), size_t(3));
    QVERIFY(index.marks.mark(0) & LogRows::Timed);
    QVERIFY(index.marks.mark(1) & LogRows::Continued);
}

void tst_LogFileType::everyLine_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<QStringList>("rows");

    // In the second line, halves of two characters look like a line end.
    const QString text = "14:03:02 INFO \u20ac\n\u0a0a\u0a41\u0100\u0a41\u000a\n";
    const QStringList lines({"14:03:02 INFO \u20ac\n", "\u0a0a\u0a41\u0100\u0a41\n", "\n"});
    QByteArray big = Utf16Le(text);
    for (int i = 0; i < big.size(); i += 2)
        std::swap(big.data()[i], big.data()[i + 1]);
    QTest::newRow("UTF-8") << text.toUtf8() << lines;
    QTest::newRow("UTF-16 LE") << QByteArray("\xFF\xFE" + Utf16Le(text)) << lines;
    QTest::newRow("UTF-16 BE") << QByteArray("\xFE\xFF" + big) << lines;
    QTest::newRow("UTF-16 that ends in half a character")
        << QByteArray("\xFF\xFE" + Utf16Le(text) + 'x')
        << lines + QStringList(QChar(QChar::ReplacementCharacter));
    QTest::newRow("bytes that are not UTF-8")
        << QByteArray("\xEF\xBB\xBF"
                      "a\xFF\nb\n")
        << QStringList({"a" + QString(QChar::ReplacementCharacter) + "\n", "b\n"});
    QTest::newRow("journal export")
        << QByteArray("__CURSOR=1\nMESSAGE=a\n\n__CURSOR=2\nMESSAGE=bc\n\n__CURSOR=3\n\n")
        << QStringList(
               {"__CURSOR=1\nMESSAGE=a\n\n", "__CURSOR=2\nMESSAGE=bc\n\n", "__CURSOR=3\n\n"});
}

void tst_LogFileType::everyLine()
{
    QFETCH(QByteArray, file);
    QFETCH(QStringList, rows);
    for (int piece = 1; piece < 20; ++piece)
        QCOMPARE(IndexOf(file, piece).rows, rows);
}

void tst_LogFileType::filter_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("count");
    QTest::newRow("a text") << "caf\u00e9" << 1;
    QTest::newRow("another") << "cafe" << 0;
    QTest::newRow("start of a line") << "^14:03:0[23]" << 2;
    QTest::newRow("end of a line") << "[^ ]\u20ac$" << 1;
    QTest::newRow("a whole line") << "^14:03:03 INFO x\u20ac$" << 1;
}

// Expressions see the text of a line without its end, in every encoding.
void tst_LogFileType::filter()
{
    QFETCH(QString, text);
    QFETCH(int, count);
    const QString lines("14:03:02 INFO caf\u00e9 \u20ac\r\n14:03:03 INFO x\u20ac\r\n");
    LogFilter filter;
    QVERIFY(filter.SetText(text, true, true));
    for (QByteArray const& file : {"\xEF\xBB\xBF" + lines.toUtf8(), lines.toUtf8(), Utf16Le(lines),
                                   "\xFF\xFE" + Utf16Le(lines)}) {
        LogLineParser parser;
        parser.SetFileType(TypeOf(file));
        LogIndex index(parser, filter);
        index.Begin();
        index.Feed(file.constData(), file.size());
        index.End();
        QCOMPARE(index.Rows(filter).size(), size_t(count));
    }
}

void tst_LogFileType::columns_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<bool>("hasTimes");
    QTest::addColumn<bool>("hasSeverities");
    QTest::newRow("both") << QByteArray("14:03:02 INFO a\n") << true << true;
    QTest::newRow("times") << QByteArray("a\n14:03:02 a\n") << true << false;
    QTest::newRow("severities") << QByteArray("a\n[ERROR] a\n") << false << true;
    QTest::newRow("neither") << QByteArray("a\nb\n") << false << false;
}

void tst_LogFileType::columns()
{
    QFETCH(QByteArray, file);
    const Indexed index = IndexOf(file, 4096);
    QTEST(index.hasTimes, "hasTimes");
    QTEST(index.hasSeverities, "hasSeverities");
}

QTEST_GUILESS_MAIN(tst_LogFileType)
#include "tst_LogFileType.moc"
