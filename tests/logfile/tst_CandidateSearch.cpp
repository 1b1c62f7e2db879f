// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/CandidateSearch.h"
#include "support/GuardedBytes.h"

#include <QtTest>

using namespace Velocor;

namespace {

const LogEncoding latin1 = LogEncoding::Latin1;
const LogEncoding utf8 = LogEncoding::Utf8;
const LogEncoding utf16 = LogEncoding::Utf16Le;

LogFilter filterOf(QString const& text, bool isExpression, bool caseSensitive)
{
    LogFilter filter;
    filter.SetText(text, isExpression, caseSensitive);
    return filter;
}

LogFilter exactly(QString const& text)
{
    return filterOf(text, false, true);
}

LogFilter inAnyCase(QString const& text)
{
    return filterOf(text, false, false);
}

LogFilter matching(QString const& expression)
{
    return filterOf(expression, true, true);
}

LogFilter withTerms(QString const& text, QString const& required, QString const& hidden)
{
    LogFilter filter = exactly(text);
    filter.SetTerms(LogTerms(required, true), LogTerms(hidden, true));
    return filter;
}

} // namespace

Q_DECLARE_METATYPE(Velocor::LogEncoding)
Q_DECLARE_METATYPE(Velocor::LogFilter)

class tst_CandidateSearch : public QObject
{
    Q_OBJECT

private slots:
    void candidates_data();
    void candidates();
    void withoutDecoding_data();
    void withoutDecoding();
    void answers_data();
    void answers();
    void places_data();
    void places();
    void rarestText();
    void learnsFromTheSampleOnly();
};

void tst_CandidateSearch::candidates_data()
{
    QTest::addColumn<LogFilter>("filter");
    QTest::addColumn<LogEncoding>("encoding");
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<bool>("isCandidate");
    const auto row = [](char const* name, LogFilter const& filter, LogEncoding encoding,
                        char const* line, bool isCandidate) {
        QTest::newRow(name) << filter << encoding << QByteArray(line) << isCandidate;
    };

    row("the text", exactly("full"), utf8, "disk full", true);
    row("not the text", exactly("full"), utf8, "disk ful", false);
    row("no line", exactly("full"), utf8, "", false);
    row("no text", LogFilter(), utf8, "disk full", false);
    row("another case", exactly("full"), utf8, "disk FULL", false);
    row("any case", inAnyCase("fUll"), utf8, "disk FuLL", true);
    row("other characters that differ in one bit", inAnyCase("a@b"), utf8, "a`b", false);
    row("a long s in UTF-8", inAnyCase("disc"), utf8,
        "di\xC5\xBF"
        "c",
        true);
    row("a kelvin sign in UTF-8", inAnyCase("kaput"), utf8,
        "\xE2\x84\xAA"
        "aput",
        true);
    row("a kelvin sign in a text", inAnyCase(QString(QChar(0x212A)) + "aput"), utf8, "kaput", true);
    row("a kelvin sign, but exact case", exactly("kaput"), utf8,
        "\xE2\x84\xAA"
        "aput",
        false);
    row(
        "a kelvin sign for a hidden text",
        [] {
            LogFilter filter;
            filter.SetTerms(LogTerms(), LogTerms("kaput", false));
            return filter;
        }(),
        utf8,
        "\xE2\x84\xAA"
        "aput",
        true);
    row(
        "no hidden text in any case",
        [] {
            LogFilter filter;
            filter.SetTerms(LogTerms(), LogTerms("kaput", false));
            return filter;
        }(),
        utf8, "other", false);
    row("the bytes of a kelvin sign in Latin-1", inAnyCase("kaput"), latin1,
        "\xE2\x84\xAA"
        "aput",
        false);
    row("other characters in any case", inAnyCase(QString::fromUtf8("größe")), utf8,
        "GR\xC3\x96\xC3\x9F"
        "E",
        true);

    row("a character in UTF-8", exactly(QString::fromUtf8("é")), utf8, "caf\xC3\xA9", true);
    row("a character in Latin-1", exactly(QString::fromUtf8("é")), latin1, "caf\xE9", true);
    row("its bytes in the other encoding", exactly(QString::fromUtf8("é")), latin1, "caf\xC3\xA9",
        false);
    row("a character that Latin-1 lacks", exactly(QString::fromUtf8("€")), latin1, "any", true);
    row("a character above 16 bits", exactly(QString::fromUtf8("😀")), utf8, "\xF0\x9F\x98\x80",
        true);
    row("the last character of Latin-1, not there", exactly(QString::fromUtf8("ÿ")), latin1, "any",
        false);
    row("the first character after Latin-1", exactly(QString::fromUtf8("Ā")), latin1, "any", true);
    row("one in Latin-1 and one that it lacks", exactly(QString::fromUtf8("é€")), latin1, "\xE9?",
        true);
    row("a character above 16 bits, not there", exactly(QString::fromUtf8("😀")), utf8, "any",
        false);
    row("a character, and what invalid bytes become", exactly(QString::fromUtf8("é\uFFFD")), utf8,
        "\xC3\xA9\xFF", true);
    row("a character above 16 bits, and what invalid bytes become",
        exactly(QString::fromUtf8("😀\uFFFD")), utf8, "\xF0\x9F\x98\x80\xFF", true);
    row("half of it", exactly(QString(QChar(0xD83D))), utf8, "any", true);
    row("what invalid bytes become", exactly(QString(QChar(0xFFFD))), utf8, "\xFF", true);
    row("what invalid bytes become, and more", exactly(QString(QChar(0xFFFD)) + "a"), utf8,
        "\xFF"
        "a",
        true);
    row("what invalid bytes become, and no more", exactly(QString(QChar(0xFFFD)) + "a"), utf8,
        "\xFF", false);
    row("any line in UTF-16", exactly("full"), utf16, "any", true);
    row("a line end in the text", exactly("a\nb"), utf8, "a", true);

    row("a text of an expression", matching("disk \\w+"), utf8, "the disk is", true);
    row("not a text of an expression", matching("disk \\w+"), utf8, "the dish is", false);
    row("one of two texts of an expression", matching("ab\\d+cd"), utf8, "ab 1", false);
    row("both texts of an expression, wrong order", matching("ab\\d+cd"), utf8, "cd ab", true);
    row("an expression without a text", matching("\\d+"), utf8, "any", true);

    row("a required term", withTerms("", "a b", ""), utf8, "b a", true);
    row("one of two required terms", withTerms("", "a b", ""), utf8, "a", false);
    row("a required term without the text", withTerms("c", "a b", ""), utf8, "b a", false);
    row("a hidden term", withTerms("", "", "a b"), utf8, "b", true);
    row("no hidden term", withTerms("", "", "a b"), utf8, "c", false);
    row("a hidden term without the text", withTerms("c", "", "a b"), utf8, "b", true);
    row("a hidden term that cannot be looked for", withTerms("c", "", QString(QChar(0xFFFD))), utf8,
        "any", true);
}

