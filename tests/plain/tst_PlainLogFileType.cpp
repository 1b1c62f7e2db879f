// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares how the start of a file says that it is to be read with a plain version, which looks at
// all lines and has Qt's codecs read the text: for starts with entries of the log and of other
// programs, in all encodings, cut anywhere, and of any bytes.

#include "app/logfile/ForeignLine.h"
#include "app/logfile/LogFileType.h"
#include "app/logfile/LogLineParser.h"

#include "Rounds.h"

#include <QTextCodec>
#include <QtTest>

#include <random>

using namespace Velocor;

class tst_PlainLogFileType : public QObject
{
    Q_OBJECT

private slots:
    void ofLines();
    void ofBytes();
    void cleanupTestCase();

private:
    int m_heads = 0;
    int m_foreign = 0;
    int m_own = 0;
};

namespace {

const QDate Modified(2026, 11, 22);

class Random
{
public:
    int below(int limit) { return int(m_random() % unsigned(limit)); }
    bool once(int times) { return below(times) == 0; }

    template <class T, size_t count>
    T const& oneOf(T const (&values)[count])
    {
        return values[below(int(count))];
    }

private:
    std::mt19937 m_random{Rounds::seed()};
};

bool HasNoError(QByteArray const& utf8)
{
    QTextCodec::ConverterState state;
    QTextCodec::codecForName("UTF-8")->toUnicode(utf8.constData(), utf8.size(), &state);
    return state.invalidChars == 0 && state.remainingChars == 0;
}

// Whether it is, or begins, valid UTF-8.
bool PlainIsUtf8(QByteArray const& text)
{
    for (char const* const rest :
         {"", "\x80", "\xBF", "\x80\x80", "\xBF\x80", "\x80\x80\x80", "\xBF\x80\x80"}) {
        if (HasNoError(text + rest))
            return true;
    }
    return false;
}

LogEncoding PlainDeclared(QByteArray const& head)
{
    if (head.startsWith("\xEF\xBB\xBF"))
        return LogEncoding::Utf8;
    if (head.startsWith("\xFF\xFE"))
        return LogEncoding::Utf16Le;
    if (head.startsWith("\xFE\xFF"))
        return LogEncoding::Utf16Be;
    int zeros[] = {0, 0};
    for (int i = 0; i < head.size(); ++i) {
        if (head.at(i) == '\0')
            ++zeros[i % 2];
    }
    const int pairs = head.size() / 2;
    const auto isHigh = [&](int first) {
        return pairs >= 2 && zeros[first] > pairs / 2 && zeros[1 - first] <= pairs / 100;
    };
    if (isHigh(1))
        return LogEncoding::Utf16Le;
    return isHigh(0) ? LogEncoding::Utf16Be : LogEncoding::Automatic;
}

QByteArray PlainText(QByteArray head, LogEncoding encoding)
{
    if (encoding == LogEncoding::Utf8 && head.startsWith("\xEF\xBB\xBF"))
        return head.mid(3);
    if (!encoding.isWide())
        return head;
    // An odd byte at the end is no character.
    const bool isOdd = head.size() % 2 != 0;
    head.chop(isOdd ? 1 : 0);
    QString text;
    for (int i = 0; i < head.size(); i += 2) {
        const int high = encoding == LogEncoding::Utf16Le ? 1 : 0;
        text += QChar(uchar(head.at(i + 1 - high)), uchar(head.at(i + high)));
    }
    if (text.startsWith(QChar(0xFEFF)))
        text.remove(0, 1);
    return (text + (isOdd ? QString(QChar(0xFFFD)) : QString())).toUtf8();
}

QList<QByteArray> PlainLines(QByteArray const& text, bool isCut)
{
    QList<QByteArray> lines = text.split('\n');
    if (!isCut || lines.last().isEmpty())
        lines.removeLast(); // it may become anything
    for (QByteArray& line : lines) {
        if (line.endsWith('\r'))
            line.chop(1);
    }
    return lines;
}

LogFileType PlainType(QByteArray const& head, LogLineParser const& parser, LogEncoding chosen)
{
    LogFileType type;
    if (parser.isOwn()) {
        type.isOwn = true;
        type.encoding = chosen == LogEncoding::Automatic ? LogEncoding::Latin1 : chosen.kind();
        return type;
    }
    const LogEncoding declared = chosen == LogEncoding::Automatic ? PlainDeclared(head) : chosen;
    const QByteArray text = PlainText(head, declared);
    bool isSurelyForeign = false;
    bool mayBeOwn = false;
    bool mayBeForeign = false;
    const QList<QByteArray> lines = PlainLines(text, head.size() >= LogFileType::HeadSize);
    for (QByteArray const& line : lines) {
        const LogLineParser::Parts own = parser.FindOwn(line.constData(), line.size());
        const ForeignLine foreign = ForeignLine::Read(line.constData(), line.size(), Modified);
        const bool hasSeverity = own.severity != LogEntry::None;
        if (hasSeverity && own.timeKey >= 0)
            type.isOwn = true;
        else if (foreign.isSure && !(hasSeverity && (foreign.severity == own.severity ||
                                                     foreign.severity == LogEntry::None)))
            isSurelyForeign = true;
        mayBeOwn = mayBeOwn || own.isEntry;
        mayBeForeign = mayBeForeign || (!own.isEntry && foreign.isEntry);
    }
    type.isForeign = !type.isOwn && (isSurelyForeign || (mayBeForeign && !mayBeOwn));
    type.isJournal = type.isForeign && !declared.isWide() &&
                     ForeignLine::IsJournalExport(text.constData(), text.size());
    type.encoding = declared;
    if (declared == LogEncoding::Automatic) {
        const bool isLatin1 = type.isOwn || (mayBeOwn && !isSurelyForeign) || !PlainIsUtf8(head);
        type.encoding = isLatin1 ? LogEncoding::Latin1 : LogEncoding::Utf8;
    }
    return type;
}

QString Text(LogFileType const& type)
{
    return QString("encoding %1, foreign %2, journal %3, own %4")
        .arg(type.encoding.kind())
        .arg(type.isForeign)
        .arg(type.isJournal)
        .arg(type.isOwn);
}

QString Line(Random& random)
{
    static char const* const lines[] = {"2026-03-03 09:02:11.031 Trace x",
                                        "2026-03-03 09:02:11.031  x",
                                        "2026-03-03 09:02:11.031 INFO x",
                                        "3.3.2026 um 9:02 Error x",
                                        "5 Warning x",
                                        "Error x",
                                        "2026-03-03T09:02:11Z ERROR x",
                                        "2026-03-03 09:02:11 Error x",
                                        "Mar  3 09:02:11 host program[12]: x",
                                        "ERROR: x",
                                        "warning x",
                                        "{\"time\":\"2026-03-03T09:02:11Z\",\"msg\":\"x\"}",
                                        "time=2026-03-03T09:02:11Z level=error msg=x",
                                        "__CURSOR=s=1",
                                        "PRIORITY=3",
                                        "MESSAGE=x",
                                        "",
                                        "it goes on",
                                        "\tat x"};
    static char const* const ends[] = {"", "", "\xC3\xA9", "\xE2\x82\xAC", "\xF0\x9F\x98\x80"};
    QString line = random.oneOf(lines) + QString::fromUtf8(random.oneOf(ends));
    return line + (random.once(4) ? "\r\n" : "\n");
}

QByteArray Encoded(QString const& text, LogEncoding encoding)
{
    if (!encoding.isWide())
        return encoding == LogEncoding::Utf8 ? text.toUtf8() : text.toLatin1();
    QByteArray bytes;
    for (QChar c : text) {
        const char pair[] = {char(c.cell()), char(c.row())};
        const bool isLittle = encoding == LogEncoding::Utf16Le;
        bytes += pair[isLittle ? 0 : 1];
        bytes += pair[isLittle ? 1 : 0];
    }
    return bytes;
}

QByteArray Head(Random& random)
{
    static LogEncoding::Kind const kinds[] = {LogEncoding::Latin1, LogEncoding::Utf8,
                                              LogEncoding::Utf16Le, LogEncoding::Utf16Be};
    const LogEncoding encoding = random.oneOf(kinds);
    QString text = random.once(4) ? QString(QChar(0xFEFF)) : QString();
    const int count = 1 + random.below(5);
    for (int i = 0; i < count; ++i)
        text += Line(random);
    QByteArray head = Encoded(text, encoding);
    if (random.once(2))
        head.chop(random.below(qMin(head.size(), 40) + 1));
    if (!random.once(150))
        return head;
    // A large file, whose first lines say nothing.
    const int size = LogFileType::HeadSize - head.size() / 4 * 2;
    const QByteArray before = Encoded(QString("it goes on\n").repeated(size / 11 + 1), encoding);
    return (before.right(size) + head).left(LogFileType::HeadSize);
}

LogEncoding Chosen(Random& random)
{
    return random.once(6) ? LogEncoding::Kind(random.below(LogEncoding::Utf16Be + 1))
                          : LogEncoding::Automatic;
}

} // namespace

