// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"
#include "support/QtVersions.h"

#include "support/TestFiles.h"
#include "xml/BothWriters.h"
#include "xml/VirtualSlot.h"
#include "xml/WriterSteps.h"

#include <QBuffer>
#include <QTemporaryDir>
#include <QXmlDefaultHandler>
#include <QXmlSimpleReader>
#include <QtTest>

#include <limits>
#include <type_traits>

using namespace BothWriters;

// Most rows run on both writers, because they share their operations but no class: any difference
// between them is a bug.

namespace {

enum class WriterKind { Stream, File };

// The attribute text name="value" is four characters longer than its value when the name has one.
QString ValueForAttributeOf(int length)
{
    return Repeated('v', length - 4);
}

// Records every call and every piece of text in order, and lets the writer do its work.
template <class Base>
class RecordingWriter : public Base
{
public:
    QStringList calls;

    int WriteElementValue(QString const& value) override
    {
        calls << "Value(" + value + ")";
        return Base::WriteElementValue(value);
    }

    int WriteElementOpen(QString const& name, int indent) override
    {
        calls << "Open(" + name + ")";
        return Base::WriteElementOpen(name, indent);
    }

    int WriteElementClose(QString const& name, int indent) override
    {
        calls << "Close(" + name + ")";
        return Base::WriteElementClose(name, indent);
    }

    int WriteElementCloseAndEnd(QString const& name, int indent) override
    {
        calls << "CloseAndEnd(" + name + ")";
        return Base::WriteElementCloseAndEnd(name, indent);
    }

    int WriteElementStart(QString const& name, int indent) override
    {
        calls << "Start(" + name + ")";
        return Base::WriteElementStart(name, indent);
    }

    int WriteElementEnd(QString const& name, int indent) override
    {
        calls << "End(" + name + ")";
        return Base::WriteElementEnd(name, indent);
    }

    int WriteElement(QString const& name, QString const& value) override
    {
        calls << "Element(" + name + "," + value + ")";
        return Base::WriteElement(name, value);
    }

    int WriteAttribute(QString const& name, QString const& value) override
    {
        calls << "Attribute(" + name + "," + value + ")";
        return Base::WriteAttribute(name, value);
    }

    int WriteCurrentIndent() override
    {
        calls << "Indent()";
        return Base::WriteCurrentIndent();
    }

    int Write(QString const& text) override
    {
        calls << "Write(" + text + ")";
        return text.size();
    }
};

// Its failAt-th piece of text, counted from 1, is not written; its result is chosen by the test.
template <class Base>
class FailingWriter : public Base
{
public:
    int failAt = 0;
    int result = -1;
    QStringList written;

    int Write(QString const& text) override
    {
        if (++m_count == failAt)
            return result;

        written << text;
        return 0;
    }

private:
    int m_count = 0;
};

// Returns its own codes from the two operations whose results WriteElement() uses.
template <class Base>
class AnsweringWriter : public Base
{
public:
    int indentAnswer = 0;
    int valueAnswer = 0;
    QStringList written;

    int WriteCurrentIndent() override { return indentAnswer; }

    int WriteElementValue(QString const& value) override
    {
        Base::WriteElementValue(value);
        return valueAnswer;
    }

    int Write(QString const& text) override
    {
        written << text;
        return 0;
    }
};

Outcome WrittenByStream(Steps const& steps)
{
    Outcome outcome;
    QBuffer device(&outcome.text);
    device.open(QIODevice::WriteOnly);
    TorkXmlStream writer(&device);
    QtVersions::useUtf8(writer);
    outcome.codes = Perform(writer, steps);
    writer.flush();
    return outcome;
}

Outcome Written(WriterKind kind, Steps const& steps)
{
    return kind == WriterKind::Stream ? WrittenByStream(steps) : WrittenByFile(steps);
}

// One row per writer.
void AddRow(char const* name, Steps const& steps, QString const& expected)
{
    for (WriterKind kind : {WriterKind::Stream, WriterKind::File}) {
        char const* const writer = kind == WriterKind::Stream ? "stream" : "file";
        QTest::addRow("%s: %s", writer, name) << kind << steps << expected.toUtf8();
    }
}

void AddRowColumns()
{
    QTest::addColumn<WriterKind>("kind");
    QTest::addColumn<Steps>("steps");
    QTest::addColumn<QByteArray>("expected");
}

Steps Nested(int levels)
{
    Steps steps;
    for (int level = 0; level < levels; ++level)
        steps << Start("e");
    for (int level = 0; level < levels; ++level)
        steps << End("e");
    return steps;
}

QString NestedText(int levels)
{
    QString text;
    for (int level = 0; level < levels; ++level)
        text += Repeated(' ', 2 * level) + "<e>\n";
    for (int level = levels; level-- > 0;)
        text += Repeated(' ', 2 * level) + "</e>\n";
    return text;
}
// Checked at compile time: the operations every application of the family overrides or calls.
template <class Writer>
constexpr bool HasWriterBases()
{
    return std::is_base_of<QTextStream, Writer>::value &&
           std::is_base_of<QXmlInputSource, Writer>::value &&
           std::has_virtual_destructor<Writer>::value;
}
static_assert(HasWriterBases<TorkXmlStream>(), "");
static_assert(HasWriterBases<TorkXmlFile>(), "");
static_assert(!std::is_base_of<TorkXmlStream, TorkXmlFile>::value, "the writers are unrelated");
static_assert(!std::is_base_of<TorkXmlFile, TorkXmlStream>::value, "the writers are unrelated");

} // namespace

