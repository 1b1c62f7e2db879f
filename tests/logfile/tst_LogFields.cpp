// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogFields.h"

#include "support/GuardedBytes.h"

#include <QtTest>

using namespace Velocor;

namespace {

// All fields as "name=value", with a "\" before a value that has escapes.
template <class Fields>
QStringList FieldsOf(char const* text, int length)
{
    QStringList found;
    LogField field;
    for (Fields fields(text, length); fields.Next(field);)
        found.append(QString::fromLatin1(field.name, field.nameLength) + '=' +
                     (field.isEscaped ? "\\" : "") +
                     QString::fromLatin1(text + field.value, field.valueLength));
    return found;
}

template <class Fields>
QStringList FieldsOf(QByteArray const& text)
{
    GuardedBytes guarded;
    return FieldsOf<Fields>(guarded.Put(text, true), text.size());
}

// Whether the fields of each beginning of a text are the same, whatever follows.
template <class Fields>
bool IsTextCutAnywhere(QByteArray const& text)
{
    for (int length = 0; length <= text.size(); ++length) {
        const QStringList alone = FieldsOf<Fields>(text.left(length));
        for (char next : {'"', '=', ':', ',', '}', ' ', '\n', '\0'}) {
            const QByteArray followed = text.left(length) + QByteArray(20, next);
            if (FieldsOf<Fields>(followed.constData(), length) != alone) {
                qWarning("%d bytes, followed by %d", length, next);
                return false;
            }
        }
    }
    return true;
}

} // namespace

class tst_LogFields : public QObject
{
    Q_OBJECT

private slots:
    void escapes_data();
    void escapes();
    void json_data();
    void json();
    void logfmt_data();
    void logfmt();
    void journal_data();
    void journal();
};

void tst_LogFields::escapes_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("unescaped");
    const auto row = [](char const* name, char const* text, QString const& unescaped) {
        QTest::newRow(name) << QString(text) << unescaped;
    };
    row("empty", "", "");
    row("none", "a b", "a b");
    row("line feed", "a\\nb", "a\nb");
    row("tab", "a\\tb", "a\tb");
    row("carriage return", "a\\rb", "a\rb");
    row("backspace", "a\\bb", "a\bb");
    row("form feed", "a\\fb", "a\fb");
    row("quotation mark", "\\\"a\\\"", "\"a\"");
    row("backslash", "a\\\\nb", "a\\nb");
    row("slash", "a\\/b", "a/b");
    row("one that JSON does not know", "a\\qb", "a\\qb");
    row("one that JSON does not know, then one that it does", "\\q\\n", "\\q\n");
    row("backslash at the end", "a\\", "a\\");
    row("only a backslash", "\\", "\\");
    row("escape at the end", "a\\n", "a\n");
    row("number", "a\\u20acb", QString("a") + QChar(0x20ac) + 'b');
    row("number in capital letters", "\\u20AC", QChar(0x20ac));
    row("number of a zero character", "a\\u0000b", QString("a") + QChar(0) + 'b');
    row("two numbers", "\\ud83d\\ude00", QString(QChar(0xd83d)) + QChar(0xde00));
    row("number with a digit too few, at the end", "\\u20a", "\\u20a");
    row("number with a digit too few", "\\u20ax", "\\u20ax");
    row("digits after another letter", "\\x20ac", "\\x20ac");
    row("digits after an escape", "\\n20ac", "\n20ac");
}

void tst_LogFields::escapes()
{
    QFETCH(QString, text);
    QTEST(LogField::Unescaped(text), "unescaped");
}

