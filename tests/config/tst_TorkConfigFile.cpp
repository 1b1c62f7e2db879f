// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "ConfigContents.h"
#include "common/log/TorkLog.h"
#include "support/MessageCapture.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QDir>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QTranslator>
#include <QtTest>

#include <functional>
#include <memory>
#include <type_traits>

#ifdef Q_OS_UNIX
#include <sys/socket.h>
#include <sys/stat.h>
#include <sys/un.h>
#include <unistd.h>
#endif
#ifdef Q_OS_LINUX
#include <sys/prctl.h>
#endif

static_assert(std::has_virtual_destructor<TorkConfigFile>::value,
              "applications derive from the store and delete it through this class");

namespace {

const QString NoNameText = QStringLiteral("ConfigFile - Load failed - No file name specified.");
const QString NotFoundText = QStringLiteral("ConfigFile - File not found.");
const QString NotParsedText = QStringLiteral("ConfigFile - Could not parse the input file.");

using Setup = std::function<void(TorkConfigFile&)>;
using Lookup = std::function<bool(TorkConfigFile&, QString const&)>;

// A section that tells when it is deleted.
class WatchedSection : public TorkConfigFileSection
{
public:
    WatchedSection(char const* sectionName, int& deleted)
        : TorkConfigFileSection(sectionName), m_deleted(deleted)
    {}
    ~WatchedSection() override { ++m_deleted; }

private:
    int& m_deleted;
};

// The log in a folder of its own, for as long as this object lives.
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

    /// Writes an entry, so that the log file exists also where nothing else does.
    void mark() { TorkLog::logger()->trace("mark"); }

private:
    QTemporaryDir m_folder;
    QtMessageHandler m_previous;
};

// Puts every text of a context between brackets.
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

// The administrator may read and write everything; for a while somebody else takes over.
class OrdinaryUser
{
public:
#ifdef Q_OS_UNIX
    OrdinaryUser() : m_wasAdministrator(geteuid() == 0)
    {
        m_changed = m_wasAdministrator && seteuid(65534) == 0;
    }
    ~OrdinaryUser()
    {
        if (m_changed && seteuid(0) != 0)
            qFatal("cannot become the administrator again");
#ifdef Q_OS_LINUX
        // A process that changed its user is closed to tracing, which leak checkers depend on.
        prctl(PR_SET_DUMPABLE, 1);
#endif
    }
    bool isInForce() const
    {
        return m_changed || !m_wasAdministrator;
    }

private:
    bool m_wasAdministrator = false;
    bool m_changed = false;
#else
    bool isInForce() const
    {
        return false;
    }
#endif
};

} // namespace

Q_DECLARE_METATYPE(Setup)
Q_DECLARE_METATYPE(Lookup)

class tst_TorkConfigFile : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanupTestCase();
    void init();

    void startsEmpty_data();
    void startsEmpty();
    void constructionTouchesNoDisk();
    void destructorIsVirtual();

    void lookup_data();
    void lookup();
    void findSectionGivesTheStoredObject();
    void appendSectionTakesOwnership_data();
    void appendSectionTakesOwnership();
    void appendSectionReplacesWithoutDeleting();
    void appendSectionTwice();
    void appendSectionThatWasPushedOut_data();
    void appendSectionThatWasPushedOut();
    void appendNoSection();
    void appendSectionKeepsBlanksInTheName();
    void clearForgetsAllSections();
    void clearSection_data();
    void clearSection();
    void keyList_data();
    void keyList();

    void writeItem_data();
    void writeItem();
    void writeItemRefusesNull_data();
    void writeItemRefusesNull();
    void writeItemReplaces();
    void newSectionPushesOutItsNamesake();
    void pushedOutSectionIsItsHolders_data();
    void pushedOutSectionIsItsHolders();
    void pushedOutSectionNobodyHolds();

    void readItem_data();
    void readItem();
    void readItemOneObjectForDefaultAndValue_data();
    void readItemOneObjectForDefaultAndValue();
    void readItemStoresNoDefault();

    void filterContent_data();
    void filterContent();

    void save_data();
    void save();
    void saveManyKeysInTheOrderOfTheKeyList();
    void saveManySections();
    void saveReplacesALongerFile();
    void saveShortFileName_data();
    void saveShortFileName();
    void saveUnopenable_data();
    void saveUnopenable();
    void saveAsOtherUser();
    void saveIgnoresWriteErrors_data();
    void saveIgnoresWriteErrors();
    void saveKeepsLastErrorOnSuccess();
    void setFileName();

    void saveAndLoad_data();
    void saveAndLoad();
    void fileNames_data();
    void fileNames();

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

void tst_TorkConfigFile::initTestCase()
{
    m_startFolder = QDir::currentPath();
}

void tst_TorkConfigFile::cleanupTestCase()
{
    QDir::setCurrent(m_startFolder);
}

void tst_TorkConfigFile::init()
{
    QDir::setCurrent(m_startFolder);
    m_folder = std::make_unique<QTemporaryDir>();
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
    QDir::setCurrent(m_folder->path());
}

void tst_TorkConfigFile::startsEmpty_data()
{
    QTest::addColumn<bool>("ownRoot");
    QTest::newRow("with the usual root element") << false;
    QTest::newRow("with its own root element") << true;
}

void tst_TorkConfigFile::startsEmpty()
{
    QFETCH(bool, ownRoot);
    const std::unique_ptr<TorkConfigFile> file(ownRoot ? new TorkConfigFile(path("x.cfg"), "Root")
                                                       : new TorkConfigFile(path("x.cfg")));

    QVERIFY(!file->HasSection("ApplicationScreens"));
    QVERIFY(!file->HasSection("UnknownSection"));
    QVERIFY(!file->HasSection(""));
    QVERIFY(file->m_lastError.isEmpty());
    QVERIFY(!file->m_lastError.isNull());

    file->Save();
    QCOMPARE(TestFiles::read(path("x.cfg")),
             ownRoot ? QByteArray("<Root>\n</Root>\n")
                     : QByteArray("<VelocorSettings>\n</VelocorSettings>\n"));
}

void tst_TorkConfigFile::constructionTouchesNoDisk()
{
    QVERIFY(TestFiles::write(path("old.cfg"), "not to be touched"));
    {
        TorkConfigFile one(path("new.cfg"));
        TorkConfigFile two(path("old.cfg"), "Root");
        two.WriteItem("s", "k", "v");
        QVERIFY(two.m_lastError.isEmpty());
    }
    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList{"old.cfg: not to be touched"});
}

