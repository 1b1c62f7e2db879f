// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Documents made to harm who reads them end as any malformed document ends, or load, in memory that
// is bounded by the size of the file. Each is read in a process of its own, which is what the
// memory is measured of, and where an exhausted stack ends no other row.

#include "HostileDocuments.h"

#include "app/LaunchOptionParser.h"
#include "app/settingsfile/SettingsFileReader.h"
#include "common/config/TorkConfigFile.h"
#include "common/xml/TorkXmlGuard.h"
#include "common/xml/TorkXml_FlushUnknownElement.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "reliability/Figures.h"
#include "support/ChildProcess.h"
#include "support/MessageCapture.h"
#include "support/Sanitizers.h"

#include <QElapsedTimer>
#include <QFile>
#include <QTemporaryDir>
#include <QXmlSimpleReader>
#include <QtTest>

#ifdef Q_OS_UNIX
#include <sys/resource.h>
#endif

using namespace Velocor;

namespace {

#if defined(TEST_UNDER_ADDRESS_SANITIZER) || defined(TEST_UNDER_THREAD_SANITIZER)
constexpr bool IsSanitized = true;
#else
constexpr bool IsSanitized = false;
#endif

constexpr qint64 Megabyte = 1024 * 1024;

bool AllSizes()
{
    return qgetenv("VELOCOR_HOSTILE") == "full";
}

// What a reader takes of its own accord, and what of each byte of the file: text has two bytes a
// character and passes through a few hands, and a key of one letter costs a node in a hash table.
qint64 Bound(qint64 fileSize)
{
    return 64 * Megabyte + 24 * fileSize;
}

qint64 PeakMemory()
{
#ifdef Q_OS_UNIX
    rusage usage = {};
    getrusage(RUSAGE_SELF, &usage);
#ifdef Q_OS_MACOS
    return usage.ru_maxrss;
#else
    return usage.ru_maxrss * 1024;
#endif
#else
    return 0;
#endif
}

// A manager that lets everything pass.
class SkippingManager : public TorkXml_ParseManager_Base
{
public:
    TorkXml_ParseState_Base* GetFirstState(QString const& name) override
    {
        return new TorkXml_FlushUnknownElement(name, this);
    }
};

bool ReadLaunchData(QString const& path)
{
    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("product", "product", "p", 1, "product"));
    const bool read = parser.ReadDataFile(path);
    return read && parser.errorText.isEmpty();
}

// A failed load leaves its text, and nothing else does.
bool ReadConfiguration(QString const& path)
{
    TorkConfigFile settings(path);
    const bool loaded = settings.Load();
    const QString expected = loaded ? "" : "ConfigFile - Could not parse the input file.";
    if (settings.m_lastError != expected)
        qFatal("the last error is \"%s\"", qPrintable(settings.m_lastError));
    return loaded;
}

bool ReadWithManager(QString const& path)
{
    QFile file(path);
    TorkXmlGuard source(&file);
    QXmlSimpleReader reader;
    source.Watch(reader);
    SkippingManager manager;
    reader.setContentHandler(&manager);
    return reader.parse(source);
}

bool ReadWithManagerAlone(QString const& path)
{
    QFile file(path);
    QXmlInputSource source(&file);
    QXmlSimpleReader reader;
    SkippingManager manager;
    reader.setContentHandler(&manager);
    const bool read = reader.parse(source);
    QString report;
    manager.FormatErrors(report);
    if (read == report.contains("More than"))
        qFatal("the report is \"%s\"", qPrintable(report));
    return read;
}

bool ReadInEditor(QString const& path)
{
    const SettingsDocument document = SettingsFileReader::Read(path);
    if (document.isParsed != document.error.isEmpty())
        qFatal("the error is \"%s\"", qPrintable(document.error));
    return document.isParsed;
}

using Reader = bool (*)(QString const& path);

const QMap<QString, Reader> Readers = {{"launch data", ReadLaunchData},
                                       {"configuration", ReadConfiguration},
                                       {"parse manager", ReadWithManager},
                                       {"parse manager by itself", ReadWithManagerAlone},
                                       {"settings editor", ReadInEditor}};

// Prints the result, the milliseconds and the peak of the memory in bytes.
int Read(QStringList const& arguments)
{
    qInstallMessageHandler([](QtMsgType type, QMessageLogContext const&, QString const& text) {
        if (type == QtFatalMsg)
            std::fprintf(stderr, "%s\n", qPrintable(text));
    });
    QElapsedTimer timer;
    timer.start();
    const bool isRead = Readers.value(arguments.value(0))(arguments.value(1));
    std::printf("%d %lld %lld", isRead, timer.elapsed(), PeakMemory());
    return 0;
}

} // namespace

class tst_HostileInput : public QObject
{
    Q_OBJECT

private slots:
    void tellsTheLimit_data();
    void tellsTheLimit();
    void read_data();
    void read();
    void cleanupTestCase();

private:
    void add(char const* reader, char const* what, HostileDocuments::Writer writer, int size,
             bool isRead);
    void addStructures(char const* reader, bool readsTypes);
    void addNamespaces(char const* reader, bool skipsThem);
    void addSize(char const* what, HostileDocuments::Writer writer, int size);
    void write(HostileDocuments::Writer writer, int size);