void tst_LogFields::json_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QStringList>("fields");
    const auto row = [](char const* name, char const* text, QStringList const& fields) {
        QTest::newRow(name) << QByteArray(text) << fields;
    };
    row("strings", R"({"a":"1","b":"2"})", {"a=1", "b=2"});
    row("other values", R"({"a":1.5,"b":true,"c":null})", {"a=1.5", "b=true", "c=null"});
    row("blanks of all kinds", " \t\r\n{ \"a\"\t:\r\"1\"\n, \"b\" : 2 } ", {"a=1", "b=2"});
    row("empty name and value", R"({"":""})", {"="});
    row("escapes", R"({"a\"b":"c\\","d":"e","f":"\"g"})", {"a\\\"b=\\c\\\\", "d=e", "f=\\\\\"g"});
    row("escapes in a name only", R"({"a\"":"b","c\"":1})", {"a\\\"=b", "c\\\"=1"});
    row("objects and arrays", R"({"a":{"b":1},"c":[1,{"d":"]"}],"e":"2"})", {"e=2"});
    row("brackets in nested strings", R"({"a":{"}":"\"}"},"b":2})", {"b=2"});
    row("nested first", R"({"a":[],"b":{},"c":1})", {"c=1"});
    row("date", R"({"a":{"$date":"2026"},"b":1})", {"a=2026", "b=1"});
    row("date with blanks", "{\"a\": { \"$date\" : \"2026\" } , \"b\":1}", {"a=2026", "b=1"});
    row("date with escapes", R"({"a":{"$date":"\/"},"b":1})", {"a=\\\\/", "b=1"});
    row("date with more", R"({"a":{"$date":"2026","c":{"d":1}},"b":1})", {"a=2026", "b=1"});
    row("date that is a number", R"({"a":{"$date":{"$numberLong":"1"}},"b":1})", {"b=1"});
    row("object with another name", R"({"a":{"$data":"2026"},"b":1})", {"b=1"});
    row("object with a longer name", R"({"a":{"$dates":"2026"},"b":1})", {"b=1"});
    row("object with a shorter name", R"({"a":{"$dat":"2026"},"b":1})", {"b=1"});
    row("object with a name, but no value", R"({"a":{"$date"},"b":1})", {"b=1"});
    row("array of a date", R"({"a":["$date":"2026"],"b":1})", {"b=1"});
    row("only an object", "[\"a\",1]", {});
    row("text", "\"a\":1", {});
    row("empty", "", {});
    row("blanks", "  ", {});
    row("empty object", "{}", {});
    row("no colon", R"({"a" 1,"b":2})", {});
    row("no quotation mark", "{a:1}", {});
    row("no value", R"({"a":})", {"a="});
    row("cut in a name", R"({"a":1,"b)", {"a=1"});
    row("cut in a string", R"({"a":1,"b":"2)", {"a=1"});
    row("cut after a backslash", R"({"a":1,"b":"2\)", {"a=1"});
    row("cut in a number", R"({"a":12)", {"a=12"});
    row("cut in an object", R"({"a":1,"b":{"c":2)", {"a=1"});
    row("what follows the object", R"({"a":1} {"b":2})", {"a=1"});
}

void tst_LogFields::json()
{
    QFETCH(QByteArray, text);
    QTEST(FieldsOf<JsonFields>(text), "fields");
    QVERIFY(IsTextCutAnywhere<JsonFields>(text));
}

