// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "ConfigContents.h"
#include "StoreTest.h"
#include "common/log/TorkLog.h"
#include "support/MessageCapture.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QDir>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QTranslator>
#include <QtTest>

#include <memory>

#ifdef Q_OS_UNIX
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>
#endif

using namespace StoreTest;

namespace {

const QString NoNameText = QStringLiteral("ConfigFile - Load failed - No file name specified.");

// The log in its own folder, for as long as this object lives.
class LogSession
{
public:
    LogSession() : m_previous(qInstallMessageHandler(nullptr))
    {
        qInstallMessageHandler(m_previous);
        TorkLog::initialize(m_folder.path() + "/", "test", QString(), true);
    }
    ~LogSession()
    {
        TorkLog::shutdown();
        qInstallMessageHandler(m_previous);
    }
    Q_DISABLE_COPY(LogSession)

    /// The entries so far, without their time stamps.
    QStringList entries() const
    {
        const QString text = QString::fromLatin1(TestFiles::read(m_folder.filePath("test.log")));
        QStringList lines = text.split('\n');
        if (lines.last().isEmpty())
            lines.removeLast();
        for (QString& line : lines)
            line.remove(QRegularExpression("^\\d{4}-\\d\\d-\\d\\d \\d\\d:\\d\\d:\\d\\d\\.\\d+ "));
        return lines;
    }

    /// Writes an entry, so that the log file exists even where nothing else writes one.
    void mark() { TorkLog::logger()->trace("mark"); }

private:
    QTemporaryDir m_folder;
    QtMessageHandler m_previous;
};

// Puts every text of a context in brackets.
class BracketTranslator : public QTranslator
{
public:
    QString translate(char const* context, char const* sourceText, char const*, int) const override
    {
        if (qstrcmp(context, "QObject") != 0)
            return QString();
        return QStringLiteral("[[%1]]").arg(QString::fromUtf8(sourceText));
    }
    bool isEmpty() const override { return false; }
};

} // namespace

class tst_TorkConfigFileFailures : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanupTestCase();
    void init();

    void loadFailure_data();
    void loadFailure();
    void specialFile_data();
    void specialFile();
    void linkToAFile();
    void loadSuccessEmptiesTheLastError();
    void loadUnreadableAsOtherUser();
    void fillAfterFailedLoadAndSave();

    void logEntries_data();
    void logEntries();
    void nothingButTheReadersMessageWithoutLog_data();
    void nothingButTheReadersMessageWithoutLog();
    void translatedTexts_data();
    void translatedTexts();

private:
    QString path(QString const& name) const { return m_folder->filePath(name); }

    std::unique_ptr<QTemporaryDir> m_folder;
    QString m_startFolder;
};

void tst_TorkConfigFileFailures::initTestCase()
{
    m_startFolder = QDir::currentPath();
}

void tst_TorkConfigFileFailures::cleanupTestCase()
{
    QDir::setCurrent(m_startFolder);
}

void tst_TorkConfigFileFailures::init()
{
    QDir::setCurrent(m_startFolder);
    m_folder = std::make_unique<QTemporaryDir>();
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
    QDir::setCurrent(m_folder->path());
}

void tst_TorkConfigFileFailures::loadFailure_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("lastError");
    QTest::addColumn<QString>("contents");

    QTest::newRow("null file name") << QString() << NoNameText << "old{k=[v]}";
    QTest::newRow("empty file name") << "" << NoNameText << "old{k=[v]}";
    QTest::newRow("missing file") << "missing.cfg" << NotFoundText << "old{k=[v]}";
    QTest::newRow("missing file of one character") << "m" << NotFoundText << "old{k=[v]}";
    QTest::newRow("missing folder") << "none/x.cfg" << NotFoundText << "old{k=[v]}";
    QTest::newRow("blank file name") << " " << NotFoundText << "old{k=[v]}";
    QTest::newRow("malformed file") << "malformed.cfg" << NotParsedText << "new{a=[1]}";
    QTest::newRow("malformed file of one character") << "a" << NotParsedText << "new{a=[1]}";
    QTest::newRow("empty file") << "empty.cfg" << NotParsedText << "";
    QTest::newRow("a folder in its place") << "folder" << NotParsedText << "";
}