void tst_TorkConfigFile::destructorIsVirtual()
{
    class Derived : public TorkConfigFile
    {
    public:
        explicit Derived(bool& destroyed) : TorkConfigFile(QString()), m_destroyed(destroyed) {}
        ~Derived() override { m_destroyed = true; }

    private:
        bool& m_destroyed;
    };

    bool destroyed = false;
    TorkConfigFile* file = new Derived(destroyed);
    delete file;
    QVERIFY(destroyed);
}

void tst_TorkConfigFile::lookup_data()
{
    QTest::addColumn<Lookup>("ask");
    QTest::addColumn<QString>("asked");
    QTest::addColumn<bool>("expected");

    const struct
    {
        char const* title;
        Lookup ask;
    } operations[] = {
        {"HasSection",
         [](TorkConfigFile& file, QString const& name) {
             return file.HasSection(name);
         }},
        {"HasSection, modifiable name",
         [](TorkConfigFile& file, QString const& name) {
             QString modifiable = name;
             return file.HasSection(modifiable) && modifiable == name;
         }},
        {"FindSection",
         [](TorkConfigFile& file, QString const& name) {
             return file.FindSection(name) != nullptr;
         }},
        {"FindSection, modifiable name",
         [](TorkConfigFile& file, QString const& name) {
             QString modifiable = name;
             return file.FindSection(modifiable) != nullptr && modifiable == name;
         }},
    };
    for (auto const& operation : operations) {
        const auto row = [&](char const* what, QString const& asked, bool expected) {
            QTest::addRow("%s: %s", operation.title, what) << operation.ask << asked << expected;
        };
        row("same name", "MainWindow", true);
        row("another section", "Other", true);
        row("other letter case", "mainwindow", false);
        row("blanks are not removed", "Main Window", false);
        row("leading blank", " MainWindow", false);
        row("missing", "Third", false);
        row("empty", "", false);
        row("null", QString(), false);
    }
}

void tst_TorkConfigFile::lookup()
{
    QFETCH(Lookup, ask);
    QFETCH(QString, asked);
    TorkConfigFile file{QString()};
    file.WriteItem("MainWindow", "k", "v");
    file.WriteItem("Other", "k", "v");

    QTEST(ask(file, asked), "expected");

    // A question makes no section.
    QCOMPARE(ConfigContents::of(file, {"MainWindow", "Other", asked}),
             QString("MainWindow{k=[v]}Other{k=[v]}"));
}

void tst_TorkConfigFile::findSectionGivesTheStoredObject()
{
    TorkConfigFile file{QString()};
    auto* section = new TorkConfigFileSection("One");
    file.AppendSection(section);

    QCOMPARE(file.FindSection("One"), section);
    QString name("One");
    QCOMPARE(file.FindSection(name), section);
    QCOMPARE(name, QString("One"));
}

void tst_TorkConfigFile::appendSectionTakesOwnership_data()
{
    QTest::addColumn<bool>("byClear");
    QTest::newRow("Clear deletes it") << true;
    QTest::newRow("the destructor deletes it") << false;
}

void tst_TorkConfigFile::appendSectionTakesOwnership()
{
    QFETCH(bool, byClear);
    int deleted = 0;
    {
        TorkConfigFile file{QString()};
        QVERIFY(file.AppendSection(new WatchedSection("One", deleted)));
        QVERIFY(file.AppendSection(new WatchedSection("Two", deleted)));
        QVERIFY(file.HasSection("One"));
        QVERIFY(file.HasSection("Two"));
        QCOMPARE(deleted, 0);
        if (byClear) {
            file.Clear();
            QCOMPARE(deleted, 2);
        }
    }
    QCOMPARE(deleted, 2);
}

void tst_TorkConfigFile::appendSectionReplacesWithoutDeleting()
{
    int oldDeleted = 0;
    int newDeleted = 0;
    auto old = std::make_unique<WatchedSection>("One", oldDeleted);
    {
        TorkConfigFile file{QString()};
        QVERIFY(file.AppendSection(old.get()));
        file.WriteItem("One", "old", "1");
        QVERIFY(file.AppendSection(new WatchedSection("One", newDeleted)));
        file.WriteItem("One", "new", "2");

        QCOMPARE(ConfigContents::of(file, {"One"}), QString("One{new=[2]}"));
    }
    QCOMPARE(newDeleted, 1);
    QCOMPARE(oldDeleted, 0);
    QCOMPARE(old->keyList(), QStringList{"old"});
}

void tst_TorkConfigFile::appendSectionTwice()
{
    int deleted = 0;
    {
        TorkConfigFile file{QString()};
        auto* section = new WatchedSection("One", deleted);
        QVERIFY(file.AppendSection(section));
        file.WriteItem("One", "k", "v");
        QVERIFY(file.AppendSection(section));
        QVERIFY(file.AppendSection(file.FindSection(QStringLiteral("One"))));
        QCOMPARE(ConfigContents::of(file, {"One"}), QString("One{k=[v]}"));
        QCOMPARE(deleted, 0);
    }
    QCOMPARE(deleted, 1);
}

void tst_TorkConfigFile::appendSectionThatWasPushedOut_data()
{
    QTest::addColumn<bool>("toAnotherFile");
    QTest::newRow("to the same file") << false;
    QTest::newRow("to another file") << true;
}

// The two go on changing places; each is deleted once, by whom it belongs to in the end.
void tst_TorkConfigFile::appendSectionThatWasPushedOut()
{
    QFETCH(bool, toAnotherFile);
    int firstDeleted = 0;
    int secondDeleted = 0;
    auto* first = new WatchedSection("One", firstDeleted);
    auto second = std::make_unique<WatchedSection>("One", secondDeleted);
    {
        TorkConfigFile other{QString()};
        TorkConfigFile file{QString()};
        file.AppendSection(first);
        file.AppendSection(second.get());
        (toAnotherFile ? other : file).AppendSection(first);
        if (toAnotherFile)
            file.AppendSection(new TorkConfigFileSection("One"));
        QVERIFY(file.WriteItem("One", "k", "v"));
        QCOMPARE(second->keyList(), QStringList());
        file.Clear();
        QCOMPARE(firstDeleted, toAnotherFile ? 0 : 1);
    }
    QCOMPARE(firstDeleted, 1);
    QCOMPARE(secondDeleted, 0);
}