    void tell(QString const& what, bool isRead, qint64 fileSize, double seconds, qint64 memory);

    QTemporaryDir m_folder;
    HostileDocuments::Writer m_writer = nullptr; ///< of the document that is there
    int m_size = 0;
    int m_count = 0;
    double m_mostSeconds = 0;
    qint64 m_mostMemory = 0;
};

Q_DECLARE_METATYPE(HostileDocuments::Writer)

void tst_HostileInput::add(char const* reader, char const* what, HostileDocuments::Writer writer,
                           int size, bool isRead)
{
    QTest::addRow("%s, %s", reader, what) << reader << writer << size << isRead;
}

// What is small in the file and large in the reader. One that passes over document types is harmed
// by nesting alone.
void tst_HostileInput::addStructures(char const* reader, bool readsTypes)
{
    using namespace HostileDocuments;
    const bool skipsTypes = !readsTypes;
    add(reader, "a million elements inside each other", NestedElements, 1000000, false);
    add(reader, "a million open elements", OpenElements, 1000000, false);
    add(reader, "1000 groups inside each other", NestedGroups, 1000, true);
    add(reader, "1001 groups inside each other", NestedGroups, 1001, skipsTypes);
    add(reader, "a million groups inside each other", NestedGroups, 1000000, skipsTypes);
    add(reader, "a million groups from an entity", GroupsFromEntity, 1000000, skipsTypes);
    add(reader, "ten generations of text entities", TextBomb, 10, skipsTypes);
    add(reader, "ten generations of element entities", ElementBomb, 10, skipsTypes);
    add(reader, "ten generations of entities in an attribute", AttributeBomb, 10, skipsTypes);
    add(reader, "an entity of 100,000 characters named as often", LongEntity, 100000, skipsTypes);
    add(reader, "an entity that references itself", EndlessEntity, 0, skipsTypes);
    add(reader, "200 entities one after another", EntityChain, 200, true);
    add(reader, "100,000 entities one after another", EntityChain, 100000, skipsTypes);
    add(reader, "999 entities with names of 1000 characters", LongEntityNames, 1000, true);
    add(reader, "999 entities with names of 10,000 characters", LongEntityNames, 10000, skipsTypes);
    add(reader, "999 entities of 1000 characters", LongEntityTexts, 1000, true);
    add(reader, "999 entities of 4000 characters", LongEntityTexts, 4000, skipsTypes);
    addNamespaces(reader, skipsTypes);
}

// The reader of launch data knows nothing of namespaces.
void tst_HostileInput::addNamespaces(char const* reader, bool skipsThem)
{
    using namespace HostileDocuments;
    add(reader, "an office document of 40 prefixes", OfficeDocument, 20000, true);
    add(reader, "256 declarations in one tag", DeclarationsInOneTag, 256, true);
    add(reader, "100,000 declarations in one tag", DeclarationsInOneTag, 100000, skipsThem);
    add(reader, "2000 declarations and 4000 children", DeclarationsAndChildren, 2000, skipsThem);
    add(reader, "60,000 declarations and 120,000 children", DeclarationsAndChildren, 60000,
        skipsThem);
    add(reader, "5000 declarations and 5000 children that declare one",
        DeclarationsAndDeclaringChildren, 5000, skipsThem);
    add(reader, "20,000 declarations and 900 levels that declare one", DeclarationsAndDepth, 20000,
        skipsThem);
    add(reader, "no declarations and 900 levels that declare one", DeclarationsAndDepth, 0,
        skipsThem);
    add(reader, "2000 prefixes that nothing declares", UsedPrefixes, 2000, skipsThem);
    add(reader, "4095 elements below 256 declarations", MostPrefixes, 4095, true);
    add(reader, "4096 elements below 256 declarations", MostPrefixes, 4096, skipsThem);
    add(reader, "250,000 elements below 256 declarations", MostPrefixes, 250000, skipsThem);
    add(reader, "250,000 elements below 64 declarations", ElementsBelowPrefixes, 64, skipsThem);
    add(reader, "four million elements from entities below 64 declarations", EntitiesBelowPrefixes,
        64, skipsThem);
}

// All readers one after another, so that a large document is written once.
void tst_HostileInput::addSize(char const* what, HostileDocuments::Writer writer, int size)
{
    for (char const* reader : {"configuration", "parse manager", "launch data"})
        add(reader, what, writer, size, true);
}

