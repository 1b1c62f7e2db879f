// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigFile.h"

#include "ConfigContents.h"
#include "StoreTest.h"
#include "support/PrivateField.h"
#include "support/TestFiles.h"

#include <QDir>
#include <QTemporaryDir>
#include <QtTest>

#include <functional>
#include <memory>
#include <type_traits>

#ifdef Q_OS_UNIX
#include <unistd.h>
#endif

using namespace StoreTest;

static_assert(std::has_virtual_destructor<TorkConfigFile>::value,
              "applications derive from the store and delete it through this class");

PRIVATE_FIELD(KnownOutside, TorkConfigFile, QSet<TorkConfigFileSection*>, m_knownOutside);

namespace {

using Lookup = std::function<bool(TorkConfigFile&, QString const&)>;

// A section that reports when it is deleted.
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

} // namespace

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
    void appendSectionAndTheCurrentOne_data();
    void appendSectionAndTheCurrentOne();
    void currentSectionOf_data();
    void currentSectionOf();
    void appendNoSection();
    void appendSectionKeepsBlanksInTheName();
    void clearForgetsAllSections();
    void clearForgetsWhatCallersHold();
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

    // A lookup creates no section.
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

// The two keep changing places; each is deleted once, by its final owner.
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

void tst_TorkConfigFile::appendSectionAndTheCurrentOne_data()
{
    QTest::addColumn<QString>("current");
    QTest::addColumn<bool>("isHeld");
    QTest::addColumn<bool>("isReplaced");

    QTest::newRow("the current one is pushed out and deleted") << "One" << false << true;
    QTest::newRow("the current one is pushed out to its holder") << "One" << true << true;
    QTest::newRow("another is current") << "Two" << false << false;
}

// A current section that is pushed out would otherwise be one that is deleted.
void tst_TorkConfigFile::appendSectionAndTheCurrentOne()
{
    QFETCH(QString, current);
    QFETCH(bool, isHeld);
    QFETCH(bool, isReplaced);
    TorkConfigFile file{QString()};
    file.WriteItem("Two", "k", "v");
    file.WriteItem("One", "k", "v");
    const std::unique_ptr<TorkConfigFileSection> held(isHeld ? file.FindSection("One") : nullptr);
    QVERIFY(file.HasSection(current));
    TorkConfigFileSection const* const before = file.CurrentSection();

    auto* section = new TorkConfigFileSection("One");
    file.AppendSection(section);
    QVERIFY(file.CurrentSection() == (isReplaced ? section : before));
    QCOMPARE(file.CurrentSection()->name(), current);
    QCOMPARE(file.CurrentSection()->keyList(), isReplaced ? QStringList() : QStringList("k"));
}

void tst_TorkConfigFile::currentSectionOf_data()
{
    QTest::addColumn<StoreTest::Setup>("call");
    QTest::addColumn<QString>("current"); // "" for none

    const auto row = [](char const* name, Setup const& call, char const* current) {
        QTest::newRow(name) << call << QString(current);
    };
    row("nothing", Setup([](TorkConfigFile&) {}), "Two");
    row("HasSection", Setup([](TorkConfigFile& file) { file.HasSection("One"); }), "One");
    row("HasSection of none", Setup([](TorkConfigFile& file) { file.HasSection("No"); }), "Two");
    row("FindSection", Setup([](TorkConfigFile& file) { file.FindSection("One"); }), "One");
    row("keyList", Setup([](TorkConfigFile& file) { file.keyList("One"); }), "One");
    row("keyList of none", Setup([](TorkConfigFile& file) { file.keyList("No"); }), "Two");
    row("ClearSection", Setup([](TorkConfigFile& file) { file.ClearSection("One"); }), "One");
    row("ReadItem of a missing key", Setup([](TorkConfigFile& file) {
            QString none;
            QString value;
            file.ReadItem("One", "no", none, value);
        }),
        "One");
    row("ReadInt", Setup([](TorkConfigFile& file) {
            int value = 0;
            file.ReadInt("One", "k", 0, value);
        }),
        "One");
    row("WriteItem", Setup([](TorkConfigFile& file) { file.WriteItem("One", "l", "w"); }), "One");
    row("WriteItem of a null value",
        Setup([](TorkConfigFile& file) { file.WriteItem("One", "l", QString()); }), "Two");
    row("WriteItem in a new section",
        Setup([](TorkConfigFile& file) { file.WriteItem("New", "l", "w"); }), "New");
    row("AppendSection",
        Setup([](TorkConfigFile& file) { file.AppendSection(new TorkConfigFileSection("New")); }),
        "Two");
    row("AppendSection where none is current", Setup([](TorkConfigFile& file) {
            file.Clear();
            file.AppendSection(new TorkConfigFileSection("New"));
        }),
        "");
    row("ToXml", Setup([](TorkConfigFile& file) { file.ToXml(); }), "Two");
    row("Clear", Setup([](TorkConfigFile& file) { file.Clear(); }), "");
}

void tst_TorkConfigFile::currentSectionOf()
{
    QFETCH(StoreTest::Setup, call);
    TorkConfigFile file{QString()};
    QVERIFY(!file.CurrentSection());
    file.WriteItem("One", "k", "v");
    file.WriteItem("Two", "k", "v");
    call(file);
    TorkConfigFileSection const* const current = file.CurrentSection();
    QTEST(current ? current->name() : QString(""), "current");
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

    // Reading drops the space from the name, and so does not find it.
    QString none("none");
    QString value;
    QVERIFY(!file.ReadItem("My Section", "k", none, value));
    QCOMPARE(value, QString("none"));

    // Nor a key that contains one, while others are still found.
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

// A new section at the address of an old one would count as held by a caller, and leak.
void tst_TorkConfigFile::clearForgetsWhatCallersHold()
{
    TorkConfigFile file{QString()};
    file.WriteItem("One", "k", "v");
    QVERIFY(file.FindSection(QStringLiteral("One")));
    QCOMPARE((file.*privateField(KnownOutside())).size(), 1);
    file.Clear();
    QCOMPARE((file.*privateField(KnownOutside())).size(), 0);
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

    TorkConfigFileSection* const section = file.FindSection("MySection");
    file.ClearSection(name);
    QVERIFY(file.FindSection("MySection") == section); // emptied, not replaced
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

    // A new section's name is converted to Latin-1 bytes that are then decoded as UTF-8.
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

// The requested name is never found, so each write creates its section again.
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

// Run under AddressSanitizer, which reports what is deleted twice, too late or never.
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

// The leak checker reports one that remains.
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

QTEST_GUILESS_MAIN(tst_TorkConfigFile)

#include "tst_TorkConfigFile.moc"