void tst_TorkConfigFile::appendNoSection()
{
    TorkConfigFile file{QString()};
    file.WriteItem("One", "k", "v");
    QVERIFY(file.AppendSection(nullptr));
    QCOMPARE(ConfigContents::of(file, {"One", ""}), QString("One{k=[v]}"));
}

void tst_TorkConfigFile::appendSectionKeepsBlanksInTheName()
{
    TorkConfigFile file{QString()};
    auto* section = new TorkConfigFileSection("My Section");
    section->AddValue("k", "v");
    file.AppendSection(section);

    QVERIFY(file.HasSection("My Section"));
    QVERIFY(!file.HasSection("MySection"));

    // Reading drops the blank from the name, and so does not find it.
    QString none("none");
    QString value;
    QVERIFY(!file.ReadItem("My Section", "k", none, value));
    QCOMPARE(value, QString("none"));

    // Nor a key that holds one, while others are still found.
    file.WriteItem("MySection", "k", "w");
    file.FindSection("MySection")->AddValue("my key", "x");
    QVERIFY(!file.ReadItem("My Section", "my key", none, value));
    QVERIFY(file.ReadItem("My Section", " k ", none, value));
    QCOMPARE(value, QString("w"));
}

void tst_TorkConfigFile::clearForgetsAllSections()
{
    TorkConfigFile file(path("x.cfg"));
    file.WriteItem("One", "k", "v");
    file.WriteItem("Two", "k", "v");
    file.m_lastError = "kept";

    file.Clear();
    QCOMPARE(ConfigContents::of(file, {"One", "Two"}), QString());
    QCOMPARE(file.m_lastError, QString("kept"));

    file.WriteItem("Two", "new", "w");
    QCOMPARE(ConfigContents::of(file, {"One", "Two"}), QString("Two{new=[w]}"));
}

void tst_TorkConfigFile::clearSection_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("expected");

    const QString untouched("MySection{k=[v]}Other{k=[v]}");
    QTest::newRow("empties the section, which stays") << "MySection"
                                                      << "MySection{}Other{k=[v]}";
    QTest::newRow("missing") << "Third" << untouched;
    QTest::newRow("other letter case") << "mysection" << untouched;
    QTest::newRow("blanks are not removed") << "My Section" << untouched;
    QTest::newRow("empty") << "" << untouched;
}

void tst_TorkConfigFile::clearSection()
{
    QFETCH(QString, name);
    TorkConfigFile file{QString()};
    file.WriteItem("MySection", "k", "v");
    file.WriteItem("Other", "k", "v");

    file.ClearSection(name);
    QTEST(ConfigContents::of(file, {"MySection", "Other", name}), "expected");
}

void tst_TorkConfigFile::keyList_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QStringList>("expected");

    QTest::newRow("of a section") << "MySection" << QStringList{"a", "b"};
    QTest::newRow("of an empty section") << "Empty" << QStringList();
    QTest::newRow("missing") << "Third" << QStringList();
    QTest::newRow("other letter case") << "mysection" << QStringList();
    QTest::newRow("blanks are not removed") << "My Section" << QStringList();
}

void tst_TorkConfigFile::keyList()
{
    QFETCH(QString, name);
    TorkConfigFile file{QString()};
    file.WriteItem("MySection", "a", "1");
    file.WriteItem("MySection", "b", "2");
    file.AppendSection(new TorkConfigFileSection("Empty"));

    QStringList keys = file.keyList(name);
    keys.sort();
    QTEST(keys, "expected");
    QVERIFY(!file.HasSection("Third"));
}

void tst_TorkConfigFile::writeItem_data()
{
    QTest::addColumn<QString>("section");
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("value");
    QTest::addColumn<QString>("expectedSection");
    QTest::addColumn<QString>("expectedKey");

    const QString replacement = QChar(QChar::ReplacementCharacter);
    QTest::newRow("plain") << "Main"
                           << "key"
                           << "value"
                           << "Main"
                           << "key";
    QTest::newRow("a blank in each name") << "My Section"
                                          << "my key"
                                          << "my value"
                                          << "MySection"
                                          << "mykey";
    QTest::newRow("blanks everywhere") << "  My  Section "
                                       << " my  key  "
                                       << " v "
                                       << "MySection"
                                       << "mykey";
    QTest::newRow("tabs and wide blanks stay") << "My\tSection" << QString("my\nkey\u2003") << "v"
                                               << "My\tSection" << QString("my\nkey\u2003");
    QTest::newRow("letter case is kept") << "MAIN"
                                         << "Key"
                                         << "v"
                                         << "MAIN"
                                         << "Key";
    QTest::newRow("empty value") << "Main"
                                 << "key"
                                 << ""
                                 << "Main"
                                 << "key";
    QTest::newRow("empty key") << "Main"
                               << ""
                               << "v"
                               << "Main"
                               << "";
    QTest::newRow("a key of blanks") << "Main"
                                     << "   "
                                     << "v"
                                     << "Main"
                                     << "";
    QTest::newRow("empty section name") << ""
                                        << "key"
                                        << "v"
                                        << ""
                                        << "key";
    QTest::newRow("null section name") << QString() << "key"
                                       << "v"
                                       << ""
                                       << "key";
    QTest::newRow("any text as value") << "Main"
                                       << "key" << QString("<&>\"' \n%1]]>\u20AC") << "Main"
                                       << "key";
    QTest::newRow("any text as key") << "Main" << QString("\u043A\u043B\u044E\u0447<%1>") << "v"
                                     << "Main" << QString("\u043A\u043B\u044E\u0447<%1>");

    // A new section's name goes through Latin-1 bytes that are read as UTF-8.
    QTest::newRow("section name in Latin-1") << QString("Stra\u00DFe") << "key"
                                             << "v" << QString("Stra%1e").arg(replacement) << "key";
    QTest::newRow("section name that happens to be UTF-8") << QString("\u00C3\u00A9") << "key"
                                                           << "v" << QString("\u00E9") << "key";
    QTest::newRow("section name beyond Latin-1") << QString("\u20AC") << "key"
                                                 << "v"
                                                 << "?"
                                                 << "key";
}

