// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares both XML writers with a plain one, which makes a virtual call for each piece, over
// random calls: the same bytes, result codes and calls that reach a subclass, whatever it
// overrides, also where its Write() reenters the writer, on every kind of device, with and without
// run-time type information.

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"
#include "plain/Rounds.h"
#include "support/TestFiles.h"
#include "xml/WriterSteps.h"
#include "xml/WritersWithoutTypes.h"

#include <QBuffer>
#include <QTemporaryDir>
#include <QtTest>

#include <cstdio>
#include <random>

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
    explicit Dice(quint32 seed) : m_engine(seed) {}

    int below(int end) { return int(m_engine() % uint(end)); }
    bool chance(int percent) { return below(100) < percent; }

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
        const int length = chance(5) ? 60 : 1 + below(isName ? 2 : 6);
        for (int i = 0; i < length; ++i)
            all += chance(10) ? QString(QChar(oneOf(wide))) : oneOf(pieces);
        return all;
    }

    int indent()
    {
        static const QVector<int> rare = {-1, 0, 2, 3, -5, 40};
        return chance(75) ? 1 : oneOf(rare);
    }

    Step step()
    {
        const auto operation = Step::Operation(below(Step::CurrentIndent + 1));
        return {operation, text(true), text(false), indent(), 0};
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
    std::mt19937 m_engine;
};

// The outcome of a sequence.
struct Outcome
{
    QVector<int> codes;
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

// On a deep level every line is indented as deeply; the sequences are short enough for that.
Steps Sequence(Dice& dice)
{
    Steps steps;
    for (int left = 1 + dice.below(12); left > 0; --left)
        steps.append(dice.step());
    return steps;
}

template <class Writer>
Outcome Written(Writer& writer, Steps const& steps, Kind const& kind)
{
    writer.setFieldWidth(kind.fieldWidth);
    Outcome outcome;
    outcome.codes = Perform(writer, steps);
    writer.flush();
    return outcome;
}

} // namespace

class tst_PlainWriters : public QObject
{
    Q_OBJECT

private slots:
    void sameAsPlain();
    void sameWithoutTypes();
    void cleanupTestCase();

private:
    Outcome plain(Steps const& steps, Kind const& kind, bool hasDevice);
    Outcome stream(int device, Steps const& steps, Kind const& kind);
    Outcome base(int device, Steps const& steps, Kind const& kind);
    Outcome file(Steps const& steps, Kind const& kind);

    QTemporaryDir m_folder;
    int m_sequences = 0;
    int m_calls = 0;
};

enum Device { NoDevice, String, Bytes, IoDevice, CFile, DeviceCount };

Outcome tst_PlainWriters::plain(Steps const& steps, Kind const& kind, bool hasDevice)
{
    QByteArray bytes;
    QTextStream stream(&bytes, QIODevice::WriteOnly);
    stream.setFieldWidth(kind.fieldWidth);
    PlainWriter writer(hasDevice ? &stream : nullptr, kind);
    Outcome outcome;
    outcome.codes = Perform(writer, steps);
    stream.flush();
    outcome.calls = writer.record.calls;
    outcome.bytes = bytes;
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
    } else {
        FILE* file = std::fopen(QFile::encodeName(path).constData(), "wb");
        outcome = make(file, QIODevice::WriteOnly);
        std::fclose(file);
        bytes = TestFiles::read(path);
    }
    outcome.bytes = bytes;
    return outcome;
}

Outcome tst_PlainWriters::stream(int device, Steps const& steps, Kind const& kind)
{
    return OnDevice(device, m_folder.filePath("stream.xml"), [&](auto... arguments) {
        Subclass<TorkXmlStream> writer(kind, arguments...);
        Outcome outcome = Written(writer, steps, kind);
        outcome.calls = writer.record.calls;
        return outcome;
    });
}

Outcome tst_PlainWriters::base(int device, Steps const& steps, Kind const& kind)
{
    return OnDevice(device, m_folder.filePath("stream.xml"), [&](auto... arguments) {
        TorkXmlStream writer(arguments...);
        return Written(writer, steps, kind);
    });
}

Outcome tst_PlainWriters::file(Steps const& steps, Kind const& kind)
{
    const QString path = m_folder.filePath("file.xml");
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

void tst_PlainWriters::sameAsPlain()
{
    // Qt warns about each text that is written without a device.
    qInstallMessageHandler([](QtMsgType, QMessageLogContext const&, QString const&) {});
    Dice dice(Rounds::seed());
    const int count = Rounds::count(4000, 100000);
    for (int i = 0; i < count; ++i) {
        const Steps steps = Sequence(dice);
        const bool isFile = dice.chance(20);
        const int device = dice.below(DeviceCount);
        const Kind kind = dice.kind(isFile);
        const Outcome expected = plain(steps, kind, isFile || device != NoDevice);
        Outcome outcome;
        if (isFile)
            outcome = file(steps, kind);
        else if (kind.overridden)
            outcome = stream(device, steps, kind);
        else
            outcome = base(device, steps, kind);
        ++m_sequences;
        m_calls += steps.size();
        if (!(outcome == expected)) {
            qInstallMessageHandler(nullptr);
            QCOMPARE(Words(outcome), Words(expected));
        }
    }
    qInstallMessageHandler(nullptr);
}

// As WritersWithoutTypes puts them down.
QStringList CallsWithoutTypes(QStringList calls)
{
    for (QString& call : calls) {
        call.replace(0, call.indexOf('('),
                     call.startsWith("write(") ? "Write" : "WriteElementValue");
        call.chop(2);
        call.replace(call.indexOf('('), 1, ' ');
    }
    return calls;
}

void tst_PlainWriters::sameWithoutTypes()
{
    using WritersWithoutTypes::Overrides;
    Dice dice(Rounds::seed() + 1);
    const int count = Rounds::count(1000, 100000);
    for (int i = 0; i < count; ++i) {
        const Steps steps = Sequence(dice);
        const auto overrides = Overrides(dice.below(3));
        Kind kind;
        kind.isFile = dice.chance(30);

        QVector<int> codes;
        const auto use = [&](auto& writer) {
            codes = Perform(writer, steps);
        };
        QString text;
        const QString path = m_folder.filePath("without.xml");
        const QStringList calls = kind.isFile
                                      ? WritersWithoutTypes::withFile(overrides, path, use)
                                      : WritersWithoutTypes::withStream(overrides, text, use);
        const QByteArray bytes = kind.isFile ? TestFiles::read(path) : text.toLocal8Bit();

        if (overrides == Overrides::Write)
            kind.overridden = Kind::Write;
        else if (overrides == Overrides::ElementValue)
            kind.overridden = Kind::Value;
        const Outcome expected = plain(steps, kind, true);
        QCOMPARE(codes, expected.codes);
        QCOMPARE(bytes, expected.bytes);
        QCOMPARE(calls, CallsWithoutTypes(expected.calls));
        ++m_sequences;
        m_calls += steps.size();
    }
}

void tst_PlainWriters::cleanupTestCase()
{
    std::printf("plain writers: %d sequences of %d calls, all as the plain writer has them\n",
                m_sequences, m_calls);
}

QTEST_GUILESS_MAIN(tst_PlainWriters)
#include "tst_PlainWriters.moc"
