// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the search for a filter's texts in the bytes of a file with asking the filter about each
// decoded line, and the filter itself with Qt's own ways to search and to decode.

#include "app/logfile/CandidateSearch.h"
#include "app/logfile/LogIndex.h"
#include "app/logfile/RequiredLiterals.h"
#include "plain/Rounds.h"

#include <QRegularExpression>
#include <QTextCodec>
#include <QtTest>

#include <algorithm>
#include <cstdio>
#include <memory>
#include <random>

using namespace Velocor;

class tst_PlainSearch : public QObject
{
    Q_OBJECT

private slots:
    void bytes();
    void caseOfAllCharacters();
    void lines();
    void indexes();
    void filters();
    void decoding();
};

namespace {

const LogEncoding encodings[] = {LogEncoding::Latin1, LogEncoding::Utf8, LogEncoding::Utf16Le,
                                 LogEncoding::Utf16Be};

class Random
{
public:
    int below(int limit) { return int(m_engine() % unsigned(limit)); }
    bool once(int times) { return below(times) == 0; }

    template <class Value, int Count>
    Value const& oneOf(Value const (&values)[Count])
    {
        return values[below(Count)];
    }

private:
    std::mt19937 m_engine{Rounds::seed()};
};

// Few different ones, so that texts are often found; and those whose case, encoding or meaning in
// an expression is special.
QString character(Random& random)
{
    static char const* const usual[] = {"a", "b", "k", "K", "s", "S", " "};
    static char const* const special[] = {
        "A",      "B", "1", "2", "é", "É",      "ſ", "\u212A", "ß",  "µ", "\u03BC", "ÿ", "€",
        "😀",      "(", ")", "[", "]", "{",      "}", "|",      "\\", "*", "?",      "#", "\t",
        "\uFFFD", "^", "$", ".", "+", "\uFEFF", "Å", "\u212B", "İ",  "ı", ",",      "Q", "E"};
    return QString::fromUtf8(random.once(6) ? random.oneOf(special) : random.oneOf(usual));
}

QString text(Random& random, int limit)
{
    QString result;
    for (int left = random.below(limit + 1); left > 0; --left)
        result += character(random);
    return result;
}

QString sequence(Random& random, int depth);

QString group(Random& random, int depth)
{
    static char const* const openings[] = {
        "(",      "(",     "(?:",  "(?>",  "(?=",   "(?!",    "(?<=", "(?<!",  "(?|",  "(?<n>",
        "(?P<m>", "(?'q'", "(?i:", "(?x:", "(?-i:", "(?s-i:", "(?^:", "(?(1)", "(?<=", "(*pla:"};
    QString result = QString::fromUtf8(random.oneOf(openings)) + sequence(random, depth - 1);
    while (random.once(3))
        result += '|' + sequence(random, depth - 1);
    return result + ')';
}

QString characterClass(Random& random)
{
    static char const* const parts[] = {
        "a",       "b",     "k",    "S-s",       "|", "(",   ")", "[", "{",   "\\]", "\\\\",
        "\\Q]\\E", "\\x5d", "\\c]", "[:alpha:]", "é", "\\d", "#", "^", "\\E", "ſ",   " "};
    QString result = random.once(4) ? "[^" : "[";
    if (random.once(6))
        result += ']';
    for (int left = 1 + random.below(3); left > 0; --left)
        result += QString::fromUtf8(random.oneOf(parts));
    return result + ']';
}

QString escaped(Random& random)
{
    static char const* const escapes[] = {
        "\\d",    "\\w",     "\\s",      "\\S",       "\\W",  "\\b",   "\\B",    "\\A",  "\\z",
        "\\Z",    "\\K",     "\\G",      "\\R",       "\\X",  "\\N",   "\\h",    "\\V",  "\\t",
        "\\x61",  "\\x{6b}", "\\o{141}", "\\N{U+61}", "\\cA", "\\101", "\\p{L}", "\\PL", "\\1",
        "\\g{1}", "\\g1",    "\\k<n>",   "\\.",       "\\|",  "\\\\",  "\\(",    "\\)",  "\\[",
        "\\ ",    "\\-",     "\\E",      "\\Q\\E",    "\\#",  "\\é",   "\\x",    "\\0",  "\\_"};
    return QString::fromUtf8(random.oneOf(escapes));
}

QString piece(Random& random, int depth)
{
    static char const* const marks[] = {"^",    "$",      ".",         ".",     "(?#a)", "(?#()",
                                        "(?i)", "(?x)",   "(?-i)",     "(?xx)", "(?s)",  "(?R)",
                                        "(?1)", "(*UCP)", "(*ACCEPT)", "(?C)",  "{",     "}",
                                        "]",    "{1",     "{,2}",      "{a}",   "#"};
    const int kind = random.below(20);
    if (kind < 11)
        return text(random, 3);
    if (kind < 13)
        return escaped(random);
    if (kind == 13)
        return "\\Q" + text(random, 3) + (random.once(8) ? "" : "\\E");
    if (kind < 16)
        return characterClass(random);
    if (kind < 18 && depth > 0)
        return group(random, depth);
    return QString::fromUtf8(random.oneOf(marks));
}

QString sequence(Random& random, int depth)
{
    static char const* const quantifiers[] = {
        "?",   "*",    "+",    "??",    "*?",    "+?",   "?+",   "*+",   "++",   "{0}",
        "{2}", "{0,}", "{1,}", "{0,2}", "{1,2}", "{00}", "{02}", "{,2}", "{0}?", "{1}+"};
    QString result;
    for (int left = random.below(4); left >= 0; --left) {
        result += piece(random, depth);
        if (random.once(4))
            result += random.oneOf(quantifiers);
    }
    return result;
}

QString expression(Random& random)
{
    QString result = sequence(random, 2);
    while (random.once(8))
        result += '|' + sequence(random, 2);
    return result;
}

QByteArray encoded(QString const& text, LogEncoding encoding)
{
    switch (encoding.kind()) {
    case LogEncoding::Utf8:
        return text.toUtf8();
    case LogEncoding::Utf16Le:
    case LogEncoding::Utf16Be: {
        QByteArray result;
        for (const QChar c : text) {
            const bool isLittle = encoding == LogEncoding::Utf16Le;
            result += char(isLittle ? c.cell() : c.row());
            result += char(isLittle ? c.row() : c.cell());
        }
        return result;
    }
    default:
        return text.toLatin1();
    }
}

// A line without line ends, perhaps with invalid bytes. Long enough that texts are at any place of
// a block.
QByteArray lineOf(Random& random, LogEncoding encoding)
{
    QString characters;
    if (random.once(2))
        characters = QString(random.below(80), random.once(2) ? '.' : 'a');
    characters += text(random, 12);
    QByteArray line = encoded(characters, encoding);
    while (random.once(8)) {
        static char const invalid[] = "\xFF\xC5\xBF\xE2\x84\xAA\xC3\xF0\x9F\xED\xA0\x80k";
        line.insert(random.below(line.size() + 1), random.oneOf(invalid));
    }
    line.replace('\n', ' ');
    return line;
}

LogFilter filterOf(Random& random)
{
    LogFilter filter;
    const bool isExpression = random.once(2);
    while (!filter.SetText(isExpression ? expression(random) : text(random, 5), isExpression,
                           random.once(2))) {}
    if (random.once(3))
        filter.SetTerms(LogTerms(text(random, random.below(6)), random.once(2)),
                        LogTerms(text(random, random.below(6)), random.once(2)));
    return filter;
}

// Replaces halves of pairs, which Qt's codecs leave.
void withoutHalves(QString& text)
{
    for (int i = 0; i < text.size(); ++i) {
        if (text.at(i).isHighSurrogate() && i + 1 < text.size() && text.at(i + 1).isLowSurrogate())
            ++i;
        else if (text.at(i).isSurrogate())
            text[i] = QChar(QChar::ReplacementCharacter);
    }
}

std::vector<qint64> startsOf(LogIndex const& index, LogFilter const& filter)
{
    const LogRows rows = index.Rows(filter);
    std::vector<qint64> starts;
    for (size_t row = 0; row < rows.size(); ++row)
        starts.push_back(rows.start(row));
    return starts;
}

QStringList words(QString const& text)
{
    QStringList result = text.split(' ');
    result.removeAll(QString());
    return result;
}

QString told(LogFilter const& filter, LogEncoding encoding, QByteArray const& line)
{
    QStringList terms;
    for (LogTerms const* of : {&filter.required(), &filter.hidden()}) {
        for (QStringMatcher const& term : of->matchers())
            terms.append(term.pattern() +
                         (term.caseSensitivity() == Qt::CaseSensitive ? "" : " in any case"));
        terms.append(of == &filter.required() ? "; hidden:" : "");
    }
    return QString("%1 '%2'%3, required: %4; encoding %5; line %6")
        .arg(filter.isExpression() ? "expression" : "text", filter.text(),
             filter.caseSensitivity() == Qt::CaseSensitive ? "" : " in any case", terms.join(' '))
        .arg(int(encoding.kind()))
        .arg(QString(line.toPercentEncoding(" |()[]{}\\*?#^$.+,")));
}

} // namespace