void tst_TorkConfigFile::writeItem()
{
    QFETCH(QString, section);
    QFETCH(QString, key);
    QFETCH(QString, value);
    QFETCH(QString, expectedSection);
    QFETCH(QString, expectedKey);
    TorkConfigFile file(path("x.cfg"));

    QVERIFY(file.WriteItem(section, key, value));

    TorkConfigFileSection* stored = file.FindSection(expectedSection);
    QVERIFY(stored);
    QVERIFY(stored->IsCalled(expectedSection));
    QCOMPARE(stored->keyList(), QStringList{expectedKey});
    QString found = QStringLiteral("untouched");
    QVERIFY(stored->FindValue(expectedKey, found));
    QCOMPARE(found, value);
    if (section != expectedSection)
        QVERIFY(!file.HasSection(section));

    QCOMPARE(TestFiles::listing(m_folder->path()), QStringList()); // nothing before Save()
}

void tst_TorkConfigFile::writeItemRefusesNull_data()
{
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("value");

    QTest::newRow("null key") << QString() << "value";
    QTest::newRow("null value") << "key" << QString();
    QTest::newRow("both null") << QString() << QString();
}

void tst_TorkConfigFile::writeItemRefusesNull()
{
    QFETCH(QString, key);
    QFETCH(QString, value);
    TorkConfigFile file{QString()};
    file.WriteItem("Main", "key", "before");

    QVERIFY(!file.WriteItem("Main", key, value));
    QVERIFY(!file.WriteItem("New", key, value));

    QCOMPARE(ConfigContents::of(file, {"Main", "New"}), QString("Main{key=[before]}"));
    QVERIFY(file.m_lastError.isEmpty());
}

void tst_TorkConfigFile::writeItemReplaces()
{
    TorkConfigFile file{QString()};
    QVERIFY(file.WriteItem("Main Window", "key", "first"));
    QVERIFY(file.WriteItem("MainWindow", "k e y", "second"));
    QVERIFY(file.WriteItem("MainWindow", "Key", "third"));
    QCOMPARE(ConfigContents::of(file, {"MainWindow", "Main Window"}),
             QString("MainWindow{Key=[third];key=[second]}"));
}

// The name that was asked for is never found, so each write makes its section again.
void tst_TorkConfigFile::newSectionPushesOutItsNamesake()
{
    const QString written("\u00E9");
    const QString stored = QChar(QChar::ReplacementCharacter);
    TorkConfigFile file{QString()};

    QVERIFY(file.WriteItem(written, "first", "1"));
    QCOMPARE(file.keyList(stored), QStringList{"first"});
    QVERIFY(file.WriteItem(written, "second", "2"));
    QCOMPARE(file.keyList(stored), QStringList{"second"});
    QVERIFY(!file.HasSection(written));
    QVERIFY(file.WriteItem(stored, "third", "3"));
}

void tst_TorkConfigFile::pushedOutSectionIsItsHolders_data()
{
    QTest::addColumn<QString>("made");
    QTest::addColumn<QString>("then");

    for (char const* made : {"appended", "written", "loaded"}) {
        for (char const* then : {"deleted", "deleted after the file", "appended again"})
            QTest::addRow("%s, then %s", made, then) << QString(made) << QString(then);
    }
}

// Run under the address sanitizer, which sees what is deleted twice, too late or never.
void tst_TorkConfigFile::pushedOutSectionIsItsHolders()
{
    QFETCH(QString, made);
    QFETCH(QString, then);
    const QString written("\u00E9");
    const QString stored = QChar(QChar::ReplacementCharacter);
    auto file = std::make_unique<TorkConfigFile>(path("x.cfg"));

    TorkConfigFileSection* held = nullptr;
    if (made == "appended") {
        held = new TorkConfigFileSection("\xE9");
        file->AppendSection(held);
    } else if (made == "written") {
        file->WriteItem(written, "old", "1");
        held = file->FindSection(stored);
    } else {
        QVERIFY(TestFiles::write(path("x.cfg"), "<r><\xC3\xA9><k>v</k></\xC3\xA9></r>"));
        QVERIFY(file->Load());
        held = file->FindSection(stored);
    }
    QVERIFY(held != nullptr);
    const QStringList heldKeys = held->keyList();
    QVERIFY(file->WriteItem(written, "new", "2"));
    QCOMPARE(held->keyList(), heldKeys);
    QVERIFY(file->FindSection(stored) != held);

    if (then == "deleted") {
        delete held;
        QCOMPARE(file->keyList(stored), QStringList{"new"});
    } else if (then == "deleted after the file") {
        file.reset();
        QCOMPARE(held->keyList(), heldKeys);
        delete held;
    } else {
        std::unique_ptr<TorkConfigFileSection> pushedOut(file->FindSection(stored));
        file->AppendSection(held);
        QCOMPARE(file->keyList(stored), heldKeys);
        QCOMPARE(pushedOut->keyList(), QStringList{"new"});
    }
}

// The leak checker sees one that stays behind.
void tst_TorkConfigFile::pushedOutSectionNobodyHolds()
{
    const QString stored = QChar(QChar::ReplacementCharacter);
    TorkConfigFile file(path("x.cfg"));
    for (int i = 0; i < 10; ++i)
        QVERIFY(file.WriteItem(QString("\u00E9"), QString::number(i), "v"));
    QCOMPARE(file.keyList(stored), QStringList{"9"});
    file.AppendSection(new TorkConfigFileSection("\xE9"));
    QCOMPARE(file.keyList(stored), QStringList());

    QVERIFY(TestFiles::write(path("x.cfg"), "<r><\xC3\xA9><k>v</k></\xC3\xA9>"
                                            "<\xC3\xA9><l>w</l></\xC3\xA9></r>"));
    QVERIFY(file.Load());
    QCOMPARE(file.keyList(stored), QStringList{"l"});
}