void tst_TorkConfigFileFailures::loadFailure()
{
    QFETCH(QString, name);
    QVERIFY(TestFiles::write("malformed.cfg", "<r><new><a>1</a></wrong></r>"));
    QVERIFY(TestFiles::write("a", "<r><new><a>1</a></wrong></r>"));
    QVERIFY(TestFiles::write("empty.cfg", ""));
    QVERIFY(QDir().mkdir("folder"));
    TorkConfigFile file(name);
    file.WriteItem("old", "k", "v");

    const MessageCapture messages;
    QVERIFY(!file.Load());
    QTEST(file.m_lastError, "lastError");
    QTEST(ConfigContents::of(file, {"old", "new"}), "contents");
}

void tst_TorkConfigFileFailures::specialFile_data()
{
    QTest::addColumn<QString>("kind");
    QTest::addColumn<QString>("saveError");

    QTest::newRow("pipe") << "pipe"
                          << "Unable to open file: %1";
    QTest::newRow("link to a pipe") << "link to a pipe"
                                    << "Unable to open file: %1";
    QTest::newRow("socket") << "socket"
                            << "Unable to open file: %1";
    QTest::newRow("endless device") << "/dev/zero"
                                    << "";
    QTest::newRow("empty device") << "/dev/null"
                                  << "";
    QTest::newRow("full device") << "/dev/full"
                                 << "";
}

// The alarm ends a test that hangs on the other end of a pipe or the end of a device.
void tst_TorkConfigFileFailures::specialFile()
{
#ifdef Q_OS_UNIX
    QFETCH(QString, kind);
    QFETCH(QString, saveError);
    QString name = path("x.cfg");
    sockaddr_un address = {};
    address.sun_family = AF_UNIX;
    qstrncpy(address.sun_path, QFile::encodeName(name).constData(), sizeof address.sun_path);
    if (kind == "socket") {
        const int listening = socket(AF_UNIX, SOCK_STREAM, 0);
        QCOMPARE(bind(listening, reinterpret_cast<sockaddr*>(&address), sizeof address), 0);
        close(listening); // its name stays
    } else if (kind.endsWith("pipe")) {
        QCOMPARE(mkfifo(QFile::encodeName(name).constData(), 0600), 0);
        if (kind.startsWith("link")) {
            QVERIFY(QFile::link(name, path("link.cfg")));
            name = path("link.cfg");
        }
    } else {
        name = kind;
        if (!QFile::exists(name))
            QSKIP("this system has no such device");
    }

    alarm(60);
    TorkConfigFile file(name);
    file.WriteItem("old", "k", "v");
    const MessageCapture messages;
    QVERIFY(!file.Load());
    QCOMPARE(file.m_lastError, NotParsedText);
    QCOMPARE(messages.texts().size(), 1);
    QVERIFY(!file.HasSection(QStringLiteral("old")));

    file.m_lastError.clear();
    file.WriteItem("new", "k", "v");
    QVERIFY(file.Save());
    QCOMPARE(file.m_lastError, saveError.isEmpty() ? QString() : saveError.arg(name));
    alarm(0);
#else
    QSKIP("no such files here");
#endif
}

void tst_TorkConfigFileFailures::linkToAFile()
{
    QVERIFY(TestFiles::write(path("x.cfg"), "<r><s><k>v</k></s></r>"));
    if (!QFile::link(path("x.cfg"), path("link.cfg")))
        QSKIP("no links here");
    TorkConfigFile file(path("link.cfg"));
    QVERIFY(file.Load());
    QCOMPARE(ConfigContents::of(file, {"s"}), QString("s{k=[v]}"));
    QVERIFY(file.Save());
    QCOMPARE(TestFiles::read(path("x.cfg")),
             QByteArray("<VelocorSettings>\n<s>\n<k>v</k>\n</s>\n</VelocorSettings>\n"));
}