// The first place, compared with a search byte by byte.
void tst_PlainSearch::bytes()
{
    Random random;
    const int count = Rounds::count(200000, 2000000, 20000000);
    int found = 0;
    for (int round = 0; round < count; ++round) {
        static char const letters[] = "abAB@`1\xE2\xC2";
        QByteArray bytes;
        for (int left = random.below(random.once(2) ? 200 : 40); left > 0; --left)
            bytes += random.once(3) ? random.oneOf(letters) : '.';
        QByteArray wanted;
        for (int left = random.below(4); left >= 0; --left)
            wanted += random.once(8) ? random.oneOf(letters) : 'a';
        const bool isAnyCase = random.once(2);
        ByteLiteral literal(wanted, isAnyCase);
        if (random.once(2)) {
            ByteLiteral::Frequencies frequencies = {};
            for (int& frequency : frequencies)
                frequency = random.below(4);
            literal.Learn(frequencies);
        }
        const auto lower = [&](char c) {
            return isAnyCase && c >= 'A' && c <= 'Z' ? char(c + 'a' - 'A') : c;
        };
        auto const* const plain =
            std::search(bytes.constBegin(), bytes.constEnd(), wanted.constBegin(),
                        wanted.constEnd(), [&](char a, char b) { return lower(a) == lower(b); });
        found += plain != bytes.constEnd() ? 1 : 0;
        if (literal.Find(bytes.constBegin(), bytes.constEnd()) != plain)
            QFAIL(qPrintable(QString("%1 in %2").arg(QString(wanted), QString(bytes))));
    }
    QVERIFY(found > 0 && found < count);
    std::printf("plain search, bytes: %d texts in bytes, %d found\n", count, found);
}