void tst_CandidateSearch::candidates()
{
    QFETCH(LogFilter, filter);
    QFETCH(LogEncoding, encoding);
    QFETCH(QByteArray, line);
    QFETCH(bool, isCandidate);
    CandidateSearch search(filter, encoding);
    for (bool hasLearned : {false, true}) {
        const std::optional<LogFilter::Match> known = search.Answer(line.constData(), line.size());
        QCOMPARE(known != search.answer(), isCandidate);
        if (known)
            QCOMPARE(*known, filter.Find(encoding.Decode(line.constData(), line.size())));
        if (!hasLearned)
            search.Learn(line.constData(), line.size());
    }
}

void tst_CandidateSearch::withoutDecoding_data()
{
    QTest::addColumn<LogFilter>("filter");
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<bool>("isKnown");
    const auto row = [](char const* name, LogFilter const& filter, char const* line, bool isKnown) {
        QTest::newRow(name) << filter << QByteArray(line) << isKnown;
    };
    const QString mark(QChar::ByteOrderMark);
    row("a text", exactly("full"), "disk full", true);
    row("a text that is not ASCII", exactly(QString::fromUtf8("é")), "caf\xC3\xA9", true);
    row("a text in any case", inAnyCase("disk full"), "DISK FULL", true);
    row("not quite ASCII", inAnyCase("disk full"), "DISK FULL \xE2\x84\xAA", false);
    row("a text in any case that is not ASCII", inAnyCase(QString::fromUtf8("caé")), "ca\xC3\xA9",
        false);
    row("part of a text", exactly(QString(QChar(0xFFFD)) + "a"),
        "\xFF"
        "a",
        false);
    row("a byte order mark, which may be removed", exactly(mark + "a"),
        "\xEF\xBB\xBF"
        "a",
        false);
    row("an expression", matching("full"), "disk full", false);
    row("a required term", withTerms("full", "disk", ""), "disk full", true);
    row("a hidden term", withTerms("full", "", "disk"), "disk full", true);
    row(
        "a hidden term, and an expression",
        [] {
            LogFilter filter = matching("full");
            filter.SetTerms(LogTerms(), LogTerms("disk", true));
            return filter;
        }(),
        "disk full", false);
}

void tst_CandidateSearch::withoutDecoding()
{
    QFETCH(LogFilter, filter);
    QFETCH(QByteArray, line);
    const std::optional<LogFilter::Match> known =
        CandidateSearch(filter, utf8).Answer(line.constData(), line.size());
    QTEST(known.has_value(), "isKnown");
    if (known)
        QCOMPARE(*known, filter.Find(utf8.Decode(line.constData(), line.size())));
}

