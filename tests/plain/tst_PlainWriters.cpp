// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares both XML writers with a plain one, which makes a virtual call for each piece, over
// random calls: the same bytes, result codes and calls that reach a subclass, whatever it
// overrides, also where its Write() reenters the writer, on every kind of device, with and without
// run-time type information.

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"
#include "plain/Program.h"
#include "support/Sanitizers.h"
#include "support/TestFiles.h"
#include "xml/WriterSteps.h"
#include "xml/WritersWithoutTypes.h"

#include <QBuffer>
#include <QTemporaryDir>
#include <QtTest>

#include <cstdio>

namespace {

// What a subclass overrides, as bits, and when its Write() fails.
struct Kind
{
    enum Bit {
        Value = 1,
        Open = 2,
        Close = 4,
        CloseAndEnd = 8,
        Start = 16,
        End = 32,
        Leaf = 64,
        Attribute = 128,
        Indent = 256,
        Write = 512,
        All = 1023
    };

    int overridden = 0;
    int failEvery = 0;   // every nth Write() reports -1; 0 for none
    int returnEvery = 0; // every nth Write() reenters the writer; 0 for none
    int indentCode = 0;  // what an overridden WriteCurrentIndent() returns
    int valueCode = 0;   // what an overridden WriteElementValue() returns
    bool isFile = false; // whose Write() returns 0
    int fieldWidth = 0;
};

// The calls that reached a subclass, and how often its Write() was called.
struct Record
{
    QStringList calls;
    int writes = 0;
    int outerWrites = 0;
    bool isInside = false;
};

QString Call(char const* operation, QString const& first, QString const& second = QString())
{
    return QLatin1String(operation) + '(' + first + '|' + second + ')';
}

// What an overridden Write() does when it reenters the writer with the text it was given.
template <class Writer>
void ComeBack(Writer& writer, Kind const& kind, QString const& text)
{
    Record& record = writer.record;
    const bool may = kind.overridden & Kind::Write && kind.returnEvery > 0 && !record.isInside;
    if (!may || ++record.outerWrites % kind.returnEvery != 0)
        return;
    record.isInside = true;
    writer.WriteAttribute("again", text);
    writer.WriteElement("inside", text);
    writer.WriteElementStart("between", 1);
    writer.WriteElementEnd("between", 1);
    writer.WriteAttribute("a", text);
    record.calls << Call("still", text);
    record.isInside = false;
}

// The plain writer. A virtual call is a call of an operation that records it if the kind overrides
// it, as a subclass would.
class PlainWriter
{
public:
    PlainWriter(QTextStream* stream, Kind const& kind) : m_stream(stream), m_kind(kind) {}

    int WriteElementOpen(QString const& name, int indent)
    {
        note(Kind::Open, "open", name, QString::number(indent));
        if (name.isEmpty())
            return 1005;
        WriteCurrentIndent();
        if (Write(QString("<%1 ").replace("%1", name)) < 0)
            return 1006;
        m_level += indent;
        return 0;
    }

    int WriteAttribute(QString const& name, QString const& value)
    {
        note(Kind::Attribute, "attribute", name, value);
        if (name.isEmpty())
            return 1005;
        const QString attribute = QString("%1=\"%2\"").arg(name).arg(value);
        if (attribute.length() + m_pending.length() < 81) {
            m_pending += " " + attribute;
        } else {
            m_pending += "\n";
            Write(m_pending);
            m_pending = attribute;
        }
        return 0;
    }

    int WriteElementClose(QString const& name, int indent)
    {
        note(Kind::Close, "close", name, QString::number(indent));
        return close(name, indent, ">\n");
    }

    int WriteElementCloseAndEnd(QString const& name, int indent)
    {
        note(Kind::CloseAndEnd, "close and end", name, QString::number(indent));
        return close(name, indent, "/>\n");
    }

    int WriteElementStart(QString const& name, int indent)
    {
        note(Kind::Start, "start", name, QString::number(indent));
        if (name.isEmpty())
            return 1005;
        WriteCurrentIndent();
        if (Write(QString("<%1>\n").replace("%1", name)) < 0)
            return 1006;
        m_level += indent;
        return 0;
    }

    int WriteElementEnd(QString const& name, int indent)
    {
        note(Kind::End, "end", name, QString::number(indent));
        if (name.isEmpty())
            return 1005;
        m_level -= indent;
        WriteCurrentIndent();
        return Write(QString("</%1>\n").replace("%1", name)) < 0 ? 1006 : 0;
    }