Q_DECLARE_METATYPE(WriterKind)

class tst_TorkXmlWriters : public QObject
{
    Q_OBJECT

private slots:
    void elements_data();
    void elements();
    void levels_data();
    void levels();
    void values_data();
    void values();
    void attributes_data();
    void attributes();
    void wrapping_data();
    void wrapping();
    void emptyNames_data();
    void emptyNames();

    void pieces_data();
    void pieces();
    void failingWrite_data();
    void failingWrite();
    void answersOfOverrides_data();
    void answersOfOverrides();
    void writeResult_data();
    void writeResult();

    void paddingOfPieces_data();
    void paddingOfPieces();

    void basesStandInOrder();
    void isAnInputSource();
    void slotsStandInOrder();
};

void tst_TorkXmlWriters::elements_data()
{
    AddRowColumns();

    AddRow("nothing written at first", {}, "");
    AddRow("open leaves a blank after the name", {Open("item")}, "<item ");
    AddRow("open and close", {Open("item"), Close("item")}, "<item >\n");
    AddRow("open, close and end at once", {Open("item"), CloseAndEnd("item")}, "<item />\n");
    AddRow("start", {Start("item")}, "<item>\n");
    AddRow("start and end", {Start("item"), End("item")}, "<item>\n</item>\n");
    AddRow("end alone", {End("item")}, "</item>\n");
    AddRow("leaf", {Element("item", "text")}, "<item>text</item>\n");
    AddRow("leaf without a value is left out", {Element("item", "")}, "");
    AddRow("leaf with a null value is left out", {Element("item", QString())}, "");
    AddRow("leaf without a value keeps its place free", {Start("a"), Element("b", ""), End("a")},
           "<a>\n</a>\n");
    AddRow("blank value counts as a value", {Element("item", " ")}, "<item> </item>\n");
    AddRow("value alone has no line end", {Value("text")}, "text");
    AddRow("empty value alone writes nothing", {Value("")}, "");
    AddRow("close uses the name only to check it", {Open("a"), Close("b")}, "<a >\n");
    AddRow("close and end uses the name only to check it", {Open("a"), CloseAndEnd("b")},
           "<a />\n");
    AddRow("close without open", {Close("a")}, ">\n");
    AddRow("end tag need not match", {Start("a"), End("b")}, "<a>\n</b>\n");

    AddRow("names are inserted unchanged: open", {Open("a<&\">'\\")}, "<a<&\">'\\ ");
    AddRow("names are inserted unchanged: start", {Start("a<&\">'\\")}, "<a<&\">'\\>\n");
    AddRow("names are inserted unchanged: end", {End("a<&\">'\\")}, "</a<&\">'\\>\n");
    AddRow("names are inserted unchanged: leaf", {Element("a<&\">'\\", "x")},
           "<a<&\">'\\>x</a<&\">'\\>\n");
    AddRow("blank name is a name", {Start(" "), End(" ")}, "< >\n</ >\n");
    AddRow("name with a placeholder: open", {Open("a%1%2")}, "<a%1%2 ");
    AddRow("name with a placeholder: start", {Start("%1")}, "<%1>\n");
    AddRow("name with a placeholder: end", {End("%1")}, "</%1>\n");
    AddRow("name with a placeholder: leaf", {Element("%1", "x")}, "<%1>x</%1>\n");
    AddRow("name outside Latin-1", {Element(QString::fromUtf8("größe-長"), "1")},
           QString::fromUtf8("<größe-長>1</größe-長>\n"));
    AddRow("name with control characters", {Start("a\t\n\x01")}, "<a\t\n\x01>\n");
    AddRow("name of 1 MB", {Start(Repeated('n', 1 << 20))}, "<" + Repeated('n', 1 << 20) + ">\n");
}

void tst_TorkXmlWriters::elements()
{
    QFETCH(WriterKind, kind);
    QFETCH(Steps, steps);
    QFETCH(QByteArray, expected);

    const Outcome outcome = Written(kind, steps);
    QCOMPARE(outcome.text, expected);
    QCOMPARE(outcome.codes, ExpectedCodes(steps));
}