void tst_CandidateSearch::answers_data()
{
    QTest::addColumn<LogFilter>("filter");
    QTest::addColumn<bool>("isMatch");
    QTest::newRow("no text") << LogFilter() << true;
    QTest::newRow("a text") << exactly("a") << false;
    QTest::newRow("an expression") << matching("a") << false;
    QTest::newRow("a required term") << withTerms("", "a", "") << false;
    QTest::newRow("a hidden term") << withTerms("", "", "a") << true;
    QTest::newRow("both") << withTerms("", "a", "b") << false;
}

void tst_CandidateSearch::answers()
{
    QFETCH(LogFilter, filter);
    QFETCH(bool, isMatch);
    const LogFilter::Match expected = isMatch ? LogFilter::Yes : LogFilter::No;
    QCOMPARE(CandidateSearch(filter, utf8).answer(), expected);
    QCOMPARE(filter.Find("other"), expected);
}

void tst_CandidateSearch::places_data()
{
    QTest::addColumn<int>("place"); // of the text, in a longer one
    QTest::addColumn<int>("length");
    QTest::newRow("the start") << 0 << 100;
    QTest::newRow("the end") << 92 << 100;
    QTest::newRow("the end of a short text") << 20 << 28;
    QTest::newRow("the whole text") << 0 << 8;
    QTest::newRow("the first place of a block") << 32 << 100;
    QTest::newRow("the last place of a block") << 31 << 100;
    QTest::newRow("the last place of the last block") << 63 << 71;
    QTest::newRow("the place after the last block") << 64 << 72;
    QTest::newRow("the last place of a window") << 1023 << 2000;
    QTest::newRow("the first place of a window") << 1024 << 2000;
    QTest::newRow("across windows") << 1020 << 2000;
}

// With one text and with several, which are looked for in turns.
void tst_CandidateSearch::places()
{
    QFETCH(int, place);
    QFETCH(int, length);
    QByteArray bytes(length, 'x');
    bytes.replace(place, 8, "diskfull");
    QByteArray cut = bytes;
    cut.chop(length - place - 7);
    for (char const* hidden : {"", "absent", "absent2 absent3"}) {
        const CandidateSearch search(withTerms("diskfull", "", hidden), utf8);
        QCOMPARE(int(search.Find(bytes.constBegin(), bytes.constEnd()) - bytes.constBegin()),
                 place);
        QCOMPARE(search.Find(cut.constBegin(), cut.constEnd()), cut.constEnd());
    }
    const CandidateSearch hiding(withTerms("absent", "", "absent2 diskfull"), utf8);
    QCOMPARE(int(hiding.Find(bytes.constBegin(), bytes.constEnd()) - bytes.constBegin()), place);

    // In place of the text, a character that may equal one of its letters.
    QByteArray unclear(length, 'x');
    unclear.replace(place, 3, "\xE2\x84\xAA");
    const CandidateSearch anyCase(inAnyCase("k"), utf8);
    QCOMPARE(int(anyCase.Find(unclear.constBegin(), unclear.constEnd()) - unclear.constBegin()),
             place);
}

// Of the texts of an expression, the one that is rarest in the sample is looked for.
void tst_CandidateSearch::rarestText()
{
    const QByteArray sample = QByteArray("a long text 1\n").repeated(20) + "7 a long text 77 \n";
    CandidateSearch search(matching("a long text \\d+77 "), utf8);
    search.Learn(sample.constData(), sample.size());
    QCOMPARE(int(search.Find(sample.constBegin(), sample.constEnd()) - sample.constBegin()),
             sample.indexOf("77 "));

    // Of two that are as rare, the longer one.
    CandidateSearch asRare(matching("ab\\d+cdef"), utf8);
    asRare.Learn(sample.constData(), sample.size());
    const QByteArray both("ab 1 cdef");
    QCOMPARE(int(asRare.Find(both.constBegin(), both.constEnd()) - both.constBegin()),
             both.indexOf("cdef"));
}

void tst_CandidateSearch::learnsFromTheSampleOnly()
{
    CandidateSearch search(matching("ab\\d+cdef"), utf8);
    GuardedBytes guarded;
    const QByteArray sample("ab 1 cdef");
    for (bool isAtEnd : {false, true})
        search.Learn(guarded.Put(sample, isAtEnd), sample.size());
    QCOMPARE(search.Find(sample.constBegin(), sample.constEnd()) - sample.constBegin(),
             std::ptrdiff_t(sample.indexOf("cdef")));
}

QTEST_GUILESS_MAIN(tst_CandidateSearch)
#include "tst_CandidateSearch.moc"
