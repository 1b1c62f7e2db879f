// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogEncoding.h"

#include <QtTest>

#include <random>

using namespace Velocor;

Q_DECLARE_METATYPE(LogEncoding)
Q_DECLARE_METATYPE(LogLineEnd)

namespace {

QByteArray Wide(QString const& text, LogEncoding encoding)
{
    QByteArray bytes;
    for (QChar c : text) {
        const char low = static_cast<char>(c.cell());
        const char high = static_cast<char>(c.row());
        bytes += encoding == LogEncoding::Utf16Le ? low : high;
        bytes += encoding == LogEncoding::Utf16Le ? high : low;
    }
    return bytes;
}

QString const Replacement(QChar::ReplacementCharacter);

} // namespace

class tst_LogEncoding : public QObject
{
    Q_OBJECT

private slots:
    void detect_data();
    void detect();
    void decode_data();
    void decode();
    void narrowUtf8_data();
    void narrowUtf8();
    void secondMark();
    void validUtf8();
    void lineEnds_data();
    void lineEnds();
    void lineEndsInPieces();
    void carriageReturn();
};

void tst_LogEncoding::detect_data()
{
    QTest::addColumn<QByteArray>("head");
    QTest::addColumn<LogEncoding>("encoding");

    const auto row = [](char const* name, QByteArray const& head, LogEncoding encoding) {
        QTest::newRow(name) << head << encoding;
    };
    const QString text = "error: caf\u00e9\n";
    row("nothing", "", LogEncoding::Utf8);
    row("ASCII", "error\n", LogEncoding::Utf8);
    row("UTF-8", text.toUtf8(), LogEncoding::Utf8);
    row("UTF-8 with a mark", "\xEF\xBB\xBF" + text.toLatin1(), LogEncoding::Utf8);
    row("UTF-8, cut in a character", text.toUtf8().left(11), LogEncoding::Utf8);
    row("Latin-1", text.toLatin1(), LogEncoding::Latin1);
    row("overlong", "a\xC0\xAF", LogEncoding::Latin1);
    row("a surrogate", "a\xED\xA0\x80", LogEncoding::Latin1);
    row("above the last character", "a\xF4\x90\x80\x80", LogEncoding::Latin1);
    row("a rest alone", "a\x80", LogEncoding::Latin1);
    row("UTF-16 LE with a mark", "\xFF\xFE" + Wide(text, LogEncoding::Utf16Le),
        LogEncoding::Utf16Le);
    row("UTF-16 BE with a mark", "\xFE\xFF" + Wide(text, LogEncoding::Utf16Be),
        LogEncoding::Utf16Be);
    row("UTF-16 LE", Wide(text, LogEncoding::Utf16Le), LogEncoding::Utf16Le);
    row("UTF-16 BE", Wide(text, LogEncoding::Utf16Be), LogEncoding::Utf16Be);
    row("some zero bytes", QByteArray("a\0b\0cdefghijkl\n", 15), LogEncoding::Utf8);
    row("only zero bytes", QByteArray(100, '\0'), LogEncoding::Utf8);
}

void tst_LogEncoding::detect()
{
    QFETCH(QByteArray, head);
    QFETCH(LogEncoding, encoding);
    QCOMPARE(LogEncoding::Detect(head).kind(), encoding.kind());
}

void tst_LogEncoding::decode_data()
{
    QTest::addColumn<LogEncoding>("encoding");
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QString>("text");

    const auto row = [](char const* name, LogEncoding encoding, QByteArray const& bytes,
                        QString const& text) {
        QTest::newRow(name) << encoding << bytes << text;
    };
    const LogEncoding le = LogEncoding::Utf16Le;
    const LogEncoding be = LogEncoding::Utf16Be;
    const QString text = "a\u00e9\u20ac\U0001F600";
    row("Latin-1", LogEncoding::Latin1, "a\xE9\x80", "a\u00e9\u0080");
    row("UTF-8", LogEncoding::Utf8, text.toUtf8(), text);
    row("UTF-8 with a mark", LogEncoding::Utf8, "\xEF\xBB\xBF" + text.toUtf8(), text);
    row("UTF-8, not valid", LogEncoding::Utf8, "a\xE9z", "a" + Replacement + "z");
    row("UTF-16 LE", le, Wide(text, le), text);
    row("UTF-16 BE", be, Wide(text, be), text);
    row("UTF-16 LE with a mark", le, "\xFF\xFE" + Wide(text, le), text);
    row("UTF-16 BE with a mark", be, "\xFE\xFF" + Wide(text, be), text);
    row("half a pair", le, QByteArray("a\0\x3D\xD8", 4), "a" + Replacement);
    row("the other half", be, QByteArray("\xDE\0\0a", 4), Replacement + "a");
    row("half a unit", le, QByteArray("a\0b", 3), "a" + Replacement);
    row("nothing", le, "", "");
}

void tst_LogEncoding::decode()
{
    QFETCH(LogEncoding, encoding);
    QFETCH(QByteArray, bytes);
    QFETCH(QString, text);
    QCOMPARE(encoding.Decode(bytes.constData(), bytes.size()), text);

    QByteArray buffer;
    char const* line = bytes.constData();
    int length = bytes.size();
    encoding.Narrow(line, length, buffer);
    QCOMPARE(encoding.narrowed().Decode(line, length), text);
    QVERIFY(encoding.kind() == LogEncoding::Latin1 || !QByteArray(line, length).contains('\0'));
}