void tst_TorkXmlWriters::levels_data()
{
    AddRowColumns();

    AddRow("no indentation at first", {Indent()}, "");
    AddRow("unit of two blanks", {Start("a"), Indent()}, "<a>\n  ");
    AddRow("unit once a level", {Start("a"), Start("b"), Start("c"), Indent()},
           "<a>\n  <b>\n    <c>\n      ");
    AddRow("children are indented one level", {Start("a"), Element("b", "1"), End("a")},
           "<a>\n  <b>1</b>\n</a>\n");
    AddRow("leaf leaves the level alone", {Start("a"), Element("b", "1"), Element("c", "2")},
           "<a>\n  <b>1</b>\n  <c>2</c>\n");
    AddRow("attribute leaves the level alone", {Start("a"), Attribute("x", "1"), Indent()},
           "<a>\n  ");
    AddRow("value leaves the level alone", {Start("a"), Value("t"), Indent()}, "<a>\nt  ");
    AddRow("value is not indented", {Start("a"), Value("t")}, "<a>\nt");
    AddRow("indentation leaves the level alone", {Start("a"), Indent(), Indent()}, "<a>\n    ");
    AddRow("open raises", {Open("a"), Indent()}, "<a   ");
    AddRow("start and end restore", {Start("a", 3), End("a", 3), Indent()}, "<a>\n</a>\n");
    AddRow("open, close and end restore", {Open("a", 3), CloseAndEnd("a", 3), Indent()}, "<a />\n");
    AddRow("open and close restore", {Open("a", 3), Close("a", 3), Indent()}, "<a >\n");
    AddRow("end tag is at the lowered level", {Start("a", 2), End("b", 1)}, "<a>\n  </b>\n");

    AddRow("element with attributes ends one level too low",
           {Start("root"), Open("item"), Attribute("a", "1"), Close("item"), End("item")},
           "<root>\n  <item  a=\"1\">\n</item>\n");
    AddRow("children of an element with attributes are at its own level",
           {Start("root"), Open("item"), Attribute("a", "1"), Close("item"), Element("x", "1")},
           "<root>\n  <item  a=\"1\">\n  <x>1</x>\n");
    AddRow("smaller indent at close moves the children in",
           {Start("root"), Open("item"), Attribute("a", "1"), Close("item", 0), Element("x", "1"),
            End("item"), End("root")},
           "<root>\n  <item  a=\"1\">\n    <x>1</x>\n  </item>\n</root>\n");
    AddRow("empty elements side by side",
           {Start("root"), Open("a"), CloseAndEnd("a"), Open("b"), CloseAndEnd("b"), End("root")},
           "<root>\n  <a />\n  <b />\n</root>\n");

    AddRow("indent 0 keeps the level", {Start("a", 0), Start("b", 0), End("b", 0), End("a", 0)},
           "<a>\n<b>\n</b>\n</a>\n");
    AddRow("indent 4 counts four units", {Start("a", 4), Element("b", "1"), End("a", 4)},
           "<a>\n        <b>1</b>\n</a>\n");
    AddRow("negative level writes no indentation", {End("a", 3), Indent(), Start("b")},
           "</a>\n<b>\n");
    AddRow("level far below 0 writes no indentation",
           {End("a", std::numeric_limits<int>::max()), Indent(), Start("b", 5), Indent()},
           "</a>\n<b>\n");
    AddRow("larger indent at end leaves a negative level",
           {Start("a"), End("a", 2), Start("b"), Indent(), Start("c"), Indent()},
           "<a>\n</a>\n<b>\n<c>\n  ");
    AddRow("negative level at close", {Close("a"), Start("b"), Indent()}, ">\n<b>\n");
    AddRow("negative level at close and end", {CloseAndEnd("a"), Start("b"), Indent()},
           "/>\n<b>\n");
    AddRow("negative indent lowers at start", {Start("a", 2), Start("b", -1), Indent()},
           "<a>\n    <b>\n  ");
    AddRow("negative indent raises at end", {End("a", -1), Indent()}, "  </a>\n  ");
    AddRow("200 levels deep", Nested(200), NestedText(200));
}

void tst_TorkXmlWriters::levels()
{
    elements();
}

void tst_TorkXmlWriters::values_data()
{
    AddRowColumns();

    AddRow("ampersand", {Value("a&b")}, "<![CDATA[a&b]]>");
    AddRow("backslash", {Value("C:\\data")}, "<![CDATA[C:\\data]]>");
    AddRow("greater-than", {Value("a>b")}, "<![CDATA[a>b]]>");
    AddRow("less-than", {Value("a<b")}, "<![CDATA[a<b]]>");
    AddRow("double quote", {Value("say \"a\"")}, "<![CDATA[say \"a\"]]>");
    AddRow("apostrophe alone is written unchanged", {Value("it's")}, "it's");
    AddRow("apostrophe beside a markup character", {Value("it's <")}, "<![CDATA[it's <]]>");
    AddRow("all five", {Value("&\\><\"")}, "<![CDATA[&\\><\"]]>");
    AddRow("markup character alone", {Value("<")}, "<![CDATA[<]]>");
    AddRow("markup character first", {Value("<a")}, "<![CDATA[<a]]>");
    AddRow("markup character last", {Value("a<")}, "<![CDATA[a<]]>");
    AddRow("wrapped once, however many", {Value("<<<")}, "<![CDATA[<<<]]>");
    AddRow("entity is not read as one", {Value("&amp;")}, "<![CDATA[&amp;]]>");
    AddRow("end of a section is not split", {Value("a]]>b")}, "<![CDATA[a]]>b]]>");
    AddRow("section is wrapped again", {Value("<![CDATA[a]]>")}, "<![CDATA[<![CDATA[a]]>]]>");
    AddRow("square brackets alone are no markup", {Value("a]]b")}, "a]]b");
    AddRow("slash is no markup", {Value("/a/b")}, "/a/b");
    AddRow("full-width less-than is no markup", {Value(QString(QChar(0xff1c)))},
           QString(QChar(0xff1c)));
    AddRow("placeholder", {Value("%1 %2 %L1")}, "%1 %2 %L1");
    AddRow("placeholder beside markup", {Value("<%1 %2>")}, "<![CDATA[<%1 %2>]]>");
    AddRow("white space stays", {Value(" \ta\r\n ")}, " \ta\r\n ");
    AddRow("control characters stay", {Value("\x01\x02\x1f\x7f")}, "\x01\x02\x1f\x7f");
    AddRow("zero character stays", {Value(QString(QChar(0)))}, QString(QChar(0)));
    AddRow("outside Latin-1", {Value(QString::fromUtf8("größer als 長 😀"))},
           QString::fromUtf8("größer als 長 😀"));

    AddRow("leaf with markup", {Element("a", "x<y")}, "<a><![CDATA[x<y]]></a>\n");
    AddRow("leaf with a path", {Element("a", "\\\\host\\c")}, "<a><![CDATA[\\\\host\\c]]></a>\n");
    AddRow("leaf with an apostrophe", {Element("a", "it's")}, "<a>it's</a>\n");
    AddRow("leaf with a placeholder", {Element("%1", "%1")}, "<%1>%1</%1>\n");
    AddRow("indented leaf with markup", {Start("r"), Element("a", "&")},
           "<r>\n  <a><![CDATA[&]]></a>\n");
    AddRow("value of 1 MB", {Value(Repeated('x', 1 << 20))}, Repeated('x', 1 << 20));
    AddRow("value of 1 MB with markup at its end", {Element("a", Repeated('x', 1 << 20) + "<")},
           "<a><![CDATA[" + Repeated('x', 1 << 20) + "<]]></a>\n");
}