    int WriteElement(QString const& name, QString const& value)
    {
        note(Kind::Leaf, "leaf", name, value);
        if (name.isEmpty())
            return 1005;
        if (value.isEmpty())
            return 0;
        if (const int code = WriteCurrentIndent())
            return code;
        if (Write(QString("<%1>").replace("%1", name)) < 0)
            return 1006;
        if (const int code = WriteElementValue(value))
            return code;
        return Write(QString("</%1>\n").replace("%1", name)) < 0 ? 1006 : 0;
    }

    int WriteElementValue(QString const& value)
    {
        note(Kind::Value, "value", value);
        if (!value.isEmpty()) {
            bool hasMarkup = false;
            for (char const* markup : {"&", "\\", ">", "<", "\""})
                hasMarkup = hasMarkup || value.contains(markup);
            Write(hasMarkup ? QString("<![CDATA[%1]]>").replace("%1", value) : value);
        }
        return m_kind.overridden & Kind::Value ? m_kind.valueCode : 0;
    }

    int WriteCurrentIndent()
    {
        note(Kind::Indent, "indent", QString());
        for (int i = 0; i < m_level; ++i)
            Write("  ");
        return m_kind.overridden & Kind::Indent ? m_kind.indentCode : 0;
    }

    int Write(QString text)
    {
        note(Kind::Write, "write", text);
        if (m_stream)
            *m_stream << text;
        ComeBack(*this, m_kind, text);
        const bool fails = m_kind.overridden & Kind::Write && m_kind.failEvery > 0 &&
                           ++record.writes % m_kind.failEvery == 0;
        if (fails)
            return -1;
        return m_kind.isFile ? 0 : text.length();
    }

    Record record;

private:
    int close(QString const& name, int indent, char const* end)
    {
        if (name.isEmpty()) {
            m_pending.clear();
            return 1005;
        }
        m_level -= indent;
        m_pending += end;
        if (Write(m_pending) < 0)
            return 1006;
        m_pending.clear();
        return 0;
    }

    void note(Kind::Bit bit, char const* operation, QString const& first,
              QString const& second = QString())
    {
        if (m_kind.overridden & bit)
            record.calls << Call(operation, first, second);
    }

    QTextStream* m_stream;
    Kind m_kind;
    qint64 m_level = 0;
    QString m_pending;
};

// A subclass that overrides everything but ignores what its kind does not override.
template <class Writer>
class Subclass : public Writer
{
public:
    template <class... Arguments>
    explicit Subclass(Kind const& kind, Arguments... arguments) : Writer(arguments...), m_kind(kind)
    {}

    int WriteElementValue(QString const& value) override
    {
        note(Kind::Value, "value", value);
        const int code = Writer::WriteElementValue(value);
        return m_kind.overridden & Kind::Value ? m_kind.valueCode : code;
    }

    int WriteElementOpen(QString const& name, int indent) override
    {
        note(Kind::Open, "open", name, QString::number(indent));
        return Writer::WriteElementOpen(name, indent);
    }

    int WriteElementClose(QString const& name, int indent) override
    {
        note(Kind::Close, "close", name, QString::number(indent));
        return Writer::WriteElementClose(name, indent);
    }

    int WriteElementCloseAndEnd(QString const& name, int indent) override
    {
        note(Kind::CloseAndEnd, "close and end", name, QString::number(indent));
        return Writer::WriteElementCloseAndEnd(name, indent);
    }

    int WriteElementStart(QString const& name, int indent) override
    {
        note(Kind::Start, "start", name, QString::number(indent));
        return Writer::WriteElementStart(name, indent);
    }

    int WriteElementEnd(QString const& name, int indent) override
    {
        note(Kind::End, "end", name, QString::number(indent));
        return Writer::WriteElementEnd(name, indent);
    }

    int WriteElement(QString const& name, QString const& value) override
    {
        note(Kind::Leaf, "leaf", name, value);
        return Writer::WriteElement(name, value);
    }

    int WriteAttribute(QString const& name, QString const& value) override
    {
        note(Kind::Attribute, "attribute", name, value);
        return Writer::WriteAttribute(name, value);
    }

    int WriteCurrentIndent() override
    {
        note(Kind::Indent, "indent", QString());
        const int code = Writer::WriteCurrentIndent();
        return m_kind.overridden & Kind::Indent ? m_kind.indentCode : code;
    }