void tst_HostileInput::tellsTheLimit_data()
{
    QTest::addColumn<HostileDocuments::Writer>("writer");
    QTest::addColumn<int>("size");
    QTest::addColumn<QString>("reason");

    using namespace HostileDocuments;
    QTest::newRow("elements") << &NestedElements << 1001
                              << "More than 1000 elements are inside each other.";
    QTest::newRow("groups") << &NestedGroups << 1001
                            << "More than 1000 groups are inside each other in a document type.";
    QTest::newRow("entities") << &EntityChain << 1000 << "More than 1000 entities are declared.";
    QTest::newRow("characters of entities")
        << &LongEntity << 5000 << "References to entities stand for more than 16777216 characters.";
    QTest::newRow("prefixes") << &DeclarationsInOneTag << 257
                              << "More than 256 namespace prefixes are in force.";
    QTest::newRow("elements below prefixes")
        << &MostPrefixes << 4096
        << "More than 268435456 comparisons of namespace prefixes are needed.";
    QTest::newRow("elements from entities below prefixes")
        << &EntitiesBelowPrefixes << 64
        << "More than 268435456 comparisons of namespace prefixes are needed.";
    QTest::newRow("long entities")
        << &LongEntityTexts << 4000 << "More than 1048576 characters of entities are declared.";
}

// The store in the log, the settings editor in its document.
void tst_HostileInput::tellsTheLimit()
{
    QFETCH(HostileDocuments::Writer, writer);
    QFETCH(int, size);
    QFETCH(QString, reason);
    write(writer, size);
    const QString path = m_folder.filePath("document");

    QCOMPARE(SettingsFileReader::Read(path).error, reason);

    MessageCapture captured;
    QVERIFY(!ReadConfiguration(path));
    QCOMPARE(captured.messages().size(), 1);
    QVERIFY(captured.messages().first().text.contains(reason));
}

void tst_HostileInput::read_data()
{
    QTest::addColumn<QString>("reader");
    QTest::addColumn<HostileDocuments::Writer>("writer");
    QTest::addColumn<int>("size");
    QTest::addColumn<bool>("isRead");

    for (char const* reader : {"configuration", "parse manager", "settings editor"})
        addStructures(reader, true);
    addStructures("launch data", false);
    addNamespaces("parse manager by itself", false);
    using namespace HostileDocuments;
    addSize("names of 1 MB", LongNames, 1000000);
    addSize("100,000 attributes", ManyAttributes, 100000);
    addSize("a value of 2 MB", LongValue, 2000000);
    addSize("100,000 keys", ManyKeys, 100000);
    if (AllSizes()) {
        addSize("a value of 200 MB", LongValue, 200000000);
        addSize("ten million keys", ManyKeys, 10000000);
    }
}

void tst_HostileInput::write(HostileDocuments::Writer writer, int size)
{
    if (writer == m_writer && size == m_size)
        return;

    QFile file(m_folder.filePath("document"));
    QVERIFY2(file.open(QIODevice::WriteOnly | QIODevice::Truncate), qPrintable(file.errorString()));
    writer(file, size);
    file.close();
    QVERIFY2(file.error() == QFile::NoError, qPrintable(file.errorString()));
    m_writer = writer;
    m_size = size;
}

void tst_HostileInput::read()
{
    QFETCH(QString, reader);
    QFETCH(HostileDocuments::Writer, writer);
    QFETCH(int, size);
    write(writer, size);
    if (QTest::currentTestFailed())
        return;

    const QFile file(m_folder.filePath("document"));
    const int limit = 300000;
    const ChildProcess::Result child =
        ChildProcess::run("read", {reader, file.fileName()}, QString(), limit);
    QVERIFY2(child.ended(), child.report());
    const QList<QByteArray> figures = child.output.split(' ');
    QCOMPARE(figures.size(), 3);
    const qint64 memory = figures[2].toLongLong();
    tell(QTest::currentDataTag(), figures[0] == "1", file.size(), figures[1].toDouble() / 1000,
         memory);

    QTEST(figures[0] == "1", "isRead");
    if (!IsSanitized)
        QVERIFY(memory <= Bound(file.size()));
}

// The small ones are too many for a line each.
void tst_HostileInput::tell(QString const& what, bool isRead, qint64 fileSize, double seconds,
                            qint64 memory)
{
    ++m_count;
    if (fileSize < 10 * Megabyte) {
        m_mostSeconds = qMax(m_mostSeconds, seconds);
        m_mostMemory = qMax(m_mostMemory, memory);
        return;
    }
    Figures::print(QString("hostile input: %1 (%2 MB): %3 in %4 s with %5 MB of memory")
                       .arg(what)
                       .arg(fileSize / Megabyte)
                       .arg(isRead ? "read" : "refused")
                       .arg(seconds, 0, 'f', 1)
                       .arg(memory / Megabyte));
}

void tst_HostileInput::cleanupTestCase()
{
    Figures::print(QString("hostile input: %1 documents; of those below 10 MB none took more than "
                           "%2 s and %3 MB of memory")
                       .arg(m_count)
                       .arg(m_mostSeconds, 0, 'f', 1)
                       .arg(m_mostMemory / Megabyte));
}

int main(int argc, char** argv)
{
    return ChildProcess::main<tst_HostileInput>(argc, argv, {{"read", Read}});
}

#include "tst_HostileInput.moc"