void tst_TorkConfigFileFailures::loadSuccessEmptiesTheLastError()
{
    TorkConfigFile file(path("x.cfg"));
    QVERIFY(!file.Load());
    QCOMPARE(file.m_lastError, NotFoundText);

    QVERIFY(TestFiles::write(path("x.cfg"), "<r/>"));
    QVERIFY(file.Load());
    QVERIFY(file.m_lastError.isEmpty());
    QVERIFY(!file.m_lastError.isNull());
}

void tst_TorkConfigFileFailures::loadUnreadableAsOtherUser()
{
    QVERIFY(TestFiles::write(path("x.cfg"), "<r><new><a>1</a></new></r>"));
    QVERIFY(QFile::setPermissions(path("x.cfg"), QFile::WriteOwner));
    QVERIFY(QFile::setPermissions(m_folder->path(), QFile::ReadOwner | QFile::ExeOwner |
                                                        QFile::WriteOwner | QFile::ReadOther |
                                                        QFile::ExeOther));
    TorkConfigFile file(path("x.cfg"));
    file.WriteItem("old", "k", "v");
    const MessageCapture messages;
    {
        const ProcessLimits::OrdinaryUser user;
        if (!user.isInForce() || !QFile::exists(path("x.cfg")))
            QSKIP("no other user who sees the file");
        QVERIFY(!file.Load());
    }
    QCOMPARE(file.m_lastError, NotParsedText);
    QCOMPARE(ConfigContents::of(file, {"old", "new"}), QString());
}

void tst_TorkConfigFileFailures::fillAfterFailedLoadAndSave()
{
    TorkConfigFile file(path("x.cfg"));
    QVERIFY(!file.Load());
    QVERIFY(file.WriteItem("s", "k", "v"));
    QVERIFY(file.Save());
    QCOMPARE(TestFiles::read(path("x.cfg")),
             QByteArray("<VelocorSettings>\n<s>\n<k>v</k>\n</s>\n</VelocorSettings>\n"));
    QVERIFY(file.Load());
    QVERIFY(file.m_lastError.isEmpty());
    QCOMPARE(ConfigContents::of(file, {"s"}), QString("s{k=[v]}"));
}

void tst_TorkConfigFileFailures::logEntries_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<Setup>("action");
    QTest::addColumn<QStringList>("expected");

    const Setup load = [](TorkConfigFile& file) {
        file.Load();
    };
    const Setup saveIt = [](TorkConfigFile& file) {
        file.Save();
    };
    QTest::newRow("load") << "good.cfg" << load
                          << QStringList{"Trace Loading configuration from good.cfg"};
    QTest::newRow("load without file name")
        << "" << load << QStringList{"Trace Loading configuration from ", "Trace " + NoNameText};
    QTest::newRow("load a missing file")
        << "missing.cfg" << load
        << QStringList{"Trace Loading configuration from missing.cfg", "Trace " + NotFoundText};
    QTest::newRow("load with a placeholder in the name")
        << "%1.cfg" << load
        << QStringList{"Trace Loading configuration from %1.cfg", "Trace " + NotFoundText};
    QTest::newRow("load a malformed file")
        << "malformed.cfg" << load
        << QStringList{"Trace Loading configuration from malformed.cfg",
                       "Error TorkErrorHandler::fatalError:  \"Xml Parse Failure.\\n"
                       "tag mismatch\\nPublic ID: , System ID: \\nLine: 2, Column: 4\"",
                       "Trace " + NotParsedText};
    QTest::newRow("load twice") << "good.cfg" << Setup([](TorkConfigFile& file) {
        file.Load();
        file.Load();
    })
                                << QStringList{"Trace Loading configuration from good.cfg",
                                               "Trace Loading configuration from good.cfg"};
    QTest::newRow("save") << "new.cfg" << saveIt << QStringList();
    QTest::newRow("save under a short name") << "a" << saveIt << QStringList();
    QTest::newRow("save that cannot open") << "none/x.cfg" << saveIt << QStringList();
    QTest::newRow("null value") << "x.cfg" << Setup([](TorkConfigFile& file) {
        file.WriteItem("s", "k", QString());
    }) << QStringList();
    QTest::newRow("reading and writing values") << "x.cfg" << Setup([](TorkConfigFile& file) {
        file.WriteItem("s", "k", 1);
        int number = 0;
        file.ReadInt("s", "other", 2, number);
        file.ReadInt("s", "k", 2, number);
        file.ClearSection("s");
        file.Clear();
    }) << QStringList();
}