    int Write(QString const& text) override
    {
        note(Kind::Write, "write", text);
        const int written = Writer::Write(text);
        ComeBack(*this, m_kind, text);
        const bool fails = m_kind.overridden & Kind::Write && m_kind.failEvery > 0 &&
                           ++record.writes % m_kind.failEvery == 0;
        return fails ? -1 : written;
    }

    Record record;

private:
    void note(Kind::Bit bit, char const* operation, QString const& first,
              QString const& second = QString())
    {
        if (m_kind.overridden & bit)
            record.calls << Call(operation, first, second);
    }

    Kind m_kind;
};

class Dice
{
public:
    explicit Dice(Program::Draws& draws) : m_draws(draws) {}

    int below(int end) { return m_draws.below(end); }
    bool chance(int percent) { return below(100) >= 100 - percent; }

    template <class List>
    auto oneOf(List const& list)
    {
        return list[below(int(list.size()))];
    }

    QString text(bool isName)
    {
        static const QStringList pieces = {
            "a",  "title", "%1", "%2", "%L1", "%99", "%",  "&",  "<",    ">",         "\"",
            "'",  "\\",    " ",  "\n", "]]>", "=",   "\t", "\r", "\xe4", "&amp;",     "<![CDATA[",
            "%3", "x:y",   "1",  "/",  "/>",  "--",  "?>", ";",  "href", "%1=\"%2\"", "%%1"};
        static const QVector<ushort> wide = {0xe4, 0x20ac, 0xd83d, 0xde00, 0xfffe, 0x0, 0x3b1};
        if (chance(8))
            return chance(50) ? QString() : QString("");
        QString all;
        const int length = chance(3) ? 60 : 1 + below(isName ? 2 : 6);
        for (int i = 0; i < length; ++i)
            all += chance(10) ? QString(QChar(oneOf(wide))) : oneOf(pieces);
        return all;
    }

    int indent()
    {
        static const QVector<int> rare = {-1, 0, 2, 3, -5, 40};
        if (chance(75))
            return 1;
        return below(500) == 499 ? 1100 : oneOf(rare); // indentation as deep is slow
    }

    Step step()
    {
        const auto operation = Step::Operation(below(Step::Text + 1));
        const int levels = indent();
        const QString name = text(true);
        if (operation == Step::Text && chance(30))
            return {operation, name, "<!-- " + text(false) + " -->\n", levels, 0};
        return {operation, name, text(false), levels, 0};
    }

    Kind kind(bool isFile)
    {
        static const QVector<int> codes = {0, 0, 0, 7};
        Kind kind;
        kind.isFile = isFile;
        if (chance(80))
            kind.overridden = chance(50) ? 1 << below(10) : below(Kind::All + 1);
        if (kind.overridden & Kind::Write && chance(50))
            kind.failEvery = 1 + below(6);
        if (kind.overridden & Kind::Write && chance(30))
            kind.returnEvery = 1 + below(6);
        kind.indentCode = oneOf(codes);
        kind.valueCode = oneOf(codes);
        if (chance(10))
            kind.fieldWidth = 1 + below(12);
        return kind;
    }

private:
    Program::Draws& m_draws;
};

// How a call reads in a program.
QString Told(Step const& step)
{
    static const QStringList names(
        {"WriteElementOpen(name, indent)", "WriteElementClose(name, indent)",
         "WriteElementCloseAndEnd(name, indent)", "WriteElementStart(name, indent)",
         "WriteElementEnd(name, indent)", "WriteElement(name, value)", "WriteElementValue(value)",
         "WriteAttribute(name, value)", "WriteCurrentIndent()", "Write(value)"});
    const QString call = names.at(step.operation);
    QStringList arguments;
    if (call.contains("name"))
        arguments.append(Program::quoted(step.name));
    if (call.contains("value"))
        arguments.append(Program::quoted(step.value));
    if (call.contains("indent)"))
        arguments.append(QString::number(step.indent));
    return call.section('(', 0, 0) + "(" + arguments.join(", ") + ")";
}

// The outcome of a sequence.
struct Outcome
{
    QVector<int> codes; // and the state of the stream at the end
    QStringList calls;
    QByteArray bytes;

