// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXmlFile.h"

#include "support/MessageCapture.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"
#include "xml/WriterSteps.h"

#include <QBuffer>
#include <QTemporaryDir>
#include <QtTest>

#include <cerrno>
#include <csignal>
#include <memory>

#include <sys/resource.h>

// The writer's output is tested together with the stream's, in tst_TorkXmlWriters; this tests what
// the file adds.

namespace {

// Qt's own error for opening such a file.
QString QtErrorOfOpening(QString const& name, QIODevice::OpenMode mode)
{
    QFile file(name);
    return file.open(mode) ? QString("opened") : file.errorString();
}

// While this lives, no file of this process grows beyond the limit, as on a full disk.
class FileSizeLimit
{
public:
    explicit FileSizeLimit(rlim_t bytes)
    {
        m_signal = std::signal(SIGXFSZ, SIG_IGN);
        getrlimit(RLIMIT_FSIZE, &m_before);
        rlimit limit = m_before;
        limit.rlim_cur = bytes;
        setrlimit(RLIMIT_FSIZE, &limit);
    }

    ~FileSizeLimit()
    {
        setrlimit(RLIMIT_FSIZE, &m_before);
        std::signal(SIGXFSZ, m_signal);
    }

    FileSizeLimit(FileSizeLimit const&) = delete;
    FileSizeLimit& operator=(FileSizeLimit const&) = delete;

private:
    rlimit m_before;
    void (*m_signal)(int);
};

} // namespace

class tst_TorkXmlFile : public QObject
{
    Q_OBJECT

private slots:
    void init();

    void startsClosedAndNameless();
    void startsClosedWithItsName_data();
    void startsClosedWithItsName();
    void setName();
    void setNameOfAnOpenFile();
    void nameMakesTheFileTheDevice();
    void failedOpenLeavesTheDevice();

    void openModes_data();
    void openModes();
    void openFails_data();
    void openFails();
    void openForbidden();
    void openTwice();
    void readsThroughTheStream();

    void closeKeepsPendingText();
    void closeKeepsLevel();
    void closeWhenNeverOpened();
    void writesNothingAfterClose();
    void reopenedAppends();
    void secondFileAfterTheFirst();

    void neverOpened_data();
    void neverOpened();
    void destroyedWhileOpen_data();
    void destroyedWhileOpen();
    void destroyedThroughItsBase();
    void destroyedAfterClose();
    void destroyedWithTextAfterClose();
    void destroyedOnAnotherDevice();

    void diskFull_data();
    void diskFull();
    void fullDevice();

private:
    QString Path(QString const& name) const { return m_dir->filePath(name); }

    std::unique_ptr<QTemporaryDir> m_dir;
};

void tst_TorkXmlFile::init()
{
    m_dir.reset(new QTemporaryDir);
    QVERIFY2(m_dir->isValid(), qPrintable(m_dir->errorString()));
}

void tst_TorkXmlFile::startsClosedAndNameless()
{
    TorkXmlFile writer;

    QCOMPARE(writer.name(), QString());
    QVERIFY(!writer.isOpen());
    QCOMPARE(writer.errorString(), QFile().errorString());
}

void tst_TorkXmlFile::startsClosedWithItsName_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("relative") << "out.xml";
    QTest::newRow("absolute") << "/no/such/folder/out.xml";
    QTest::newRow("with blanks") << "my file.xml";
    QTest::newRow("outside Latin-1") << QString::fromUtf8("größe-長.xml");
    QTest::newRow("empty") << "";
}

void tst_TorkXmlFile::startsClosedWithItsName()
{
    QFETCH(QString, name);

    TorkXmlFile writer(name);

    QCOMPARE(writer.name(), name);
    QVERIFY(!writer.isOpen());
    QVERIFY(qobject_cast<QFile*>(writer.device()));
    QCOMPARE(qobject_cast<QFile*>(writer.device())->fileName(), name);
    QVERIFY(!QFile::exists(name));
}

