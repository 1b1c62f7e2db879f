// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"

#include "support/MessageCapture.h"
#include "support/TestFiles.h"
#include "xml/BothWriters.h"
#include "xml/VirtualSlot.h"
#include "xml/WriterSteps.h"

#include <QBuffer>
#include <QTemporaryDir>
#include <QtTest>

#include <cstdio>
#include <functional>

using namespace BothWriters;

namespace {

// Accepts whole blocks until one of them, counted from 1; rejects that one and everything after it.
class BrokenDevice : public QIODevice
{
public:
    explicit BrokenDevice(int failAt) : m_failAt(failAt) { open(QIODevice::WriteOnly); }

    QByteArray const& Taken() const { return m_taken; }

protected:
    qint64 readData(char*, qint64) override { return -1; }

    qint64 writeData(char const* data, qint64 size) override
    {
        if (++m_count >= m_failAt)
            return -1;

        m_taken.append(data, static_cast<int>(size));
        return size;
    }

private:
    QByteArray m_taken;
    int m_failAt;
    int m_count = 0;
};

} // namespace

class tst_TorkXmlWriterDevices : public QObject
{
    Q_OBJECT

private slots:

    void constructors_data();
    void constructors();
    void streamWithoutDevice();
    void streamTakesADeviceLater();
    void destroyedStreamLeavesItsTextOnTheDevice();
    void failingDevice_data();
    void failingDevice();
    void failingDeviceDuringWrite();
    void readOnlyDevice();
};

using TextOfConstructor = std::function<QByteArray(Steps const&)>;
Q_DECLARE_METATYPE(TextOfConstructor)

void tst_TorkXmlWriterDevices::constructors_data()
{
    QTest::addColumn<TextOfConstructor>("written");
    QTest::addColumn<QByteArray>("before");

    QTest::newRow("stream on a device") << TextOfConstructor([](Steps const& steps) {
        QBuffer device;
        device.open(QIODevice::WriteOnly);
        TorkXmlStream writer(&device);
        if (writer.device() != &device)
            return QByteArray("another device");
        Perform(writer, steps);
        writer.flush();
        return device.data();
    }) << QByteArray();
    QTest::newRow("stream without a device, set later")
        << TextOfConstructor([](Steps const& steps) {
               QBuffer device;
               device.open(QIODevice::WriteOnly);
               TorkXmlStream writer;
               if (writer.device() || writer.string())
                   return QByteArray("a device from nowhere");
               writer.setDevice(&device);
               Perform(writer, steps);
               writer.flush();
               return device.data();
           })
        << QByteArray();
    QTest::newRow("stream on a string") << TextOfConstructor([](Steps const& steps) {
        QString text;
        TorkXmlStream writer(&text, QIODevice::WriteOnly);
        if (writer.string() != &text)
            return QByteArray("another string");
        Perform(writer, steps);
        return text.toUtf8();
    }) << QByteArray();
    QTest::newRow("stream on a string in both directions")
        << TextOfConstructor([](Steps const& steps) {
               QString text;
               TorkXmlStream writer(&text, QIODevice::ReadWrite);
               Perform(writer, steps);
               return text.toUtf8();
           })
        << QByteArray();
    QTest::newRow("stream on a byte array") << TextOfConstructor([](Steps const& steps) {
        QByteArray text;
        TorkXmlStream writer(&text, QIODevice::WriteOnly);
        Perform(writer, steps);
        writer.flush();
        return text;
    }) << QByteArray();
    QTest::newRow("stream on a byte array, appending") << TextOfConstructor([](Steps const& steps) {
        QByteArray text("before\n");
        TorkXmlStream writer(&text, QIODevice::Append);
        Perform(writer, steps);
        writer.flush();
        return text;
    }) << QByteArray("before\n");
    QTest::newRow("stream on a byte array, truncating")
        << TextOfConstructor([](Steps const& steps) {
               QByteArray text("before\n");
               TorkXmlStream writer(&text, QIODevice::WriteOnly | QIODevice::Truncate);
               Perform(writer, steps);
               writer.flush();
               return text;
           })
        << QByteArray();
    QTest::newRow("stream on a C file") << TextOfConstructor([](Steps const& steps) {
        std::FILE* const file = std::tmpfile();
        if (!file)
            return QByteArray("no temporary file");
        {
            TorkXmlStream writer(file, QIODevice::WriteOnly);
            Perform(writer, steps);
        }
        std::rewind(file);
        QByteArray text(4096, '\0');
        text.resize(static_cast<int>(std::fread(text.data(), 1, 4096, file)));
        std::fclose(file);
        return text;
    }) << QByteArray();
    QTest::newRow("file with a name")
        << TextOfConstructor([](Steps const& steps) { return WrittenByFile(steps).text; })
        << QByteArray();
    QTest::newRow("file without a name, named later") << TextOfConstructor([](Steps const& steps) {
        const QTemporaryDir dir;
        TorkXmlFile writer;
        writer.setName(dir.filePath("out.xml"));
        if (!writer.open(QIODevice::WriteOnly))
            return writer.errorString().toUtf8();
        Perform(writer, steps);
        writer.flush();
        return TestFiles::read(writer.name());
    }) << QByteArray();
}