void tst_TorkConfigFile::readItem_data()
{
    QTest::addColumn<QString>("section");
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("defaultValue");
    QTest::addColumn<bool>("found");
    QTest::addColumn<QString>("expected");

    QTest::newRow("present") << "MainWindow"
                             << "mykey"
                             << "default" << true << "stored";
    QTest::newRow("present, empty default") << "MainWindow"
                                            << "mykey"
                                            << "" << true << "stored";
    QTest::newRow("present, null default") << "MainWindow"
                                           << "mykey" << QString() << true << "stored";
    QTest::newRow("blanks in both names") << "Main Window"
                                          << " my key "
                                          << "default" << true << "stored";
    QTest::newRow("stored empty text") << "MainWindow"
                                       << "empty"
                                       << "default" << true << "";
    QTest::newRow("missing key") << "MainWindow"
                                 << "other"
                                 << "default" << false << "default";
    QTest::newRow("missing section") << "Other"
                                     << "mykey"
                                     << "default" << false << "default";
    QTest::newRow("key in other letter case") << "MainWindow"
                                              << "MyKey"
                                              << "default" << false << "default";
    QTest::newRow("section in other letter case") << "mainwindow"
                                                  << "mykey"
                                                  << "default" << false << "default";
    QTest::newRow("missing, empty default") << "MainWindow"
                                            << "other"
                                            << "" << false << "";
    QTest::newRow("missing, null default") << "MainWindow"
                                           << "other" << QString() << false << "";
    QTest::newRow("missing, blank default") << "MainWindow"
                                            << "other"
                                            << " " << false << " ";
    QTest::newRow("missing section, null default") << "Other"
                                                   << "mykey" << QString() << false << "";
    QTest::newRow("null key") << "MainWindow" << QString() << "default" << false << "default";
    QTest::newRow("null section") << QString() << "mykey"
                                  << "default" << false << "default";
}

void tst_TorkConfigFile::readItem()
{
    QFETCH(QString, section);
    QFETCH(QString, key);
    QFETCH(QString, defaultValue);
    QFETCH(QString, expected);
    TorkConfigFile file{QString()};
    file.WriteItem("Main Window", "my key", "stored");
    file.WriteItem("Main Window", "empty", "");

    QString asked = defaultValue;
    QString value = QStringLiteral("before");
    QTEST(file.ReadItem(section, key, asked, value), "found");
    QCOMPARE(value, expected);
    QVERIFY(!value.isNull());
    QCOMPARE(asked, defaultValue);
    QVERIFY(file.m_lastError.isEmpty());
}

void tst_TorkConfigFile::readItemOneObjectForDefaultAndValue_data()
{
    QTest::addColumn<QString>("key");
    QTest::addColumn<QString>("before");
    QTest::addColumn<QString>("after");

    QTest::newRow("present") << "key"
                             << "default"
                             << "stored";
    QTest::newRow("missing") << "other"
                             << "default"
                             << "default";
    QTest::newRow("missing, empty") << "other"
                                    << ""
                                    << "";
}

void tst_TorkConfigFile::readItemOneObjectForDefaultAndValue()
{
    QFETCH(QString, key);
    QFETCH(QString, before);
    TorkConfigFile file{QString()};
    file.WriteItem("Main", "key", "stored");

    QString text = before;
    QCOMPARE(file.ReadItem("Main", key, text, text), key == "key");
    QTEST(text, "after");
}

void tst_TorkConfigFile::readItemStoresNoDefault()
{
    TorkConfigFile file{QString()};
    file.WriteItem("Main", "key", "stored");

    QString defaultValue("default");
    QString value;
    file.ReadItem("Main", "other", defaultValue, value);
    file.ReadItem("New", "key", defaultValue, value);

    QCOMPARE(ConfigContents::of(file, {"Main", "New"}), QString("Main{key=[stored]}"));
}

void tst_TorkConfigFile::filterContent_data()
{
    QTest::addColumn<QString>("in");
    QTest::addColumn<QString>("expected");

    QTest::newRow("plain stays bare") << "ab"
                                      << "ab";
    QTest::newRow("ampersand") << "a&b"
                               << "<![CDATA[a&b]]>";
    QTest::newRow("apostrophe") << "a'b"
                                << "<![CDATA[a'b]]>";
    QTest::newRow("less than") << "a<b"
                               << "<![CDATA[a<b]]>";
    QTest::newRow("greater than") << "a>b"
                                  << "<![CDATA[a>b]]>";
    QTest::newRow("double quotation mark") << "a\"b"
                                           << "<![CDATA[a\"b]]>";
    QTest::newRow("only a mark") << "&"
                                 << "<![CDATA[&]]>";
    QTest::newRow("mark at the start") << "<a"
                                       << "<![CDATA[<a]]>";
    QTest::newRow("mark at the end") << "a\""
                                     << "<![CDATA[a\"]]>";
    QTest::newRow("all of them") << "&'<>\""
                                 << "<![CDATA[&'<>\"]]>";
    QTest::newRow("entities are not resolved") << "&amp;"
                                               << "<![CDATA[&amp;]]>";
    QTest::newRow("end of a CDATA section is not escaped") << "a]]>b"
                                                           << "<![CDATA[a]]>b]]>";
    QTest::newRow("wrapped already") << "<![CDATA[a]]>"
                                     << "<![CDATA[<![CDATA[a]]>]]>";
    QTest::newRow("empty") << ""
                           << "";
    QTest::newRow("blank") << " "
                           << " ";
    QTest::newRow("brackets alone stay bare") << "a]]"
                                              << "a]]";
    QTest::newRow("line ends stay bare") << "a\nb\r\n"
                                         << "a\nb\r\n";
    QTest::newRow("other punctuation stays bare") << "`!?%#;/\\="
                                                  << "`!?%#;/\\=";
    QTest::newRow("typographic marks stay bare")
        << QString("\u2019\u201D\u2039") << QString("\u2019\u201D\u2039");
    QTest::newRow("placeholder stays bare") << "%1"
                                            << "%1";
    QTest::newRow("placeholder beside a mark") << "%1&%2"
                                               << "<![CDATA[%1&%2]]>";
}

void tst_TorkConfigFile::filterContent()
{
    QFETCH(QString, in);
    TorkConfigFile file{QString()};

    QString given = in;
    QString out = QStringLiteral("before");
    file.FilterContent(given, out);
    QTEST(out, "expected");
    QCOMPARE(given, in);

    file.FilterContent(given, given);
    QTEST(given, "expected");
}