// Which characters equal an ASCII character if case does not matter: what is looked for in bytes
// must not miss one of them.
void tst_PlainSearch::caseOfAllCharacters()
{
    QStringList equal;
    const QRegularExpression ascii("^[\\x01-\\x7f]$", QRegularExpression::CaseInsensitiveOption);
    int count = 0;
    for (uint code = 0x80; code <= 0x10FFFF; ++code) {
        if (QChar::isSurrogate(code))
            continue;
        const QString text = QString::fromUcs4(&code, 1);
        const bool foldsToAscii = QChar::toCaseFolded(code) < 0x80;
        const bool matchesAscii = ascii.match(text).hasMatch();
        if (foldsToAscii || matchesAscii)
            equal.append(QString::number(code, 16) + (foldsToAscii ? "" : " in expressions") +
                         (matchesAscii ? "" : " in texts"));
        ++count;
    }
    QCOMPARE(equal, QStringList({"17f", "212a"}));
    std::printf("plain search, case: %d characters\n", count);
}

// What is known of a line is what the filter finds in it.
void tst_PlainSearch::lines()
{
    Random random;
    const int count = Rounds::count(200000, 2000000, 10000000);
    int pairs = 0;
    int skipped = 0;
    int undecoded = 0; // and not skipped
    int matched = 0;
    int expressions = 0; // with texts to look for
    while (pairs < count) {
        const LogFilter filter = filterOf(random);
        const LogEncoding encoding = encodings[random.below(2)];
        CandidateSearch search(filter, encoding);
        expressions += filter.isExpression() && !RequiredLiterals(filter.text()).isEmpty() ? 1 : 0;
        for (int left = 20; left > 0; --left, ++pairs) {
            const QByteArray line = lineOf(random, encoding);
            if (left == 10)
                search.Learn(line.constData(), line.size());
            const std::optional<LogFilter::Match> known =
                search.Answer(line.constData(), line.size());
            const LogFilter::Match plain =
                filter.Find(encoding.Decode(line.constData(), line.size()));
            matched += plain == LogFilter::Yes ? 1 : 0;
            skipped += known == search.answer() ? 1 : 0;
            undecoded += known && known != search.answer() ? 1 : 0;
            if (known && plain != *known && plain != LogFilter::TooLong)
                QFAIL(qPrintable(told(filter, encoding, line)));
            // The search in many lines must not be stricter than that in one.
            const bool isFound = search.Find(line.constBegin(), line.constEnd()) != line.constEnd();
            if (known != search.answer() && !isFound && !line.isEmpty())
                QFAIL(qPrintable("not found: " + told(filter, encoding, line)));
        }
    }
    QVERIFY(skipped > pairs / 10 && matched > pairs / 10 && undecoded > pairs / 50);
    QVERIFY(expressions > 0);
    std::printf("plain search, lines: %d pairs of filter and line, %d skipped, %d matched\n", pairs,
                skipped, matched);
}