void tst_TorkXmlFile::setName()
{
    TorkXmlFile writer(Path("first.xml"));

    writer.setName(Path("second.xml"));
    QCOMPARE(writer.name(), Path("second.xml"));
    QVERIFY(!writer.isOpen());
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElement("a", "1");
    writer.close();

    QVERIFY(!QFile::exists(Path("first.xml")));
    QCOMPARE(TestFiles::read(Path("second.xml")), QByteArray("<a>1</a>\n"));
}

void tst_TorkXmlFile::setNameOfAnOpenFile()
{
    TorkXmlFile writer(Path("first.xml"));
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElement("a", "1");
    {
        MessageCapture quiet; // Qt closes the file, with a warning
        writer.setName(Path("second.xml"));
    }
    QCOMPARE(writer.name(), Path("second.xml"));
    QVERIFY(!writer.isOpen());
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElement("b", "2");
    writer.close();

    QCOMPARE(TestFiles::read(Path("first.xml")), QByteArray("<a>1</a>\n"));
    QCOMPARE(TestFiles::read(Path("second.xml")), QByteArray("<b>2</b>\n"));
}

void tst_TorkXmlFile::nameMakesTheFileTheDevice()
{
    QBuffer other;
    other.open(QIODevice::WriteOnly);
    TorkXmlFile writer(Path("out.xml"));
    QIODevice* const file = writer.device();
    QVERIFY(file);

    writer.setDevice(&other);
    writer.setName(Path("out.xml"));
    QCOMPARE(writer.device(), file);

    writer.setDevice(&other);
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    QCOMPARE(writer.device(), file);
    writer.WriteElement("a", "1");
    writer.close();

    QCOMPARE(other.data(), QByteArray());
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a>1</a>\n"));
}

void tst_TorkXmlFile::failedOpenLeavesTheDevice()
{
    QBuffer other;
    other.open(QIODevice::WriteOnly);
    TorkXmlFile writer(Path("no/such/folder/out.xml"));
    writer.setDevice(&other);

    QVERIFY(!writer.open(QIODevice::WriteOnly));
    QCOMPARE(writer.device(), &other);
    writer.setDevice(nullptr);
}

void tst_TorkXmlFile::openModes_data()
{
    QTest::addColumn<int>("mode");
    QTest::addColumn<QByteArray>("expected");

    QTest::newRow("write only truncates") << int(QIODevice::WriteOnly) << QByteArray("<a>1</a>\n");
    QTest::newRow("append adds") << int(QIODevice::Append)
                                 << QByteArray("before, and longer\n<a>1</a>\n");
    QTest::newRow("truncate") << int(QIODevice::ReadWrite | QIODevice::Truncate)
                              << QByteArray("<a>1</a>\n");
    QTest::newRow("read and write overwrites the start")
        << int(QIODevice::ReadWrite) << QByteArray("<a>1</a>\nnd longer\n");
}

void tst_TorkXmlFile::openModes()
{
    QFETCH(int, mode);
    QFETCH(QByteArray, expected);
    const QString name = Path("out.xml");
    QVERIFY(TestFiles::write(name, "before, and longer\n"));

    TorkXmlFile writer(name);
    QVERIFY2(writer.open(QIODevice::OpenMode(mode)), qPrintable(writer.errorString()));
    QVERIFY(writer.isOpen());
    QCOMPARE(writer.name(), name);
    QCOMPARE(writer.WriteElement("a", "1"), 0);
    writer.close();
    QVERIFY(!writer.isOpen());

    QCOMPARE(TestFiles::read(name), expected);
}

void tst_TorkXmlFile::openFails_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<int>("mode");

    QTest::newRow("folder does not exist") << "no/such/folder/out.xml" << int(QIODevice::WriteOnly);
    QTest::newRow("file to read does not exist") << "missing.xml" << int(QIODevice::ReadOnly);
    QTest::newRow("a folder itself") << "." << int(QIODevice::WriteOnly);
    QTest::newRow("name too long for a file") << QString(300, 'n') << int(QIODevice::WriteOnly);
}