void tst_LogFields::logfmt_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QStringList>("fields");
    const auto row = [](char const* name, char const* text, QStringList const& fields) {
        QTest::newRow(name) << QByteArray(text) << fields;
    };
    row("pairs", "a=1 bc=23", {"a=1", "bc=23"});
    row("blanks of all kinds", " \ta=1\t\r\n b=2 \r\n", {"a=1", "b=2"});
    row("quoted", "a=\"1 2\" b=3", {"a=1 2", "b=3"});
    row("quoted, nothing between", "a=\"1\"b=3", {"a=1", "b=3"});
    row("quoted, empty", "a=\"\" b=3", {"a=", "b=3"});
    row("quoted, with escapes", R"(a="1\"2\\" b="3")", {"a=\\1\\\"2\\\\", "b=3"});
    row("quoted, cut after an escape", R"(a="1\x)", {"a=\\1\\x"});
    row("quoted, cut after an escaped quotation mark", R"(a="1\")", {"a=\\1\\\""});
    row("quotation mark within", "a=1\"2 b=3", {"a=1\"2", "b=3"});
    row("backslash without quotation marks", R"(a=1\ b=2)", {"a=1\\", "b=2"});
    row("equals sign in the value", "a=b=c d==", {"a=b=c", "d=="});
    row("empty value", "a= b=2", {"a=", "b=2"});
    row("empty value at the end", "a=", {"a="});
    row("no name", "a=1 =2 b=3", {"a=1"});
    row("no equals sign", "a=1 b c=2", {"a=1"});
    row("no equals sign at the end", "a=1 b", {"a=1"});
    row("empty", "", {});
    row("blanks", "  ", {});
    row("open quotation mark", "a=\"1 b=2", {"a=1 b=2"});
    row("only a quotation mark", "a=\"", {"a="});
    row("open quotation mark, then a backslash", "a=\"1\\", {"a=1\\"});
}

void tst_LogFields::logfmt()
{
    QFETCH(QByteArray, text);
    QTEST(FieldsOf<LogfmtFields>(text), "fields");
    QVERIFY(IsTextCutAnywhere<LogfmtFields>(text));
}

void tst_LogFields::journal_data()
{
    QTest::addColumn<QByteArray>("text");
    QTest::addColumn<QStringList>("fields");
    const auto row = [](char const* name, QByteArray const& text, QStringList const& fields) {
        QTest::newRow(name) << text << fields;
    };
    // A name and a value with its size, as far as it is there.
    const auto sized = [](char const* name, quint64 size, QByteArray const& value) {
        QByteArray bytes = QByteArray(name) + '\n';
        for (int shift = 0; shift < 64; shift += 8)
            bytes.append(static_cast<char>(size >> shift));
        return bytes + value;
    };
    row("lines", "A=1\nBC=23\n", {"A=1", "BC=23"});
    row("without the last line feed", "A=1\nBC=23", {"A=1", "BC=23"});
    row("equals sign in the value", "A=b=c\nD==", {"A=b=c", "D=="});
    row("empty value", "A=\nB=2", {"A=", "B=2"});
    row("empty name", "=1\nB=2", {"=1", "B=2"});
    row("empty lines", "\n\nA=1\n\n\nB=2\n\n", {"A=1", "B=2"});
    row("empty", "", {});
    row("backslashes are no escapes", "A=\\n", {"A=\\n"});
    row("sized", "A=1\n" + sized("B", 3, "2\n3") + "\nC=4\n", {"A=1", "B=2\n3", "C=4"});
    row("sized, of no bytes", sized("B", 0, "") + "\nC=4", {"B=", "C=4"});
    row("sized, no bytes at the end", sized("B", 0, ""), {"B="});
    row("sized, of 258 bytes", sized("B", 258, QByteArray(258, 'x')) + "\nC=4",
        {"B=" + QString(258, 'x'), "C=4"});
    row("sized, with a byte too few", "A=1\n" + sized("B", 3, "23"), {"A=1"});
    row("sized, of 4 GB", sized("B", quint64(1) << 32, "2345"), {});
    row("sized, of all bytes there are", sized("B", ~quint64(0), "2345"), {});
    row("cut in the size", "A=1\nB\n\x03\0\0\0", {"A=1"});
    row("cut after the name", "A=1\nB\n", {"A=1"});
    row("cut in the name", "A=1\nB", {"A=1"});
}

void tst_LogFields::journal()
{
    QFETCH(QByteArray, text);
    QTEST(FieldsOf<JournalFields>(text), "fields");
    QVERIFY(IsTextCutAnywhere<JournalFields>(text));
}

QTEST_APPLESS_MAIN(tst_LogFields)
#include "tst_LogFields.moc"