// The bytes of a line in UTF-8 are those of the file, but for the mark.
void tst_LogEncoding::narrowUtf8_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<int>("length");
    QTest::newRow("mark and text") << QByteArray("\xEF\xBB\xBFxy") << 2;
    QTest::newRow("mark alone") << QByteArray("\xEF\xBB\xBF") << 0;
    QTest::newRow("part of a mark") << QByteArray("\xEF\xBB") << 2;
    QTest::newRow("greater than a mark") << QByteArray("\xEF\xBC\xBF") << 3;
    QTest::newRow("another character that begins alike") << QByteArray("\xEF\xBB\xBE") << 3;
    QTest::newRow("less than a mark") << QByteArray("abc") << 3;
}

void tst_LogEncoding::narrowUtf8()
{
    QFETCH(QByteArray, bytes);
    QByteArray buffer;
    char const* line = bytes.constData();
    int length = bytes.size();
    LogEncoding(LogEncoding::Utf8).Narrow(line, length, buffer);
    QTEST(length, "length");
    QCOMPARE(QByteArray(line, length), bytes.right(length));
}

// Only the first one is no text.
void tst_LogEncoding::secondMark()
{
    const QString mark(QChar::ByteOrderMark);
    for (LogEncoding encoding : {LogEncoding::Utf8, LogEncoding::Utf16Le, LogEncoding::Utf16Be}) {
        const QString text = mark + mark + "a";
        const QByteArray bytes =
            encoding.isWide() ? Wide(text, encoding) : QByteArray(text.toUtf8());
        QCOMPARE(encoding.Decode(bytes.constData(), bytes.size()), mark + "a");
    }
}

// As Qt decides it.
void tst_LogEncoding::validUtf8()
{
    std::mt19937 random(1);
    const unsigned char bytes[] = {0x41, 0x7F, 0x80, 0x8F, 0x90, 0x9F, 0xA0, 0xBF, 0xC1, 0xC2,
                                   0xDF, 0xE0, 0xE1, 0xED, 0xEF, 0xF0, 0xF3, 0xF4, 0xF5, 0xFF};
    int valid = 0;
    for (int i = 0; i < 200000; ++i) {
        QByteArray text("x");
        for (auto left = random() % 5; left > 0; --left)
            text += static_cast<char>(bytes[random() % sizeof bytes]);
        text += '\n';
        const bool isValid = !QString::fromUtf8(text).contains(Replacement);
        valid += isValid ? 1 : 0;
        QCOMPARE(LogEncoding::Detect(text) == LogEncoding::Utf8, isValid);
    }
    QVERIFY(valid > 1000);
}

void tst_LogEncoding::lineEnds_data()
{
    QTest::addColumn<LogLineEnd>("lineEnd");
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<int>("found");

    const LogLineEnd le('\n', '\0', 2);
    const LogLineEnd be('\0', '\n', 2);
    const LogLineEnd emptyLine('\n', '\n', 1);
    QTest::newRow("line feed") << LogLineEnd() << QByteArray("ab\nc\n") << 2;
    QTest::newRow("none") << LogLineEnd() << QByteArray("ab") << -1;
    QTest::newRow("little endian") << le << QByteArray("a\0\n\0b\0", 6) << 3;
    QTest::newRow("little endian, another character")
        << le << QByteArray("\n\x01\0\n\0\0", 6) << -1;
    QTest::newRow("big endian") << be << QByteArray("\0a\0\n\0b", 6) << 3;
    QTest::newRow("big endian, another character") << be << QByteArray("\x01\n\n\0\n\x01", 6) << -1;
    QTest::newRow("empty line") << emptyLine << QByteArray("a\nb\n\nc") << 4;
    QTest::newRow("no empty line") << emptyLine << QByteArray("\na\nb\n") << -1;
}

void tst_LogEncoding::lineEnds()
{
    QFETCH(LogLineEnd, lineEnd);
    QFETCH(QByteArray, bytes);
    char const* const at = bytes.constData();
    char const* const found = lineEnd.Find(at, at + bytes.size(), 0, '\0');
    QTEST(found ? static_cast<int>(found - at) : -1, "found");
}

// A pair may be split between two pieces of the file.
void tst_LogEncoding::lineEndsInPieces()
{
    const QByteArray bytes("\0a\0\n", 4);
    char const* const at = bytes.constData();
    const LogLineEnd be('\0', '\n', 2);
    QVERIFY(!be.Find(at, at + 3, 0, '\0'));
    QVERIFY(be.Find(at + 3, at + 4, 3, '\0') == at + 3);
    QVERIFY(!be.Find(at + 3, at + 4, 3, 'a'));
    QVERIFY(!be.Find(at + 3, at + 4, 2, '\0'));
}

void tst_LogEncoding::carriageReturn()
{
    const auto length = [](LogEncoding encoding, QByteArray const& line) {
        return encoding.WithoutReturn(line.constData(), line.size());
    };
    QCOMPARE(length(LogEncoding::Latin1, "ab\r"), 2);
    QCOMPARE(length(LogEncoding::Utf8, "ab"), 2);
    QCOMPARE(length(LogEncoding::Utf8, ""), 0);
    QCOMPARE(length(LogEncoding::Utf16Le, QByteArray("a\0\r\0", 4)), 2);
    QCOMPARE(length(LogEncoding::Utf16Be, QByteArray("\0a\0\r", 4)), 2);
    QCOMPARE(length(LogEncoding::Utf16Be, QByteArray("\0a\r\0", 4)), 4);
    QCOMPARE(length(LogEncoding::Utf16Le, "\r"), 1);
}

QTEST_GUILESS_MAIN(tst_LogEncoding)
#include "tst_LogEncoding.moc"