void tst_TorkConfigFileFailures::logEntries()
{
    QFETCH(QString, name);
    QFETCH(Setup, action);
    QFETCH(QStringList, expected);
    QVERIFY(TestFiles::write("good.cfg", "<r><s><k>v</k></s></r>"));
    QVERIFY(TestFiles::write("malformed.cfg", "<r>\n</s>\n</r>"));

    LogSession log;
    TorkConfigFile file(name);
    action(file);
    log.mark();
    QCOMPARE(log.entries(), expected << "Trace mark");
}

void tst_TorkConfigFileFailures::nothingButTheReadersMessageWithoutLog_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QStringList>("expected");

    QTest::newRow("good file") << "good.cfg" << QStringList();
    QTest::newRow("no file name") << "" << QStringList();
    QTest::newRow("missing file") << "missing.cfg" << QStringList();
    QTest::newRow("malformed file")
        << "malformed.cfg"
        << QStringList{"critical: TorkErrorHandler::fatalError:  \"Xml Parse Failure.\\n"
                       "tag mismatch\\nPublic ID: , System ID: \\nLine: 2, Column: 4\""};
}

void tst_TorkConfigFileFailures::nothingButTheReadersMessageWithoutLog()
{
    QFETCH(QString, name);
    QVERIFY(!TorkLog::m_gLog);
    QVERIFY(TestFiles::write("good.cfg", "<r><s><k>v</k></s></r>"));
    QVERIFY(TestFiles::write("malformed.cfg", "<r>\n</s>\n</r>"));

    const MessageCapture messages;
    TorkConfigFile file(name);
    QCOMPARE(file.Load(), name == "good.cfg");
    QTEST(messages.texts(), "expected");
}

void tst_TorkConfigFileFailures::translatedTexts_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<Setup>("action");
    QTest::addColumn<QString>("lastError");

    const Setup load = [](TorkConfigFile& file) {
        file.Load();
    };
    QTest::newRow("no file name") << "" << load << "[[" + NoNameText + "]]";
    QTest::newRow("missing file") << "missing.cfg" << load << "[[" + NotFoundText + "]]";
    QTest::newRow("malformed file") << "malformed.cfg" << load << "[[" + NotParsedText + "]]";
    QTest::newRow("save that cannot open is not translated")
        << "none/x.cfg" << Setup([](TorkConfigFile& file) { file.Save(); })
        << "Unable to open file: none/x.cfg";
}

void tst_TorkConfigFileFailures::translatedTexts()
{
    QFETCH(QString, name);
    QFETCH(Setup, action);
    QFETCH(QString, lastError);
    QVERIFY(TestFiles::write("malformed.cfg", "<r>"));
    LogSession log;
    BracketTranslator translator;
    QVERIFY(QCoreApplication::installTranslator(&translator));

    TorkConfigFile file(name);
    action(file);
    log.mark();
    QVERIFY(QCoreApplication::removeTranslator(&translator));

    QCOMPARE(file.m_lastError, lastError);
    if (!lastError.startsWith("[["))
        return;
    const QStringList entries = log.entries();
    QVERIFY(entries.size() >= 3);
    QCOMPARE(entries.first(), "[[Trace]] [[Loading configuration from " + name + "]]");
    QCOMPARE(entries[entries.size() - 2], "[[Trace]] " + lastError);
}

QTEST_GUILESS_MAIN(tst_TorkConfigFileFailures)

#include "tst_TorkConfigFileFailures.moc"