void tst_TorkXmlWriterDevices::constructors()
{
    QFETCH(TextOfConstructor, written);
    QFETCH(QByteArray, before);

    // Nothing pending, level 0 and a unit of two spaces, whatever the constructor.
    const Steps steps{Close("none", 0), Indent(), Start("a"), Element("b", "1"), End("a")};
    QCOMPARE(written(steps), before + ">\n<a>\n  <b>1</b>\n</a>\n");
}

void tst_TorkXmlWriterDevices::streamWithoutDevice()
{
    const Steps steps{Start("a"), Element("b", "1"), Open("c"), Attribute("x", "1"), Close("c", 0),
                      End("c"),   End("a"),          Open("d"), CloseAndEnd("d")};
    QVector<int> codes;
    int length = -1;
    {
        // Qt warns about every piece that has no device; how often is up to Qt.
        MessageCapture quiet;
        TorkXmlStream writer;
        codes = Perform(writer, steps);
        length = writer.Write("text");
    }
    QCOMPARE(codes, ExpectedCodes(steps));
    QCOMPARE(length, 4);
}

void tst_TorkXmlWriterDevices::streamTakesADeviceLater()
{
    QBuffer device;
    device.open(QIODevice::WriteOnly);
    {
        MessageCapture quiet;
        TorkXmlStream writer;
        QCOMPARE(writer.WriteElementStart("lost", 1), 0);
        QCOMPARE(writer.WriteElementOpen("lost", 1), 0);
        QCOMPARE(writer.WriteAttribute("a", "1"), 0);
        writer.setDevice(&device);
        QCOMPARE(writer.WriteElementClose("lost", 1), 0);
        QCOMPARE(writer.WriteElement("kept", "1"), 0);
    }
    // The level and the attributes belong to the writer, not to its device.
    QCOMPARE(device.data(), QByteArray(" a=\"1\">\n  <kept>1</kept>\n"));
}

void tst_TorkXmlWriterDevices::destroyedStreamLeavesItsTextOnTheDevice()
{
    QBuffer device;
    device.open(QIODevice::WriteOnly);
    QTextStream* const writer = new TorkXmlStream(&device);
    static_cast<TorkXmlStream*>(writer)->WriteElement("a", "1");

    delete writer;

    QCOMPARE(device.data(), QByteArray("<a>1</a>\n"));
}

void tst_TorkXmlWriterDevices::failingDevice_data()
{
    QTest::addColumn<int>("failAt");
    QTest::addColumn<QByteArray>("taken");

    QTest::newRow("first write") << 1 << QByteArray();
    QTest::newRow("second write") << 2 << QByteArray("<a>\n");
    QTest::newRow("third write") << 3 << QByteArray("<a>\n  <b  x=\"1\">\n");
}

void tst_TorkXmlWriterDevices::failingDevice()
{
    QFETCH(int, failAt);
    QFETCH(QByteArray, taken);

    BrokenDevice device(failAt);
    TorkXmlStream writer(&device);
    // Each flush writes to the device. The codes report only on Write(), which returns how much it
    // was given: a caller learns about the device from the text stream's status.
    QCOMPARE(writer.WriteElementStart("a", 1), 0);
    writer.flush();
    QCOMPARE(writer.status() == QTextStream::WriteFailed, failAt <= 1);
    QCOMPARE(writer.WriteElementOpen("b", 1), 0);
    QCOMPARE(writer.WriteAttribute("x", "1"), 0);
    QCOMPARE(writer.WriteElementClose("b", 0), 0);
    writer.flush();
    QCOMPARE(writer.status() == QTextStream::WriteFailed, failAt <= 2);
    QCOMPARE(writer.WriteElement("c", "1"), 0);
    QCOMPARE(writer.WriteElementEnd("b", 1), 0);
    writer.flush();
    QCOMPARE(writer.status(), QTextStream::WriteFailed);
    QCOMPARE(writer.WriteElementEnd("a", 1), 0);
    QCOMPARE(writer.Write("text"), 4);

    QCOMPARE(device.Taken(), taken);
}

void tst_TorkXmlWriterDevices::failingDeviceDuringWrite()
{
    BrokenDevice device(1);
    TorkXmlStream writer(&device);

    // More than the text stream buffers, so the device is written to, and refuses, immediately.
    const QString text = Repeated('x', 100000);
    QCOMPARE(writer.WriteElement("a", text), 0);
    QCOMPARE(writer.Write(text), text.size());

    QCOMPARE(writer.status(), QTextStream::WriteFailed);
    QCOMPARE(device.Taken(), QByteArray());
}

void tst_TorkXmlWriterDevices::readOnlyDevice()
{
    QByteArray content("before");
    QVector<int> codes;
    const Steps steps{Start("a"), Element("b", "1"), End("a")};
    {
        MessageCapture quiet; // Qt's warning about a read-only device
        QBuffer device(&content);
        device.open(QIODevice::ReadOnly);
        TorkXmlStream writer(&device);
        codes = Perform(writer, steps);
    }
    QCOMPARE(codes, ExpectedCodes(steps));
    QCOMPARE(content, QByteArray("before"));
}

QTEST_GUILESS_MAIN(tst_TorkXmlWriterDevices)

#include "tst_TorkXmlWriterDevices.moc"