void tst_TorkXmlFile::openFails()
{
    QFETCH(QString, name);
    QFETCH(int, mode);
    const QString path = Path(name);
    const QString reason = QtErrorOfOpening(path, QIODevice::OpenMode(mode));
    QVERIFY(reason != "opened");

    TorkXmlFile writer(path);
    QVERIFY(!writer.open(QIODevice::OpenMode(mode)));

    QVERIFY(!writer.isOpen());
    QCOMPARE(writer.errorString(), reason);
    QCOMPARE(writer.name(), path);
}

void tst_TorkXmlFile::openForbidden()
{
    const QString name = Path("out.xml");
    QVERIFY(TestFiles::write(name, "before"));
    QVERIFY(QFile::setPermissions(name, QFile::ReadOwner));

    TorkXmlFile writer(name);
    bool opened = false;
    {
        const ProcessLimits::OrdinaryUser user;
        if (!user.isInForce())
            QSKIP("cannot become another user");
        opened = writer.open(QIODevice::WriteOnly);
    }

    QVERIFY(!opened);
    QVERIFY(!writer.isOpen());
    QCOMPARE(writer.errorString(), QString("Permission denied"));
    QCOMPARE(TestFiles::read(name), QByteArray("before"));
}

void tst_TorkXmlFile::openTwice()
{
    TorkXmlFile writer(Path("out.xml"));
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElement("a", "1");
    {
        MessageCapture quiet; // Qt's warning that the file is already open
        QVERIFY(!writer.open(QIODevice::WriteOnly));
    }
    QVERIFY(writer.isOpen());
    writer.WriteElement("b", "2");
    writer.close();

    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a>1</a>\n<b>2</b>\n"));
}

void tst_TorkXmlFile::readsThroughTheStream()
{
    QVERIFY(TestFiles::write(Path("in.xml"), "<a>1</a>\n"));

    TorkXmlFile reader(Path("in.xml"));
    QVERIFY2(reader.open(QIODevice::ReadOnly), qPrintable(reader.errorString()));

    QCOMPARE(reader.readAll(), QString("<a>1</a>\n"));
}

void tst_TorkXmlFile::closeKeepsPendingText()
{
    TorkXmlFile writer(Path("out.xml"));
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElementOpen("a", 1);
    writer.WriteAttribute("x", "1");
    writer.close();
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a "));

    QVERIFY2(writer.open(QIODevice::Append), qPrintable(writer.errorString()));
    QCOMPARE(writer.WriteElementClose("a", 1), 0);
    writer.close();
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a  x=\"1\">\n"));
}

void tst_TorkXmlFile::closeKeepsLevel()
{
    TorkXmlFile writer(Path("out.xml"));
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElementStart("a", 1);
    writer.close();

    QVERIFY2(writer.open(QIODevice::Append), qPrintable(writer.errorString()));
    writer.WriteElement("b", "1");
    writer.close();

    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a>\n  <b>1</b>\n"));
}

void tst_TorkXmlFile::closeWhenNeverOpened()
{
    TorkXmlFile nameless;
    nameless.close();
    QVERIFY(!nameless.isOpen());

    TorkXmlFile writer(Path("out.xml"));
    writer.close();
    writer.close();
    QVERIFY(!writer.isOpen());
    QVERIFY(!QFile::exists(Path("out.xml")));
}

void tst_TorkXmlFile::writesNothingAfterClose()
{
    const Steps steps{Start("b"), Element("c", "1"), Open("d"), Attribute("x", "1"), Close("d")};
    QVector<int> codes;
    {
        MessageCapture quiet; // Qt's warning that the device is not open
        TorkXmlFile writer(Path("out.xml"));
        QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
        writer.WriteElement("a", "1");
        writer.close();
        codes = Perform(writer, steps);
    }
    QCOMPARE(codes, ExpectedCodes(steps));
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a>1</a>\n"));
}