void tst_TorkXmlWriters::values()
{
    elements();
}

void tst_TorkXmlWriters::attributes_data()
{
    AddRowColumns();

    AddRow("two blanks before the first", {Open("e"), Attribute("a", "1"), Close("e")},
           "<e  a=\"1\">\n");
    AddRow("one blank between", {Open("e"), Attribute("a", "1"), Attribute("b", "2"), Close("e")},
           "<e  a=\"1\" b=\"2\">\n");
    AddRow("empty element", {Open("e"), Attribute("a", "1"), CloseAndEnd("e")}, "<e  a=\"1\"/>\n");
    AddRow("collected, not written", {Open("e"), Attribute("a", "1")}, "<e ");
    AddRow("empty value", {Open("e"), Attribute("a", ""), Close("e")}, "<e  a=\"\">\n");
    AddRow("null value", {Open("e"), Attribute("a", QString()), Close("e")}, "<e  a=\"\">\n");
    AddRow("same name twice", {Open("e"), Attribute("a", "1"), Attribute("a", "2"), Close("e")},
           "<e  a=\"1\" a=\"2\">\n");
    AddRow("value is not escaped", {Open("e"), Attribute("a", "<&\">'\\"), Close("e")},
           "<e  a=\"<&\">'\\\">\n");
    AddRow("name is not escaped", {Open("e"), Attribute("<&\">'\\", "1"), Close("e")},
           "<e  <&\">'\\=\"1\">\n");
    AddRow("placeholder of the name in the value", {Open("e"), Attribute("a", "%1"), Close("e")},
           "<e  a=\"%1\">\n");
    AddRow("placeholder of the value in the value", {Open("e"), Attribute("a", "%2"), Close("e")},
           "<e  a=\"%2\">\n");
    // The name is substituted first and alone; the value then fills the lowest placeholder left.
    AddRow("first placeholder in the name takes the value",
           {Open("e"), Attribute("a%1", "v"), Close("e")}, "<e  av=\"%2\">\n");
    AddRow("second placeholder in the name takes the value too",
           {Open("e"), Attribute("a%2", "v"), Close("e")}, "<e  av=\"v\">\n");
    AddRow("outside Latin-1",
           {Open("e"), Attribute(QString::fromUtf8("ä"), QString::fromUtf8("長")), Close("e")},
           QString::fromUtf8("<e  ä=\"長\">\n"));
    AddRow("control characters stay", {Open("e"), Attribute("a", "\t\n\x01"), Close("e")},
           "<e  a=\"\t\n\x01\">\n");
    AddRow("gone after close", {Open("e"), Attribute("a", "1"), Close("e"), Open("f"), Close("f")},
           "<e  a=\"1\">\n<f >\n");
    AddRow("gone after close and end",
           {Open("e"), Attribute("a", "1"), CloseAndEnd("e"), Open("f"), CloseAndEnd("f")},
           "<e  a=\"1\"/>\n<f />\n");
    AddRow("kept over other operations until the next close",
           {Attribute("a", "1"), Start("b"), Element("c", "2"), End("b"), Close("e", 0)},
           "<b>\n  <c>2</c>\n</b>\n a=\"1\">\n");
    AddRow("kept over a further open", {Open("a"), Attribute("x", "1"), Open("b"), Close("b")},
           "<a   <b  x=\"1\">\n");
}

void tst_TorkXmlWriters::attributes()
{
    elements();
}