// An index of a file by three ways: a first pass with the filter, a search after a pass with
// another filter, and the filter asked about each line.
void tst_PlainSearch::indexes()
{
    Random random;
    const int count = Rounds::count(3000, 30000, 200000);
    int shown = 0;
    for (int round = 0; round < count; ++round) {
        const LogEncoding encoding = random.oneOf(encodings);
        LogFileType type;
        type.encoding = encoding;
        type.isJournal = !encoding.isWide() && random.once(4);
        LogLineParser parser;
        parser.SetFileType(type);
        const LogFilter filter = filterOf(random);
        const LogFilter before = random.once(2) ? LogFilter() : filterOf(random);

        QByteArray file;
        std::vector<qint64> expected;
        bool isSlow = false;
        const QByteArray lineEnd = type.lineEnd().bytes();
        for (int left = random.below(30); left > 0; --left) {
            QByteArray line = lineOf(random, encoding);
            if (encoding.isWide() && line.size() % 2 != 0)
                line.chop(1);
            QByteArray narrow;
            char const* bytes = line.constData();
            int length = encoding.WithoutReturn(bytes, line.size());
            encoding.Narrow(bytes, length, narrow);
            const LogFilter::Match plain = filter.Find(encoding.narrowed().Decode(bytes, length));
            isSlow = isSlow || plain == LogFilter::TooLong;
            QByteArray ending = left > 1 || random.once(2) ? lineEnd : QByteArray();
            if (!ending.isEmpty() && !type.isJournal && random.once(3))
                ending.prepend(encoded("\r", encoding));
            if (plain == LogFilter::Yes && !(line + ending).isEmpty())
                expected.push_back(file.size());
            file += line + ending;
        }
        if (isSlow)
            continue;

        const int slice = 1 + random.below(300);
        const auto read = [&](LogIndex& index) {
            index.Begin();
            for (int at = 0; at < file.size(); at += slice)
                index.Feed(file.constData() + at, qMin(slice, file.size() - at));
            index.End();
        };
        LogIndex fresh(parser, filter);
        read(fresh);
        LogIndex searched(parser, before);
        read(searched);
        searched.BeginSearch(filter);
        while (searched.searchOffset() < searched.nextOffset()) {
            const qint64 offset = searched.searchOffset();
            const QByteArray lines = file.mid(int(offset), int(searched.SearchEnd(slice) - offset));
            searched.Search(lines, [&] { return !random.once(4); });
        }
        const QString text = told(filter, encoding, file);
        const std::vector<qint64> rows = startsOf(fresh, filter);
        QVERIFY2(rows == startsOf(searched, filter), qPrintable(text));
        QVERIFY2(fresh.slowLine() == searched.slowLine(), qPrintable(text));
        QVERIFY2(rows == expected, qPrintable(text));
        shown += int(rows.size());
    }
    QVERIFY(shown > 0);
    std::printf("plain search, indexes: %d files, %d lines shown\n", count, shown);
}