void tst_TorkXmlFile::reopenedAppends()
{
    TorkXmlFile writer(Path("out.xml"));
    for (char const* value : {"1", "2", "3"}) {
        QVERIFY2(writer.open(QIODevice::Append), qPrintable(writer.errorString()));
        QCOMPARE(writer.WriteElement("a", value), 0);
        writer.close();
    }
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a>1</a>\n<a>2</a>\n<a>3</a>\n"));
}

void tst_TorkXmlFile::secondFileAfterTheFirst()
{
    TorkXmlFile writer(Path("first.xml"));
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElement("a", "1");
    writer.close();
    writer.setName(Path("second.xml"));
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    writer.WriteElement("b", "2");
    writer.close();

    QCOMPARE(TestFiles::read(Path("first.xml")), QByteArray("<a>1</a>\n"));
    QCOMPARE(TestFiles::read(Path("second.xml")), QByteArray("<b>2</b>\n"));
}

void tst_TorkXmlFile::neverOpened_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("tried");
    QTest::addColumn<int>("length");

    // A text stream buffers 16 KB: the longer text reaches the file before the writer is destroyed,
    // the shorter one only then.
    QTest::newRow("nothing written") << "out.xml" << false << 0;
    QTest::newRow("short text") << "out.xml" << false << 1;
    QTest::newRow("long text") << "out.xml" << false << 100000;
    QTest::newRow("1 MB of text") << "out.xml" << false << (1 << 20);
    QTest::newRow("short text, no name") << "" << false << 1;
    QTest::newRow("long text, no name") << "" << false << 100000;
    QTest::newRow("short text, open failed") << "no/such/folder/out.xml" << true << 1;
    QTest::newRow("long text, open failed") << "no/such/folder/out.xml" << true << 100000;
}

void tst_TorkXmlFile::neverOpened()
{
    QFETCH(QString, name);
    QFETCH(bool, tried);
    QFETCH(int, length);

    int code = -1;
    int written = -1;
    bool opened = true;
    {
        MessageCapture quiet; // Qt's warning that the device is missing or not open
        std::unique_ptr<TorkXmlFile> writer(name.isEmpty() ? new TorkXmlFile
                                                           : new TorkXmlFile(Path(name)));
        opened = tried && writer->open(QIODevice::WriteOnly);
        code = writer->WriteElement("a", QString(length, 'x'));
        written = writer->Write(QString(length, 'x'));
        writer.reset();
    }
    QVERIFY(!opened);
    QCOMPARE(code, 0);
    QCOMPARE(written, 0);
    QVERIFY(name.isEmpty() || !QFile::exists(Path(name)));
}

void tst_TorkXmlFile::destroyedWhileOpen_data()
{
    QTest::addColumn<int>("length");

    QTest::newRow("nothing written") << 0;
    QTest::newRow("unflushed text") << 10;
    QTest::newRow("partly flushed text") << 20000;
    QTest::newRow("1 MB of text") << (1 << 20);
}

void tst_TorkXmlFile::destroyedWhileOpen()
{
    QFETCH(int, length);
    const QString text(length, 'x');

    std::unique_ptr<TorkXmlFile> writer(new TorkXmlFile(Path("out.xml")));
    QVERIFY2(writer->open(QIODevice::WriteOnly), qPrintable(writer->errorString()));
    QCOMPARE(writer->Write(text), 0);
    writer.reset();

    QCOMPARE(TestFiles::read(Path("out.xml")), text.toUtf8());
}

void tst_TorkXmlFile::destroyedThroughItsBase()
{
    std::unique_ptr<TorkXmlFile> writer(new TorkXmlFile(Path("out.xml")));
    QVERIFY2(writer->open(QIODevice::WriteOnly), qPrintable(writer->errorString()));
    writer->WriteElementOpen("a", 1);
    writer->WriteAttribute("x", "1");
    std::unique_ptr<QXmlInputSource> source(writer.release());

    source.reset();

    // The pending attributes were never written, so they are not in the file either.
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a "));
}