void tst_TorkConfigFile::save_data()
{
    QTest::addColumn<QString>("root");
    QTest::addColumn<Setup>("fill");
    QTest::addColumn<QByteArray>("expected");

    const QString usual("VelocorSettings");
    const auto items = [](QStringList const& keysAndValues) {
        return Setup([keysAndValues](TorkConfigFile& file) {
            for (int i = 0; i < keysAndValues.size(); i += 2)
                file.WriteItem("s", keysAndValues[i], keysAndValues[i + 1]);
        });
    };
    const auto inside = [](QByteArray const& lines) {
        return "<VelocorSettings>\n<s>\n" + lines + "</s>\n</VelocorSettings>\n";
    };

    QTest::newRow("no section") << usual << items({})
                                << QByteArray("<VelocorSettings>\n</VelocorSettings>\n");
    QTest::newRow("root element of its own")
        << "LogSettings" << items({"k", "v"})
        << QByteArray("<LogSettings>\n<s>\n<k>v</k>\n</s>\n</LogSettings>\n");
    QTest::newRow("empty root element name") << "" << items({}) << QByteArray("<>\n</>\n");
    QTest::newRow("root element name is a placeholder")
        << "%1" << items({}) << QByteArray("<%1>\n</%1>\n");
    QTest::newRow("empty section") << usual << Setup([](TorkConfigFile& f) {
        f.AppendSection(new TorkConfigFileSection("s"));
    }) << inside("");
    QTest::newRow("cleared section") << usual << Setup([](TorkConfigFile& f) {
        f.WriteItem("s", "k", "v");
        f.ClearSection("s");
    }) << inside("");
    QTest::newRow("section name is a placeholder")
        << usual << Setup([](TorkConfigFile& f) { f.WriteItem("%1", "k", "v"); })
        << QByteArray("<VelocorSettings>\n<%1>\n<k>v</k>\n</%1>\n</VelocorSettings>\n");
    QTest::newRow("names without their blanks")
        << usual << Setup([](TorkConfigFile& f) { f.WriteItem("Main Window", "my key", "v w"); })
        << QByteArray("<VelocorSettings>\n<MainWindow>\n<mykey>v w</mykey>\n</MainWindow>\n"
                      "</VelocorSettings>\n");

    QTest::newRow("plain value") << usual << items({"k", "ab"}) << inside("<k>ab</k>\n");
    QTest::newRow("empty value") << usual << items({"k", ""}) << inside("<k></k>\n");
    QTest::newRow("blank value") << usual << items({"k", " "}) << inside("<k> </k>\n");
    QTest::newRow("empty key") << usual << items({"", "v"}) << inside("<>v</>\n");
    QTest::newRow("replaced value") << usual << items({"k", "v", "k", "w"}) << inside("<k>w</k>\n");
    QTest::newRow("line ends in a value")
        << usual << items({"k", "a\nb\r\nc"}) << inside("<k>a\nb\r\nc</k>\n");
    QTest::newRow("ampersand") << usual << items({"k", "a&b"})
                               << inside("<k><![CDATA[a&b]]></k>\n");
    QTest::newRow("apostrophe") << usual << items({"k", "a'b"})
                                << inside("<k><![CDATA[a'b]]></k>\n");
    QTest::newRow("less than") << usual << items({"k", "a<b"})
                               << inside("<k><![CDATA[a<b]]></k>\n");
    QTest::newRow("greater than") << usual << items({"k", "a>b"})
                                  << inside("<k><![CDATA[a>b]]></k>\n");
    QTest::newRow("double quotation mark")
        << usual << items({"k", "a\"b"}) << inside("<k><![CDATA[a\"b]]></k>\n");
    QTest::newRow("end of a CDATA section")
        << usual << items({"k", "a]]>b"}) << inside("<k><![CDATA[a]]>b]]></k>\n");
    QTest::newRow("Latin-1 text") << usual << items({QString("gr\u00FC\u00DF"), QString("\u00E9")})
                                  << inside("<gr\xFC\xDF>\xE9</gr\xFC\xDF>\n");
    QTest::newRow("text beyond Latin-1")
        << usual << items({QString("\u043A\u043B"), QString("1 \u20AC")})
        << inside("<?"
                  "?>1 ?</?"
                  "?>\n");

    // Key, value and key are put in one after the other, each at the lowest marker left by then.
    QTest::newRow("value holds %1") << usual << items({"k", "%1"}) << inside("<k>k</%3>\n");
    QTest::newRow("value holds %2") << usual << items({"k", "a%2b"}) << inside("<k>akb</%3>\n");
    QTest::newRow("value holds %3") << usual << items({"k", "%3"}) << inside("<k>k</k>\n");
    QTest::newRow("value holds %4") << usual << items({"k", "%4"}) << inside("<k>%4</k>\n");
    QTest::newRow("value holds %1 twice")
        << usual << items({"k", "%1-%1"}) << inside("<k>k-k</%3>\n");
    QTest::newRow("value holds %1 and %2")
        << usual << items({"k", "%1%2"}) << inside("<k>k%2</%3>\n");
    QTest::newRow("value holds a localised marker")
        << usual << items({"k", "%L1"}) << inside("<k>k</%3>\n");
    QTest::newRow("value holds a two-digit marker")
        << usual << items({"k", "%12"}) << inside("<k>%12</k>\n");
    QTest::newRow("value holds %1 and markup")
        << usual << items({"k", "%1 & more"}) << inside("<k><![CDATA[k & more]]></%3>\n");
    QTest::newRow("value holds a bare percent sign")
        << usual << items({"k", "100%"}) << inside("<k>100%</k>\n");
    QTest::newRow("key is %1") << usual << items({"%1", "v"}) << inside("<v>%1</%3>\n");
    QTest::newRow("key is %2") << usual << items({"%2", "v"}) << inside("<v>v</%2>\n");
    QTest::newRow("key is %4") << usual << items({"%4", "v"}) << inside("<%4>v</%4>\n");
}

void tst_TorkConfigFile::save()
{
    QFETCH(QString, root);
    QFETCH(Setup, fill);
    TorkConfigFile file(path("x.cfg"), root);
    fill(file);

    QVERIFY(file.Save());
    QTEST(TestFiles::read(path("x.cfg")), "expected");
    QVERIFY(file.m_lastError.isEmpty());

    // Saving changes nothing in memory.
    QVERIFY(file.Save());
    QTEST(TestFiles::read(path("x.cfg")), "expected");
}