void tst_TorkXmlWriters::wrapping_data()
{
    AddRowColumns();

    const QString long80 = ValueForAttributeOf(80);
    const QString long81 = ValueForAttributeOf(81);
    const QString wrap = "a=\"" + long81 + "\"";

    AddRow("first of 80 characters fits", {Open("e"), Attribute("a", long80), Close("e")},
           "<e  a=\"" + long80 + "\">\n");
    AddRow("first of 81 characters starts a line at column 0",
           {Open("e"), Attribute("a", long81), Close("e")}, "<e \n" + wrap + ">\n");
    AddRow("first of 81 characters breaks before it is closed", {Open("e"), Attribute("a", long81)},
           "<e \n");
    AddRow("indentation and start tag do not count",
           {Start("r", 50), Open(Repeated('n', 200)), Attribute("a", long80)},
           "<r>\n" + Repeated(' ', 100) + "<" + Repeated('n', 200) + " ");

    // ' a="1"' is 6 characters pending, so 74 more fit and 75 do not.
    AddRow("second fits below 81 with the pending text",
           {Open("e"), Attribute("a", "1"), Attribute("b", ValueForAttributeOf(74)), Close("e")},
           "<e  a=\"1\" b=\"" + ValueForAttributeOf(74) + "\">\n");
    AddRow("second wraps at 81 with the pending text",
           {Open("e"), Attribute("a", "1"), Attribute("b", ValueForAttributeOf(75)), Close("e")},
           "<e  a=\"1\"\nb=\"" + ValueForAttributeOf(75) + "\">\n");
    AddRow("what is pending is written at the wrap",
           {Open("e"), Attribute("a", "1"), Attribute("b", ValueForAttributeOf(75))},
           "<e  a=\"1\"\n");
    AddRow("close and end after a wrap", {Open("e"), Attribute("a", long81), CloseAndEnd("e")},
           "<e \n" + wrap + "/>\n");
    // After a wrap the pending text is the attribute alone: 75 characters, so 5 more fit.
    AddRow("next one joins the new line with one blank",
           {Open("e"), Attribute("a", "1"), Attribute("b", ValueForAttributeOf(75)),
            Attribute("c", "1"), Close("e")},
           "<e  a=\"1\"\nb=\"" + ValueForAttributeOf(75) + "\" c=\"1\">\n");
    AddRow("next one wraps at 81 with the new line",
           {Open("e"), Attribute("a", "1"), Attribute("b", ValueForAttributeOf(75)),
            Attribute("c", "12"), Close("e")},
           "<e  a=\"1\"\nb=\"" + ValueForAttributeOf(75) + "\"\nc=\"12\">\n");
    AddRow("every long one has its line",
           {Open("e"), Attribute("a", long81), Attribute("a", long81), Close("e")},
           "<e \n" + wrap + "\n" + wrap + ">\n");
    AddRow("wrapped lines are not indented",
           {Start("r", 4), Open("e"), Attribute("a", long81), Close("e")},
           "<r>\n        <e \n" + wrap + ">\n");
    AddRow("wrap without an open element", {Attribute("a", long81)}, "\n");
    AddRow("close after a wrap leaves nothing pending",
           {Open("e"), Attribute("a", long81), Close("e"), Close("e")}, "<e \n" + wrap + ">\n>\n");
    AddRow("characters are counted, not bytes",
           {Open("e"), Attribute("a", Repeated(QChar(0x9577), 76)), Close("e")},
           "<e  a=\"" + Repeated(QChar(0x9577), 76) + "\">\n");
    AddRow("value of 1 MB", {Open("e"), Attribute("a", Repeated('v', 1 << 20)), Close("e")},
           "<e \na=\"" + Repeated('v', 1 << 20) + "\">\n");
}

void tst_TorkXmlWriters::wrapping()
{
    elements();
}

void tst_TorkXmlWriters::emptyNames_data()
{
    AddRowColumns();

    // The indentation that follows shows the level, the close shows what is pending.
    AddRow("open", {Refused(Open("")), Indent()}, "");
    AddRow("open with a null name", {Refused(Open(QString())), Indent()}, "");
    AddRow("start", {Refused(Start("")), Indent()}, "");
    AddRow("start with a null name", {Refused(Start(QString())), Indent()}, "");
    AddRow("end keeps the level", {Start("a"), Refused(End("")), Indent()}, "<a>\n  ");
    AddRow("close keeps the level", {Start("a"), Refused(Close("")), Indent()}, "<a>\n  ");
    AddRow("close and end keeps the level", {Start("a"), Refused(CloseAndEnd("")), Indent()},
           "<a>\n  ");
    AddRow("close discards the attributes",
           {Open("e"), Attribute("a", "1"), Refused(Close("")), Close("e")}, "<e >\n");
    AddRow("close and end discards the attributes",
           {Open("e"), Attribute("a", "1"), Refused(CloseAndEnd("")), Close("e")}, "<e >\n");
    AddRow("leaf", {Refused(Element("", "text"))}, "");
    AddRow("leaf without a value either", {Refused(Element("", ""))}, "");
    AddRow("attribute", {Open("e"), Refused(Attribute("", "1")), Close("e")}, "<e >\n");
    AddRow("attribute keeps what is pending",
           {Open("e"), Attribute("a", "1"), Refused(Attribute("", "2")), Close("e")},
           "<e  a=\"1\">\n");
    AddRow("long attribute does not wrap",
           {Open("e"), Attribute("a", "1"), Refused(Attribute("", Repeated('v', 100))), Close("e")},
           "<e  a=\"1\">\n");
    AddRow("open keeps what is pending",
           {Attribute("a", "1"), Refused(Open("")), Refused(Start("")), Refused(End("")),
            Refused(Element("", "x")), Close("e")},
           " a=\"1\">\n");
}

void tst_TorkXmlWriters::emptyNames()
{
    elements();
}