void tst_TorkXmlFile::destroyedAfterClose()
{
    std::unique_ptr<TorkXmlFile> writer(new TorkXmlFile(Path("out.xml")));
    QVERIFY2(writer->open(QIODevice::WriteOnly), qPrintable(writer->errorString()));
    writer->WriteElement("a", "1");
    writer->close();
    writer.reset();

    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a>1</a>\n"));
}

// What was written after closing meets a file that is closed, but not one that is gone.
void tst_TorkXmlFile::destroyedWithTextAfterClose()
{
    const MessageCapture messages;
    {
        TorkXmlFile writer(Path("out.xml"));
        QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
        writer.close();
        writer.Write("late");
        QCOMPARE(messages.texts(), QStringList());
    }
    QCOMPARE(messages.texts(), QStringList("warning: QIODevice::write (QFile, \"" +
                                           Path("out.xml") + "\"): device not open"));
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray());
}

void tst_TorkXmlFile::destroyedOnAnotherDevice()
{
    QBuffer other;
    other.open(QIODevice::WriteOnly);
    {
        std::unique_ptr<TorkXmlFile> writer(new TorkXmlFile(Path("out.xml")));
        writer->setDevice(&other);
        writer->WriteElement("a", "1");
    }
    QCOMPARE(other.data(), QByteArray("<a>1</a>\n"));
    QVERIFY(!QFile::exists(Path("out.xml")));
}

void tst_TorkXmlFile::diskFull_data()
{
    QTest::addColumn<int>("limit");
    QTest::addColumn<int>("failingWrite");

    // Each write is the nine bytes of <a>1</a> and its line feed.
    QTest::newRow("first write") << 0 << 1;
    QTest::newRow("second write") << 9 << 2;
    QTest::newRow("third write") << 18 << 3;
}

void tst_TorkXmlFile::diskFull()
{
    QFETCH(int, limit);
    QFETCH(int, failingWrite);

    TorkXmlFile writer(Path("out.xml"));
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));

    QVector<int> codes;
    QVector<bool> failed;
    QString reason;
    {
        FileSizeLimit disk(static_cast<rlim_t>(limit));
        for (int i = 0; i < 4; ++i) {
            codes << writer.WriteElement("a", "1");
            writer.flush();
            failed << (writer.status() == QTextStream::WriteFailed);
        }
        reason = writer.errorString();
        writer.close();
    }

    // The codes stay 0, because Write() of a file always returns 0; the status and the file's error
    // text report what happened.
    QCOMPARE(codes, QVector<int>(4, 0));
    for (int i = 0; i < 4; ++i)
        QCOMPARE(failed[i], i + 1 >= failingWrite);
    QCOMPARE(reason, qt_error_string(EFBIG));
    QCOMPARE(TestFiles::read(Path("out.xml")), QByteArray("<a>1</a>\n").repeated(failingWrite - 1));
}

void tst_TorkXmlFile::fullDevice()
{
    if (!QFile::exists("/dev/full"))
        QSKIP("there is no device /dev/full");

    TorkXmlFile writer("/dev/full");
    QVERIFY2(writer.open(QIODevice::WriteOnly), qPrintable(writer.errorString()));
    QCOMPARE(writer.WriteElement("a", QString(100000, 'x')), 0);
    QCOMPARE(writer.WriteElement("a", QString(100000, 'x')), 0);
    writer.flush();

    QCOMPARE(writer.status(), QTextStream::WriteFailed);
    QCOMPARE(writer.errorString(), QString("No space left on device"));
}

QTEST_GUILESS_MAIN(tst_TorkXmlFile)
#include "tst_TorkXmlFile.moc"