void tst_PlainLogFileType::ofLines()
{
    Random random;
    const int count = Rounds::count(5000, 300000);
    for (int i = 0; i < count; ++i, ++m_heads) {
        LogLineParser parser;
        parser.SetOwn(random.once(20));
        const QByteArray head = Head(random);
        const LogEncoding chosen = Chosen(random);
        const LogFileType type = LogFileType::Of(head, parser, chosen, Modified);
        const LogFileType plain = PlainType(head, parser, chosen);
        QVERIFY2(Text(type) == Text(plain),
                 qPrintable(Text(type) + "; plain: " + Text(plain) + ": " +
                            QString::fromLatin1(head.left(300).toPercentEncoding(" :.-"))));
        m_foreign += type.isForeign ? 1 : 0;
        m_own += type.isOwn ? 1 : 0;
    }
}

// Mostly of few different bytes, so that marks, zeros and sequences in UTF-8 come about.
void tst_PlainLogFileType::ofBytes()
{
    static uchar const bytes[] = {0xEF, 0xBB, 0xBF, 0xFF, 0xFE, 0x00, 0x80, 0x9F, 0xA0, 0x8F,
                                  0x90, 0xC1, 0xC2, 0xDF, 0xE0, 0xED, 0xF0, 0xF4, 0xF5, 'a'};
    Random random;
    const int count = Rounds::count(30000, 3000000);
    for (int i = 0; i < count; ++i, ++m_heads) {
        QByteArray head = random.once(2) ? QByteArray("a") : QByteArray();
        const int size = random.below(7);
        for (int at = 0; at < size; ++at)
            head += char(random.once(8) ? random.below(256) : random.oneOf(bytes));
        const LogFileType type =
            LogFileType::Of(head, LogLineParser(), LogEncoding::Automatic, Modified);
        const LogFileType plain = PlainType(head, LogLineParser(), LogEncoding::Automatic);
        QVERIFY2(Text(type) == Text(plain), (Text(type) + ": ").toLatin1() + head.toHex());
    }
}

void tst_PlainLogFileType::cleanupTestCase()
{
    std::printf("plain log file type: %d starts of files compared, %d of them the log's own, %d "
                "another program's\n",
                m_heads, m_own, m_foreign);
}

QTEST_APPLESS_MAIN(tst_PlainLogFileType)
#include "tst_PlainLogFileType.moc"