void tst_TorkXmlWriters::pieces_data()
{
    QTest::addColumn<Steps>("steps");
    QTest::addColumn<QStringList>("expected");

    const QString long81 = ValueForAttributeOf(81);

    QTest::newRow("open") << Steps{Open("a")} << QStringList{"Open(a)", "Indent()", "Write(<a )"};
    QTest::newRow("start") << Steps{Start("a")}
                           << QStringList{"Start(a)", "Indent()", "Write(<a>\n)"};
    QTest::newRow("end") << Steps{End("a")} << QStringList{"End(a)", "Indent()", "Write(</a>\n)"};
    QTest::newRow("close in one piece")
        << Steps{Attribute("x", "1"), Close("a")}
        << QStringList{"Attribute(x,1)", "Close(a)", "Write( x=\"1\">\n)"};
    QTest::newRow("close and end in one piece")
        << Steps{Attribute("x", "1"), CloseAndEnd("a")}
        << QStringList{"Attribute(x,1)", "CloseAndEnd(a)", "Write( x=\"1\"/>\n)"};
    QTest::newRow("leaf") << Steps{Element("a", "t")}
                          << QStringList{"Element(a,t)", "Indent()", "Write(<a>)",
                                         "Value(t)",     "Write(t)", "Write(</a>\n)"};
    QTest::newRow("leaf with markup")
        << Steps{Element("a", "<")}
        << QStringList{"Element(a,<)",         "Indent()",     "Write(<a>)", "Value(<)",
                       "Write(<![CDATA[<]]>)", "Write(</a>\n)"};
    QTest::newRow("leaf without a value") << Steps{Element("a", "")} << QStringList{"Element(a,)"};
    QTest::newRow("value") << Steps{Value("t")} << QStringList{"Value(t)", "Write(t)"};
    QTest::newRow("empty value") << Steps{Value("")} << QStringList{"Value()"};
    QTest::newRow("indentation of level 0") << Steps{Indent()} << QStringList{"Indent()"};
    QTest::newRow("indentation one unit at a time")
        << Steps{Start("a", 3), Indent()}
        << QStringList{"Start(a)",  "Indent()",  "Write(<a>\n)", "Indent()",
                       "Write(  )", "Write(  )", "Write(  )"};
    QTest::newRow("indentation before an open")
        << Steps{Start("a", 2), Open("b")}
        << QStringList{"Start(a)", "Indent()",  "Write(<a>\n)", "Open(b)",
                       "Indent()", "Write(  )", "Write(  )",    "Write(<b )"};
    QTest::newRow("indentation before a leaf")
        << Steps{Start("a"), Element("b", "t")}
        << QStringList{"Start(a)",  "Indent()",   "Write(<a>\n)", "Element(b,t)", "Indent()",
                       "Write(  )", "Write(<b>)", "Value(t)",     "Write(t)",     "Write(</b>\n)"};
    QTest::newRow("indentation before an end, at the lowered level")
        << Steps{Start("a", 2), End("b", 1)}
        << QStringList{"Start(a)", "Indent()",  "Write(<a>\n)", "End(b)",
                       "Indent()", "Write(  )", "Write(</b>\n)"};
    QTest::newRow("attribute writes nothing")
        << Steps{Attribute("x", "1")} << QStringList{"Attribute(x,1)"};
    QTest::newRow("wrap writes the pending text in one piece")
        << Steps{Attribute("x", "1"), Attribute("y", long81)}
        << QStringList{"Attribute(x,1)", "Attribute(y," + long81 + ")", "Write( x=\"1\"\n)"};
    QTest::newRow("refused operations write nothing")
        << Steps{Refused(Open("")),          Refused(Close("")), Refused(CloseAndEnd("")),
                 Refused(Start("")),         Refused(End("")),   Refused(Element("", "t")),
                 Refused(Attribute("", "1"))}
        << QStringList{"Open()", "Close()",     "CloseAndEnd()", "Start()",
                       "End()",  "Element(,t)", "Attribute(,1)"};
}

void tst_TorkXmlWriters::pieces()
{
    QFETCH(Steps, steps);
    QFETCH(QStringList, expected);

    // Without a device and without a name: an overridden Write() receives everything that is
    // written.
    RecordingWriter<TorkXmlStream> stream;
    QCOMPARE(Perform(stream, steps), ExpectedCodes(steps));
    QCOMPARE(stream.calls, expected);

    RecordingWriter<TorkXmlFile> file;
    QCOMPARE(Perform(file, steps), ExpectedCodes(steps));
    QCOMPARE(file.calls, expected);
}