void tst_TorkConfigFile::saveManyKeysInTheOrderOfTheKeyList()
{
    TorkConfigFile file(path("x.cfg"));
    for (int i = 0; i < 50; ++i)
        file.WriteItem("s", QStringLiteral("key%1").arg(i), QString::number(i * i));

    QByteArray expected = "<VelocorSettings>\n<s>\n";
    const QStringList keys = file.keyList("s");
    QCOMPARE(keys.size(), 50);
    for (QString const& key : keys) {
        const int i = key.mid(3).toInt();
        expected += "<key" + QByteArray::number(i) + '>' + QByteArray::number(i * i) + "</key" +
                    QByteArray::number(i) + ">\n";
    }
    expected += "</s>\n</VelocorSettings>\n";

    file.Save();
    QCOMPARE(TestFiles::read(path("x.cfg")), expected);
}

void tst_TorkConfigFile::saveManySections()
{
    TorkConfigFile file(path("x.cfg"));
    file.WriteItem("One", "k", "1");
    file.WriteItem("Two", "k", "2");
    file.Save();

    const QByteArray one = "<One>\n<k>1</k>\n</One>\n";
    const QByteArray two = "<Two>\n<k>2</k>\n</Two>\n";
    const QByteArray saved = TestFiles::read(path("x.cfg"));
    const QByteArray oneFirst = "<VelocorSettings>\n" + one + two + "</VelocorSettings>\n";
    const QByteArray twoFirst = "<VelocorSettings>\n" + two + one + "</VelocorSettings>\n";
    QVERIFY2(saved == oneFirst || saved == twoFirst, saved.constData());
}

void tst_TorkConfigFile::saveReplacesALongerFile()
{
    QVERIFY(TestFiles::write(path("x.cfg"), QByteArray(10000, 'x')));
    TorkConfigFile file(path("x.cfg"));
    file.Save();
    QCOMPARE(TestFiles::read(path("x.cfg")), QByteArray("<VelocorSettings>\n</VelocorSettings>\n"));
}

void tst_TorkConfigFile::saveShortFileName_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QStringList>("files");

    const QString saved("<VelocorSettings>\n<s>\n<k>v</k>\n</s>\n</VelocorSettings>\n");
    QTest::newRow("null") << QString() << QStringList();
    QTest::newRow("empty") << "" << QStringList();
    QTest::newRow("one character") << "a" << QStringList();
    QTest::newRow("two characters are enough") << "ab" << QStringList{"ab: " + saved};
}

void tst_TorkConfigFile::saveShortFileName()
{
    QFETCH(QString, name);
    TorkConfigFile file(path("missing.cfg"));
    file.WriteItem("s", "k", "v");
    QVERIFY(!file.Load());
    QCOMPARE(file.m_lastError, NotFoundText);
    file.SetFileName(name);

    QVERIFY(file.Save());
    QTEST(TestFiles::listing(m_folder->path()), "files");
    QCOMPARE(file.m_lastError, NotFoundText);
}

void tst_TorkConfigFile::saveUnopenable_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("a folder in its place") << "folder";
    QTest::newRow("folder missing") << "none/x.cfg";
    QTest::newRow("a file for a folder") << "file/x.cfg";
    QTest::newRow("placeholder in the name") << "none/%1 %2.cfg";
    QTest::newRow("blanks and other letters in the name") << QString("no ne/Gr\u00F6\u00DFe.cfg");
}

void tst_TorkConfigFile::saveUnopenable()
{
    QFETCH(QString, name);
    QVERIFY(QDir(m_folder->path()).mkdir("folder"));
    QVERIFY(TestFiles::write(path("file"), "here"));
    const QStringList before = TestFiles::listing(m_folder->path());
    TorkConfigFile file(path(name));
    file.WriteItem("s", "k", "v");

    QVERIFY(file.Save());
    QCOMPARE(file.m_lastError, "Unable to open file: " + path(name));
    QCOMPARE(TestFiles::listing(m_folder->path()), before);
    QCOMPARE(ConfigContents::of(file, {"s"}), QString("s{k=[v]}"));
}

void tst_TorkConfigFile::saveAsOtherUser()
{
    QVERIFY(TestFiles::write(path("x.cfg"), "not to be touched"));
    QVERIFY(QFile::setPermissions(path("x.cfg"), QFile::ReadOwner | QFile::ReadOther));
    QVERIFY(QFile::setPermissions(m_folder->path(), QFile::ReadOwner | QFile::ExeOwner |
                                                        QFile::WriteOwner | QFile::ReadOther |
                                                        QFile::ExeOther));
    TorkConfigFile file(path("x.cfg"));
    {
        const OrdinaryUser user;
        if (!user.isInForce())
            QSKIP("no right to become another user");
        QVERIFY(file.Save());
    }
    QCOMPARE(file.m_lastError, "Unable to open file: " + path("x.cfg"));
    QCOMPARE(TestFiles::read(path("x.cfg")), QByteArray("not to be touched"));
}

void tst_TorkConfigFile::saveIgnoresWriteErrors_data()
{
    QTest::addColumn<bool>("fullDevice");

    QTest::newRow("full device") << true;
    QTest::newRow("file size limit") << false;
}

void tst_TorkConfigFile::saveIgnoresWriteErrors()
{
    QFETCH(bool, fullDevice);
    const QString name = fullDevice ? QStringLiteral("/dev/full") : path("x.cfg");
    if (fullDevice && !QFile::exists(name))
        QSKIP("this system has no device that is always full");
    TorkConfigFile file(name);
    file.WriteItem("s", "k", QString(100000, 'v'));

    const MessageCapture messages;
    if (!fullDevice && !ProcessLimits::limitFileSize(4096))
        QSKIP("no limit for file sizes here");
    const bool saved = file.Save();
    if (!fullDevice)
        QVERIFY(ProcessLimits::unlimitFileSize());

    QVERIFY(saved);
    QVERIFY(file.m_lastError.isEmpty());
    QCOMPARE(messages.texts(), QStringList());
    QCOMPARE(file.keyList("s"), QStringList{"k"});
    if (!fullDevice)
        QCOMPARE(QFileInfo(name).size(), 4096);
}