// A filter, compared with Qt's search and its expressions.
void tst_PlainSearch::filters()
{
    Random random;
    const int count = Rounds::count(100000, 1000000, 10000000);
    int matched = 0;
    int tooLong = 0;
    for (int pairs = 0; pairs < count;) {
        const bool isExpression = random.once(2);
        const bool isExact = random.once(2);
        const QString wanted = isExpression ? expression(random) : text(random, 5);
        const QRegularExpression plain(wanted, isExact ? QRegularExpression::NoPatternOption
                                                       : QRegularExpression::CaseInsensitiveOption);
        LogFilter filter;
        const bool isValid = !isExpression || QRegularExpression(wanted).isValid();
        QCOMPARE(filter.SetText(wanted, isExpression, isExact), isValid);
        QCOMPARE(LogFilter::ErrorOf(wanted).isEmpty(), QRegularExpression(wanted).isValid());
        if (!isValid)
            continue;
        const Qt::CaseSensitivity sensitivity = isExact ? Qt::CaseSensitive : Qt::CaseInsensitive;
        const QString required = text(random, random.below(4)).remove('"').simplified();
        const QString hidden = text(random, random.below(3)).remove('"').simplified();
        filter.SetTerms(LogTerms(required, isExact), LogTerms(hidden, isExact));
        const auto isIn = [&](QString const& line) {
            return [&line, sensitivity](QString const& term) {
                return line.contains(term, sensitivity);
            };
        };
        const QStringList requiredTerms = words(required);
        const QStringList hiddenTerms = words(hidden);
        for (int left = 20; left > 0; --left, ++pairs) {
            const QString line = text(random, 12);
            const LogFilter::Match found = filter.Find(line);
            if (found == LogFilter::TooLong) {
                ++tooLong;
                continue;
            }
            const bool contains =
                isExpression ? plain.match(line).hasMatch() : line.contains(wanted, sensitivity);
            LogFilter::Match expected = LogFilter::No;
            if (std::any_of(hiddenTerms.begin(), hiddenTerms.end(), isIn(line)))
                expected = LogFilter::Hidden;
            else if (contains &&
                     std::all_of(requiredTerms.begin(), requiredTerms.end(), isIn(line)))
                expected = LogFilter::Yes;
            matched += found == LogFilter::Yes ? 1 : 0;
            if (found != expected)
                QFAIL(qPrintable(told(filter, LogEncoding::Utf8, line.toUtf8())));
        }
    }
    QVERIFY(matched > count / 10 && tooLong < count / 10);
    std::printf("plain search, filters: %d pairs of filter and line, %d matched, %d too long\n",
                count, matched, tooLong);
}

// Decoding, compared with Qt's codecs.
void tst_PlainSearch::decoding()
{
    Random random;
    const int count = Rounds::count(100000, 1000000, 10000000);
    int invalid = 0;
    for (int round = 0; round < count; ++round) {
        static char const* const parts[] = {
            "a",    "é",        "€",        "😀",        "\xEF\xBB\xBF", "\xFF",     "\xC3",
            "\xE2", "\xE2\x82", "\xF0\x9F", "\xC0\x80", "\xED\xA0\x80", "\xF4\x90", "\x80",
            "\xD8", "\xDC",     "\xFE\xFF", "\xFF\xFE", "\x3D\xD8",     "\x01"};
        QByteArray bytes;
        for (int left = random.below(8); left > 0; --left) {
            bytes += random.oneOf(parts);
            if (random.once(3))
                bytes += char(random.below(256));
            if (random.once(4))
                bytes += '\0';
        }
        const LogEncoding encoding = random.oneOf(encodings);
        // Qt's codec for UTF-16 drops half a pair of bytes at the end.
        if (encoding.isWide() && bytes.size() % 2 != 0)
            bytes.chop(1);
        char const* const name = encoding == LogEncoding::Latin1    ? "ISO-8859-1"
                                 : encoding == LogEncoding::Utf8    ? "UTF-8"
                                 : encoding == LogEncoding::Utf16Le ? "UTF-16LE"
                                                                    : "UTF-16BE";
        QTextCodec::ConverterState state(QTextCodec::IgnoreHeader);
        QString plain =
            QTextCodec::codecForName(name)->toUnicode(bytes.constData(), bytes.size(), &state);
        for (int i = 0; i < state.remainingChars; ++i)
            plain += QChar(QChar::ReplacementCharacter);
        withoutHalves(plain);
        if (encoding != LogEncoding::Latin1 && plain.startsWith(QChar(QChar::ByteOrderMark)))
            plain.remove(0, 1);
        invalid += plain.contains(QChar::ReplacementCharacter) ? 1 : 0;
        const QString decoded = encoding.Decode(bytes.constData(), bytes.size());
        if (decoded != plain)
            QFAIL(qPrintable(QString("%1 in %2: %3, plain %4")
                                 .arg(QString(bytes.toHex(' ')), QString(name),
                                      QString(decoded.toUtf8().toHex(' ')),
                                      QString(plain.toUtf8().toHex(' ')))));
    }
    QVERIFY(invalid > 0);
    std::printf("plain search, decoding: %d texts, %d of them not valid\n", count, invalid);
}

QTEST_GUILESS_MAIN(tst_PlainSearch)
#include "tst_PlainSearch.moc"