void tst_TorkXmlWriters::failingWrite_data()
{
    QTest::addColumn<int>("failAt");
    QTest::addColumn<int>("result");
    QTest::addColumn<Steps>("steps");
    QTest::addColumn<QStringList>("expected");

    const QString long81 = ValueForAttributeOf(81);

    QTest::newRow("open does not raise the level")
        << 1 << -1 << Steps{Failed(Open("a")), Indent(), Start("b")} << QStringList{"<b>\n"};
    QTest::newRow("start does not raise the level")
        << 1 << -1 << Steps{Failed(Start("a")), Indent(), Start("b")} << QStringList{"<b>\n"};
    QTest::newRow("close has lowered the level")
        << 2 << -1 << Steps{Start("a", 2), Failed(Close("b")), Indent()}
        << QStringList{"<a>\n", "  "};
    QTest::newRow("close and end has lowered the level")
        << 2 << -1 << Steps{Start("a", 2), Failed(CloseAndEnd("b")), Indent()}
        << QStringList{"<a>\n", "  "};
    QTest::newRow("end has lowered the level")
        << 2 << -1 << Steps{Start("a"), Failed(End("a")), Indent(), Start("b")}
        << QStringList{"<a>\n", "<b>\n"};
    QTest::newRow("close keeps the pending text and its closing characters")
        << 1 << -1 << Steps{Attribute("x", "1"), Failed(Close("a")), Close("a")}
        << QStringList{" x=\"1\">\n>\n"};
    QTest::newRow("close and end keeps the pending text and its closing characters")
        << 1 << -1 << Steps{Attribute("x", "1"), Failed(CloseAndEnd("a")), CloseAndEnd("a")}
        << QStringList{" x=\"1\"/>\n/>\n"};
    QTest::newRow("leaf stops at its start tag")
        << 1 << -1 << Steps{Failed(Element("a", "t"))} << QStringList{};
    QTest::newRow("leaf continues after its value")
        << 2 << -1 << Steps{Element("a", "t")} << QStringList{"<a>", "</a>\n"};
    QTest::newRow("leaf reports its end tag")
        << 3 << -1 << Steps{Failed(Element("a", "t"))} << QStringList{"<a>", "t"};
    QTest::newRow("leaf continues after its indentation")
        << 2 << -1 << Steps{Start("r"), Element("a", "t")}
        << QStringList{"<r>\n", "<a>", "t", "</a>\n"};
    QTest::newRow("leaf without a value does not write, so does not fail")
        << 1 << -1 << Steps{Element("a", "")} << QStringList{};
    QTest::newRow("value ignores it") << 1 << -1 << Steps{Value("t")} << QStringList{};
    QTest::newRow("value in a section ignores it") << 1 << -1 << Steps{Value("<")} << QStringList{};
    QTest::newRow("indentation ignores it")
        << 2 << -1 << Steps{Start("a", 3), Indent()} << QStringList{"<a>\n", "  ", "  "};
    QTest::newRow("open continues after its indentation")
        << 2 << -1 << Steps{Start("a"), Open("b"), Indent()}
        << QStringList{"<a>\n", "<b ", "  ", "  "};
    QTest::newRow("start continues after its indentation")
        << 2 << -1 << Steps{Start("a"), Start("b"), Indent()}
        << QStringList{"<a>\n", "<b>\n", "  ", "  "};
    QTest::newRow("end continues after its indentation")
        << 2 << -1 << Steps{Start("a", 2), End("b"), Indent()}
        << QStringList{"<a>\n", "</b>\n", "  "};
    QTest::newRow("attribute that does not wrap does not write")
        << 1 << -1 << Steps{Attribute("x", "1")} << QStringList{};
    QTest::newRow("wrap ignores it and continues with the new line")
        << 1 << -1 << Steps{Attribute("x", "1"), Attribute("y", long81), Close("a")}
        << QStringList{"y=\"" + long81 + "\">\n"};
    QTest::newRow("any negative count is a failure")
        << 1 << std::numeric_limits<int>::min() << Steps{Failed(Start("a"))} << QStringList{};
    QTest::newRow("count of 0 is none")
        << 1 << 0 << Steps{Start("a"), Indent()} << QStringList{"  "};
    QTest::newRow("positive count is none")
        << 1 << 1006 << Steps{Start("a"), Indent()} << QStringList{"  "};
}

void tst_TorkXmlWriters::failingWrite()
{
    QFETCH(int, failAt);
    QFETCH(int, result);
    QFETCH(Steps, steps);
    QFETCH(QStringList, expected);

    FailingWriter<TorkXmlStream> stream;
    stream.failAt = failAt;
    stream.result = result;
    QCOMPARE(Perform(stream, steps), ExpectedCodes(steps));
    QCOMPARE(stream.written, expected);

    FailingWriter<TorkXmlFile> file;
    file.failAt = failAt;
    file.result = result;
    QCOMPARE(Perform(file, steps), ExpectedCodes(steps));
    QCOMPARE(file.written, expected);
}

void tst_TorkXmlWriters::answersOfOverrides_data()
{
    QTest::addColumn<int>("indentAnswer");
    QTest::addColumn<int>("valueAnswer");
    QTest::addColumn<Steps>("steps");
    QTest::addColumn<QStringList>("expected");

    QTest::newRow("leaf passes on the indentation's and writes nothing")
        << 42 << 0 << Steps{Gives(42, Element("a", "t"))} << QStringList{};
    QTest::newRow("leaf passes on a negative one of the indentation")
        << -3 << 0 << Steps{Gives(-3, Element("a", "t"))} << QStringList{};
    QTest::newRow("leaf passes on the value's and writes no end tag")
        << 0 << 43 << Steps{Gives(43, Element("a", "t"))} << QStringList{"<a>", "t"};
    QTest::newRow("leaf passes on a negative one of the value")
        << 0 << -3 << Steps{Gives(-3, Element("a", "t"))} << QStringList{"<a>", "t"};
    QTest::newRow("leaf without a value asks neither")
        << 42 << 43 << Steps{Element("a", "")} << QStringList{};
    QTest::newRow("open ignores the indentation's")
        << 42 << 0 << Steps{Open("a")} << QStringList{"<a "};
    QTest::newRow("start ignores the indentation's")
        << 42 << 0 << Steps{Start("a")} << QStringList{"<a>\n"};
    QTest::newRow("end ignores the indentation's")
        << 42 << 0 << Steps{End("a")} << QStringList{"</a>\n"};
}