void tst_TorkConfigFile::saveKeepsLastErrorOnSuccess()
{
    TorkConfigFile file(path("none/x.cfg"));
    file.Save();
    const QString failure = "Unable to open file: " + path("none/x.cfg");
    QCOMPARE(file.m_lastError, failure);

    file.SetFileName(path("x.cfg"));
    QVERIFY(file.Save());
    QVERIFY(QFile::exists(path("x.cfg")));
    QCOMPARE(file.m_lastError, failure);
}

void tst_TorkConfigFile::setFileName()
{
    TorkConfigFile file(path("one.cfg"), "Root");
    file.WriteItem("s", "k", "v");
    file.m_lastError = "kept";

    file.SetFileName(path("two.cfg"));
    QCOMPARE(file.m_lastError, QString("kept"));
    QCOMPARE(ConfigContents::of(file, {"s"}), QString("s{k=[v]}"));

    file.Save();
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList{"two.cfg: <Root>\n<s>\n<k>v</k>\n</s>\n</Root>\n"});

    QVERIFY(TestFiles::write(path("three.cfg"), "<Root><t><a>b</a></t></Root>"));
    file.SetFileName(path("three.cfg"));
    QVERIFY(file.Load());
    QCOMPARE(ConfigContents::of(file, {"s", "t"}), QString("t{a=[b]}"));
}

void tst_TorkConfigFile::saveAndLoad_data()
{
    QTest::addColumn<QString>("value");
    QTest::addColumn<bool>("parses");
    QTest::addColumn<bool>("comesBack");

    QTest::newRow("plain") << "ab" << true << true;
    QTest::newRow("ampersand") << "a&b" << true << true;
    QTest::newRow("an entity's text") << "&lt;&#65;" << true << true;
    QTest::newRow("tags") << "<a>b</a><!-- c -->" << true << true;
    QTest::newRow("both quotation marks") << "'\"" << true << true;
    QTest::newRow("one blank") << " " << true << true;
    QTest::newRow("blanks around") << "  a b  " << true << true;
    QTest::newRow("line ends and tabs") << "a\n\tb\n" << true << true;
    QTest::newRow("brackets") << "a]]b]" << true << true;
    QTest::newRow("brackets beside a mark") << "a&b]]" << true << true;
    QTest::newRow("percent signs") << "100 % %%" << true << true;
    QTest::newRow("200000 characters") << QString(200000, 'y') << true << true;
    QTest::newRow("200000 characters in CDATA") << QString(200000, '&') << true << true;
    QTest::newRow("empty is lost") << "" << true << false;
    QTest::newRow("end of a CDATA section does not parse back") << "a]]>b" << false << false;
    QTest::newRow("placeholder does not parse back") << "a%1b" << false << false;
    QTest::newRow("third placeholder turns into the key") << "%3" << true << false;
}

void tst_TorkConfigFile::saveAndLoad()
{
    QFETCH(QString, value);
    QFETCH(bool, parses);
    QFETCH(bool, comesBack);
    TorkConfigFile writer(path("x.cfg"));
    writer.WriteItem("Main", "key", value);
    writer.Save();

    const MessageCapture messages;
    TorkConfigFile reader(path("x.cfg"));
    QCOMPARE(reader.Load(), parses);
    QCOMPARE(reader.m_lastError, parses ? QString() : NotParsedText);
    QCOMPARE(messages.texts().size(), parses ? 0 : 1);

    QString none("none");
    QString back;
    const bool found = reader.ReadItem("Main", "key", none, back);
    QCOMPARE(found && back == value, comesBack);
}

void tst_TorkConfigFile::fileNames_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("relative") << "x.cfg";
    QTest::newRow("two characters") << "ab";
    QTest::newRow("blanks") << " my file .cfg";
    QTest::newRow("other letters") << QString("Gr\u00F6\u00DFe \u043A\u043B\u044E\u0447.cfg");
    QTest::newRow("placeholder") << "%1%2.cfg";
    QTest::newRow("markup") << "a&b'<>.cfg";
    QTest::newRow("hidden") << ".x";
}

void tst_TorkConfigFile::fileNames()
{
    QFETCH(QString, name);
    TorkConfigFile writer(name);
    writer.WriteItem("s", "k", "v");
    QVERIFY(writer.Save());
    QVERIFY(writer.m_lastError.isEmpty());
    QCOMPARE(TestFiles::listing(m_folder->path()),
             QStringList{name + ": <VelocorSettings>\n<s>\n<k>v</k>\n</s>\n</VelocorSettings>\n"});

    TorkConfigFile reader(name);
    QVERIFY(reader.Load());
    QCOMPARE(ConfigContents::of(reader, {"s"}), QString("s{k=[v]}"));
}

void tst_TorkConfigFile::loadFailure_data()
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

void tst_TorkConfigFile::loadFailure()
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

void tst_TorkConfigFile::specialFile_data()
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

// The alarm ends a test that waits for the other end of a pipe, or for the end of a device.
void tst_TorkConfigFile::specialFile()
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

void tst_TorkConfigFile::linkToAFile()
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

void tst_TorkConfigFile::loadSuccessEmptiesTheLastError()
{
    TorkConfigFile file(path("x.cfg"));
    QVERIFY(!file.Load());
    QCOMPARE(file.m_lastError, NotFoundText);

    QVERIFY(TestFiles::write(path("x.cfg"), "<r/>"));
    QVERIFY(file.Load());
    QVERIFY(file.m_lastError.isEmpty());
    QVERIFY(!file.m_lastError.isNull());
}

void tst_TorkConfigFile::loadUnreadableAsOtherUser()
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
        const OrdinaryUser user;
        if (!user.isInForce() || !QFile::exists(path("x.cfg")))
            QSKIP("no other user who sees the file");
        QVERIFY(!file.Load());
    }
    QCOMPARE(file.m_lastError, NotParsedText);
    QCOMPARE(ConfigContents::of(file, {"old", "new"}), QString());
}

void tst_TorkConfigFile::fillAfterFailedLoadAndSave()
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

void tst_TorkConfigFile::logEntries_data()
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

void tst_TorkConfigFile::logEntries()
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

void tst_TorkConfigFile::nothingButTheReadersMessageWithoutLog_data()
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

void tst_TorkConfigFile::nothingButTheReadersMessageWithoutLog()
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

void tst_TorkConfigFile::translatedTexts_data()
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

void tst_TorkConfigFile::translatedTexts()
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

QTEST_GUILESS_MAIN(tst_TorkConfigFile)
#include "tst_TorkConfigFile.moc"