    bool operator==(Outcome const& other) const
    {
        return codes == other.codes && calls == other.calls && bytes == other.bytes;
    }
};

QString Words(Outcome const& outcome)
{
    QString words;
    for (int code : outcome.codes)
        words += QString::number(code) + ' ';
    return words + "\n" + outcome.calls.join("\n") + "\n" + QString::fromLatin1(outcome.bytes);
}

template <class Writer>
Outcome Written(Writer& writer, Steps const& steps, Kind const& kind)
{
    writer.setFieldWidth(kind.fieldWidth);
    Outcome outcome;
    outcome.codes = Perform(writer, steps);
    writer.flush();
    outcome.codes.append(writer.status());
    return outcome;
}

enum Device { String, Bytes, IoDevice, FullDevice, CFile, NoDevice, DeviceCount };

// Takes a few bytes and then no more.
class SmallDevice : public QIODevice
{
public:
    explicit SmallDevice(int size) : m_left(size) { open(QIODevice::WriteOnly); }
    QByteArray taken;

protected:
    qint64 readData(char*, qint64) override { return -1; }
    qint64 writeData(char const* bytes, qint64 size) override
    {
        const int count = qMin(int(size), m_left);
        taken.append(bytes, count);
        m_left -= count;
        return count == 0 && size > 0 ? -1 : count;
    }

private:
    int m_left;
};

constexpr int SmallSize = 40;

Outcome Plain(int device, Steps const& steps, Kind const& kind)
{
    QByteArray bytes;
    SmallDevice small(SmallSize);
    QBuffer buffer(&bytes);
    buffer.open(QIODevice::WriteOnly);
    QString text;
    QTextStream stream(&text, QIODevice::WriteOnly);
    if (device == FullDevice)
        stream.setDevice(&small);
    else if (device != String)
        stream.setDevice(&buffer);
    stream.setFieldWidth(kind.fieldWidth);
    PlainWriter writer(device == NoDevice ? nullptr : &stream, kind);
    Outcome outcome;
    outcome.codes = Perform(writer, steps);
    stream.flush();
    outcome.codes.append(stream.status());
    outcome.calls = writer.record.calls;
    if (device == String)
        bytes = text.toLocal8Bit();
    outcome.bytes = device == FullDevice ? small.taken : bytes;
    return outcome;
}

// A subclass, or the class itself, on each device. `make` gets what its constructor takes.
template <class Make>
Outcome OnDevice(int device, QString const& path, Make const& make)
{
    QByteArray bytes;
    Outcome outcome;
    if (device == NoDevice) {
        outcome = make();
    } else if (device == String) {
        QString text;
        outcome = make(&text, QIODevice::WriteOnly);
        bytes = text.toLocal8Bit();
    } else if (device == Bytes) {
        outcome = make(&bytes, QIODevice::WriteOnly);
    } else if (device == IoDevice) {
        QBuffer buffer(&bytes);
        buffer.open(QIODevice::WriteOnly);
        outcome = make(&buffer);
    } else if (device == FullDevice) {
        SmallDevice small(SmallSize);
        outcome = make(&small);
        bytes = small.taken;
    } else {
        FILE* file = std::fopen(QFile::encodeName(path).constData(), "wb");
        outcome = make(file, QIODevice::WriteOnly);
        std::fclose(file);
        bytes = TestFiles::read(path);
    }
    outcome.bytes = bytes;
    return outcome;
}

QTemporaryDir* g_folder = nullptr;

Outcome OfStream(int device, Steps const& steps, Kind const& kind)
{
    return OnDevice(device, g_folder->filePath("stream.xml"), [&](auto... arguments) {
        Subclass<TorkXmlStream> writer(kind, arguments...);
        Outcome outcome = Written(writer, steps, kind);
        outcome.calls = writer.record.calls;
        return outcome;
    });
}

Outcome OfBase(int device, Steps const& steps, Kind const& kind)
{
    return OnDevice(device, g_folder->filePath("stream.xml"), [&](auto... arguments) {
        TorkXmlStream writer(arguments...);
        return Written(writer, steps, kind);
    });
}

Outcome OfFile(Steps const& steps, Kind const& kind)
{
    const QString path = g_folder->filePath("file.xml");
    Outcome outcome;
    {
        Subclass<TorkXmlFile> writer(kind, path);
        writer.open(QIODevice::WriteOnly);
        outcome = Written(writer, steps, kind);
        outcome.calls = writer.record.calls;
    }
    outcome.bytes = TestFiles::read(path);
    return outcome;
}

// All calls on a writer of the last kind that was chosen.
class Writers : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        Dice dice(draws);
        if (dice.chance(90)) {
            const Step step = dice.step();
            draws.tell([&] { return Told(step); });
            m_steps.append(step);
            return;
        }
        m_device = dice.below(DeviceCount);
        m_kind = dice.kind(dice.chance(20));
        draws.tell([&] {
            return QString("the writer: device %1, file %2, overrides %3, Write() fails every %4, "
                           "reenters every %5, codes %6 and %7, field width %8")
                .arg(m_device)
                .arg(m_kind.isFile)
                .arg(m_kind.overridden)
                .arg(m_kind.failEvery)
                .arg(m_kind.returnEvery)
                .arg(m_kind.indentCode)
                .arg(m_kind.valueCode)
                .arg(m_kind.fieldWidth);
        });
    }

    void finish()
    {
        Outcome expected = Plain(m_kind.isFile ? int(IoDevice) : m_device, m_steps, m_kind);
        Outcome outcome;
        if (m_kind.isFile)
            outcome = OfFile(m_steps, m_kind);
        else if (m_kind.overridden)
            outcome = OfStream(m_device, m_steps, m_kind);
        else
            outcome = OfBase(m_device, m_steps, m_kind);
        if (!(outcome == expected))
            same("outcome", Words(outcome), Words(expected));
    }