void tst_TorkXmlWriters::answersOfOverrides()
{
    QFETCH(int, indentAnswer);
    QFETCH(int, valueAnswer);
    QFETCH(Steps, steps);
    QFETCH(QStringList, expected);

    AnsweringWriter<TorkXmlStream> stream;
    stream.indentAnswer = indentAnswer;
    stream.valueAnswer = valueAnswer;
    QCOMPARE(Perform(stream, steps), ExpectedCodes(steps));
    QCOMPARE(stream.written, expected);

    AnsweringWriter<TorkXmlFile> file;
    file.indentAnswer = indentAnswer;
    file.valueAnswer = valueAnswer;
    QCOMPARE(Perform(file, steps), ExpectedCodes(steps));
    QCOMPARE(file.written, expected);
}

void tst_TorkXmlWriters::writeResult_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("ofStream");

    QTest::newRow("nothing") << QString() << 0;
    QTest::newRow("one character") << "x" << 1;
    QTest::newRow("declaration line") << "<?xml version=\"1.0\"?>\n" << 22;
    QTest::newRow("characters, not bytes") << QString::fromUtf8("größe") << 5;
    QTest::newRow("halves of a character outside the plane") << QString::fromUtf8("😀") << 2;
    QTest::newRow("placeholder") << "%1" << 2;
    QTest::newRow("1 MB") << Repeated('x', 1 << 20) << (1 << 20);
}

void tst_TorkXmlWriters::writeResult()
{
    QFETCH(QString, text);
    QFETCH(int, ofStream);

    QString written;
    TorkXmlStream stream(&written, QIODevice::WriteOnly);
    QCOMPARE(stream.Write(text), ofStream);
    QCOMPARE(written, text);

    const QTemporaryDir dir;
    TorkXmlFile file(dir.filePath("out.xml"));
    QVERIFY2(file.open(QIODevice::WriteOnly), qPrintable(file.errorString()));
    QtVersions::useUtf8(file);
    QCOMPARE(file.Write(text), 0);
    file.flush();
    QCOMPARE(TestFiles::read(file.name()), text.toUtf8());
}

void tst_TorkXmlWriters::paddingOfPieces_data()
{
    QTest::addColumn<int>("width");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("none") << 0 << QByteArray("<a>\n  <b>1</b>\n</a>\n");
    QTest::newRow("each piece by itself") << 4 << QByteArray("<a>\n    <b> 1   </b>\n</a>\n");
}

// A writer is a text stream too, with all of a text stream's settings.
void tst_TorkXmlWriters::paddingOfPieces()
{
    QFETCH(int, width);

    QByteArray bytes;
    {
        TorkXmlStream writer(&bytes, QIODevice::WriteOnly);
        writer.setFieldAlignment(QTextStream::AlignLeft);
        writer.setFieldWidth(width);
        Perform(writer, Steps{Start("a"), Element("b", "1"), End("a")});
    }
    QTEST(bytes, "expected");
}

template <class Writer>
static void BasesStandInOrder()
{
    Writer writer;
    void* const object = &writer;
    void* const first = static_cast<QTextStream*>(&writer);
    void* const second = static_cast<QXmlInputSource*>(&writer);

    QCOMPARE(first, object);
    QVERIFY(std::less<void*>()(first, second));
}

void tst_TorkXmlWriters::basesStandInOrder()
{
    BasesStandInOrder<TorkXmlStream>();
    BasesStandInOrder<TorkXmlFile>();
}

template <class Writer>
static void IsAnInputSource()
{
    Writer writer;
    QXmlInputSource* const source = &writer;
    source->setData(QString("<a><b/></a>"));

    QXmlSimpleReader reader;
    QXmlDefaultHandler handler;
    reader.setContentHandler(&handler);
    QVERIFY(reader.parse(source));
}

void tst_TorkXmlWriters::isAnInputSource()
{
    IsAnInputSource<TorkXmlStream>();
    IsAnInputSource<TorkXmlFile>();
}

template <class Writer>
static void SlotsStandInOrder()
{
    // The text stream's own virtual destructor takes the first two slots.
    QCOMPARE(int(VirtualSlot(&Writer::WriteElementValue)), 2);
    QCOMPARE(int(VirtualSlot(&Writer::WriteElementOpen)), 3);
    QCOMPARE(int(VirtualSlot(&Writer::WriteElementClose)), 4);
    QCOMPARE(int(VirtualSlot(&Writer::WriteElementCloseAndEnd)), 5);
    QCOMPARE(int(VirtualSlot(&Writer::WriteElementStart)), 6);
    QCOMPARE(int(VirtualSlot(&Writer::WriteElementEnd)), 7);
    QCOMPARE(int(VirtualSlot(&Writer::WriteElement)), 8);
    QCOMPARE(int(VirtualSlot(&Writer::WriteAttribute)), 9);
    QCOMPARE(int(VirtualSlot(&Writer::WriteCurrentIndent)), 10);
    QCOMPARE(int(VirtualSlot(&Writer::Write)), 11);
}

void tst_TorkXmlWriters::slotsStandInOrder()
{
    SlotsStandInOrder<TorkXmlStream>();
    SlotsStandInOrder<TorkXmlFile>();
}

QTEST_GUILESS_MAIN(tst_TorkXmlWriters)

#include "tst_TorkXmlWriters.moc"