private:
    Steps m_steps;
    int m_device = String;
    Kind m_kind;
};

// The same from a file that is compiled without run-time type information.
class WritersOfNoType : public Program::Pair
{
public:
    void perform(Program::Draws& draws)
    {
        Dice dice(draws);
        if (dice.chance(90)) {
            const Step step = dice.step();
            draws.tell([&] { return Told(step); });
            m_steps.append(step);
            return;
        }
        m_overrides = WritersWithoutTypes::Overrides(dice.below(3));
        m_kind.isFile = dice.chance(30);
        draws.tell([&] {
            return QString("the writer: overrides %1, file %2")
                .arg(int(m_overrides))
                .arg(m_kind.isFile);
        });
    }

    void finish()
    {
        QVector<int> codes;
        const auto use = [&](auto& writer) {
            codes = Perform(writer, m_steps);
        };
        QString text;
        const QString path = g_folder->filePath("without.xml");
        const QStringList calls = m_kind.isFile
                                      ? WritersWithoutTypes::withFile(m_overrides, path, use)
                                      : WritersWithoutTypes::withStream(m_overrides, text, use);
        const QByteArray bytes = m_kind.isFile ? TestFiles::read(path) : text.toLocal8Bit();

        if (m_overrides == WritersWithoutTypes::Overrides::Write)
            m_kind.overridden = Kind::Write;
        else if (m_overrides == WritersWithoutTypes::Overrides::ElementValue)
            m_kind.overridden = Kind::Value;
        Outcome expected = Plain(m_kind.isFile ? IoDevice : String, m_steps, m_kind);
        expected.codes.removeLast();
        if (codes != expected.codes)
            same("codes", Words({codes, {}, {}}), Words({expected.codes, {}, {}}));
        same("bytes", bytes, expected.bytes);
        same("calls", calls.size(), expected.calls.size());
    }

private:
    Steps m_steps;
    WritersWithoutTypes::Overrides m_overrides = WritersWithoutTypes::Overrides(0);
    Kind m_kind;
};

} // namespace

class tst_PlainWriters : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void sameAsPlain();
    void sameWithoutTypes();
    void cleanupTestCase();

private:
    QTemporaryDir m_folder;
    QtMessageHandler m_handler = nullptr;
};

// Qt warns about each text that is written without a device.
void tst_PlainWriters::initTestCase()
{
    g_folder = &m_folder;
    m_handler = qInstallMessageHandler([](QtMsgType, QMessageLogContext const&, QString const&) {});
}

void tst_PlainWriters::cleanupTestCase()
{
    qInstallMessageHandler(m_handler);
}

void tst_PlainWriters::sameAsPlain()
{
    Program::compare<Writers>("writers", Rounds::count(30000, 1000000, 10000000), 24);
}

void tst_PlainWriters::sameWithoutTypes()
{
#ifdef TEST_UNDER_ADDRESS_SANITIZER
    QSKIP("that build checks types by run-time type information");
#endif
    Program::compare<WritersOfNoType>("writers without types", Rounds::count(8000, 150000, 1000000),
                                      24);
}

int main(int argc, char** argv)
{
    Program::useMemoryForFiles();
    QCoreApplication application(argc, argv);
    tst_PlainWriters test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_PlainWriters.moc"
