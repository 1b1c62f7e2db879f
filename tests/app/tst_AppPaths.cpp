// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "ProgramRuns.h"

#include "app/AppPaths.h"
#include "support/TestFiles.h"

#include <QDir>
#include <QFileInfo>
#include <QJsonDocument>
#include <QJsonObject>
#include <QSignalSpy>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QTest>

#ifdef Q_OS_UNIX
#include <unistd.h>
#endif

namespace {

char const* const Properties[] = {"RootPath", "DataPath", "DocPath"};

// This program is outside any bundle: the parent of its folder.
QString OwnRoot()
{
    return QFileInfo(QCoreApplication::applicationDirPath()).path() + "/";
}

QString DataLocation()
{
    return QStandardPaths::writableLocation(QStandardPaths::AppLocalDataLocation) + "/";
}

QString DocumentsLocation()
{
    return QStandardPaths::writableLocation(QStandardPaths::DocumentsLocation) + "/";
}

// The text of a published property, or "not published".
QString Published(char const* property)
{
    const QVariant value = QCoreApplication::instance()->property(property);
    if (!value.isValid())
        return "not published";
    return value.userType() == QMetaType::QString ? value.toString() : "not a text";
}

QJsonObject Parsed(ProgramResult const& result)
{
    return QJsonDocument::fromJson(result.output).object();
}

// Records the order in which names and properties change.
class ChangeRecorder : public QObject
{
public:
    ChangeRecorder()
    {
        QCoreApplication::instance()->installEventFilter(this);
        connect(QCoreApplication::instance(), &QCoreApplication::organizationNameChanged, this,
                [this] { changes.append("organization"); });
        connect(QCoreApplication::instance(), &QCoreApplication::applicationNameChanged, this,
                [this] { changes.append("product"); });
    }

    bool eventFilter(QObject* object, QEvent* event) override
    {
        if (object == QCoreApplication::instance() &&
            event->type() == QEvent::DynamicPropertyChange)
            changes.append(static_cast<QDynamicPropertyChangeEvent*>(event)->propertyName());
        return false;
    }

    QStringList changes;
};

} // namespace

class tst_AppPaths : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void setupRootPath_data();
    void setupRootPath();
    void rootPathKeepsAnEarlierProperty();
    void setupProgramPath_data();
    void setupProgramPath();
    void setupDataRootPath_data();
    void setupDataRootPath();
    void setupDocumentPath_data();
    void setupDocumentPath();
    void setupPaths_data();
    void setupPaths();
    void dataPathFollowsTheNames();
    void nothingIsCreated();
    void setNames_data();
    void setNames();
    void setNamesInOrder();
    void setNamesPublishesAfresh();
    void rootRule_data();
    void rootRule();
    void locations_data();
    void locations();
    void identity_data();
    void identity();
    void identityWithoutFile();
    void identityWithFolderInItsPlace();
    void identityOfUnreadableFile();
    void identityInABundle();
    void identityReadsTheRootOnly();
    void withoutApplicationObject();

private:
    QProcessEnvironment Environment() const { return PrivateEnvironment(m_tree.path()); }
    QString Top() const { return QFileInfo(m_tree.path()).canonicalFilePath() + "/"; }

    // An installation whose probe is in tool/bin.
    QTemporaryDir m_tree;
    QString m_probe;
    QString m_dataFile;
};

void tst_AppPaths::initTestCase()
{
    QVERIFY(m_tree.isValid());
    QVERIFY(CopyProgram(FRAME_PROBE, Top() + "tool/bin", "probe"));
    m_probe = Top() + "tool/bin/probe";
    m_dataFile = Top() + "tool/appdata.cfg";
}

void tst_AppPaths::init()
{
    QCoreApplication::setOrganizationName("Start Org");
    QCoreApplication::setApplicationName("Start Product");
    for (char const* property : Properties)
        QCoreApplication::instance()->setProperty(property, QVariant());
    QFile::remove(m_dataFile);
}

void tst_AppPaths::setupRootPath_data()
{
    QTest::addColumn<QString>("input");
    QTest::addColumn<QString>("output");
    QTest::addColumn<QString>("published");

    QTest::newRow("empty") << "" << OwnRoot() << OwnRoot();
    QTest::newRow("null") << QString() << OwnRoot() << OwnRoot();
    QTest::newRow("not empty: kept, nothing published") << "/kept"
                                                        << "/kept"
                                                        << "not published";
    QTest::newRow("a space is not empty") << " "
                                          << " "
                                          << "not published";
}

void tst_AppPaths::setupRootPath()
{
    QFETCH(QString, input);
    AppPaths::SetupRootPath(input);
    QTEST(input, "output");
    QTEST(Published("RootPath"), "published");
    QCOMPARE(Published("DataPath"), QString("not published"));
    QCOMPARE(Published("DocPath"), QString("not published"));
}

void tst_AppPaths::rootPathKeepsAnEarlierProperty()
{
    QCoreApplication::instance()->setProperty("RootPath", "/earlier/");
    QString path("/kept");
    AppPaths::SetupRootPath(path);
    QCOMPARE(Published("RootPath"), QString("/earlier/"));
}

void tst_AppPaths::setupProgramPath_data()
{
    QTest::addColumn<QString>("input");

    QTest::newRow("empty") << "";
    QTest::newRow("null") << QString();
    QTest::newRow("not empty: computed anyway") << "/overwritten/";
}

void tst_AppPaths::setupProgramPath()
{
    QFETCH(QString, input);
    AppPaths::SetupProgramPath(input);
    QCOMPARE(input, OwnRoot());
    for (char const* property : Properties)
        QCOMPARE(Published(property), QString("not published"));
}

void tst_AppPaths::setupDataRootPath_data()
{
    setupProgramPath_data();
}

void tst_AppPaths::setupDataRootPath()
{
    QFETCH(QString, input);
    AppPaths::SetupDataRootPath(input);
    QCOMPARE(input, DataLocation());
    QCOMPARE(Published("RootPath"), QString("not published"));
    QCOMPARE(Published("DataPath"), DataLocation());
    QCOMPARE(Published("DocPath"), QString("not published"));
}

void tst_AppPaths::setupDocumentPath_data()
{
    setupProgramPath_data();
}

void tst_AppPaths::setupDocumentPath()
{
    QFETCH(QString, input);
    AppPaths::SetupDocumentPath(input);
    QCOMPARE(input, DocumentsLocation());
    QCOMPARE(Published("RootPath"), QString("not published"));
    QCOMPARE(Published("DataPath"), QString("not published"));
    QCOMPARE(Published("DocPath"), DocumentsLocation());
}

void tst_AppPaths::setupPaths_data()
{
    QTest::addColumn<QString>("root");
    QTest::addColumn<QString>("data");
    QTest::addColumn<QString>("expectedRoot");
    QTest::addColumn<QString>("publishedRoot");

    QTest::newRow("both empty") << ""
                                << "" << OwnRoot() << OwnRoot();
    QTest::newRow("root kept, data overwritten") << "/kept"
                                                 << "/overwritten"
                                                 << "/kept"
                                                 << "not published";
    QTest::newRow("data overwritten") << ""
                                      << "/overwritten" << OwnRoot() << OwnRoot();
}

void tst_AppPaths::setupPaths()
{
    QFETCH(QString, root);
    QFETCH(QString, data);
    AppPaths::SetupPaths(root, data);
    QTEST(root, "expectedRoot");
    QCOMPARE(data, DataLocation());
    QTEST(Published("RootPath"), "publishedRoot");
    QCOMPARE(Published("DataPath"), DataLocation());
    QCOMPARE(Published("DocPath"), QString("not published"));
}

void tst_AppPaths::dataPathFollowsTheNames()
{
    QString before;
    AppPaths::SetupDataRootPath(before);
    QCoreApplication::setOrganizationName("Other Org");
    QCoreApplication::setApplicationName("Other Product");
    QString after;
    AppPaths::SetupDataRootPath(after);
    QVERIFY(before != after);
    QCOMPARE(Published("DataPath"), after);
    QCOMPARE(after, DataLocation());
}

void tst_AppPaths::nothingIsCreated()
{
    QString root;
    QString data;
    QString documents;
    QCoreApplication::setApplicationName("Never Seen Before");
    AppPaths::SetupPaths(root, data);
    AppPaths::SetupDocumentPath(documents);
    QVERIFY(!QFile::exists(data));
    QVERIFY(!QFile::exists(documents));
}

void tst_AppPaths::setNames_data()
{
    QTest::addColumn<QString>("organization");
    QTest::addColumn<QString>("product");

    QTest::newRow("plain") << "Org"
                           << "Product";
    QTest::newRow("blanks") << "My Org"
                            << " My Product ";
    QTest::newRow("letters beyond ASCII")
        << QString::fromUtf8("K\xC3\xB6ln") << QString::fromUtf8("Ger\xC3\xA4t");
    QTest::newRow("empty organization") << ""
                                        << "Product";
}

void tst_AppPaths::setNames()
{
    QFETCH(QString, organization);
    QFETCH(QString, product);
    AppPaths::SetOrganizationAndProduct(organization, product);
    QCOMPARE(QCoreApplication::organizationName(), organization);
    QCOMPARE(QCoreApplication::applicationName(), product);
    QCOMPARE(Published("RootPath"), OwnRoot());
    QCOMPARE(Published("DataPath"), DataLocation());
    QCOMPARE(Published("DocPath"), DocumentsLocation());
}

void tst_AppPaths::setNamesInOrder()
{
    const ChangeRecorder recorder;
    AppPaths::SetOrganizationAndProduct("Org", "Product");
    QCOMPARE(recorder.changes,
             QStringList({"organization", "product", "RootPath", "DataPath", "DocPath"}));
}

void tst_AppPaths::setNamesPublishesAfresh()
{
    for (char const* property : Properties)
        QCoreApplication::instance()->setProperty(property, "/earlier/");
    AppPaths::SetOrganizationAndProduct("Org", "Product");
    QCOMPARE(Published("RootPath"), OwnRoot());
    QCOMPARE(Published("DataPath"), DataLocation());
    QCOMPARE(Published("DocPath"), DocumentsLocation());
}

void tst_AppPaths::rootRule_data()
{
    QTest::addColumn<QString>("folder");
    QTest::addColumn<QString>("root");

    QTest::newRow("outside a bundle: the last component goes") << "opt/tool1/bin"
                                                               << "opt/tool1/";
    QTest::newRow("in a bundle: the folder that holds it") << "Applications/Some.app/Contents/MacOS"
                                                           << "Applications/";
    QTest::newRow("bundle in a bundle: the last cut counts")
        << "a/X.app/Contents/MacOS/b/Y.app/Contents/MacOS"
        << "a/X.app/Contents/MacOS/b/";
    QTest::newRow("twice, one right after the other") << "b/X.app/Contents/MacOS/Contents/MacOS"
                                                      << "b/X.app/Contents/";
    QTest::newRow("lower case is no bundle") << "c/X.app/contents/macos"
                                             << "c/X.app/contents/";
    QTest::newRow("one letter in another case") << "d/X.app/Contents/MacOs"
                                                << "d/X.app/Contents/";
    QTest::newRow("below the bundle's folder") << "e/X.app/Contents/MacOS/sub/deep"
                                               << "e/";
    QTest::newRow("a longer name begins so too") << "f/X.app/Contents/MacOSX"
                                                 << "f/";
    QTest::newRow("a longer name before is not a bundle") << "g/X.app/MyContents/MacOS"
                                                          << "g/X.app/MyContents/";
    QTest::newRow("only half of it") << "h/X.app/Contents/Resources"
                                     << "h/X.app/Contents/";
    QTest::newRow("bundle right below the top") << "Y.app/Contents/MacOS"
                                                << "";
    QTest::newRow("bundle without the ending") << "i/Some/Contents/MacOS"
                                               << "i/";
    QTest::newRow("blanks and letters beyond ASCII")
        << QString::fromUtf8("my \xC3\xB6 apps/An App.app/Contents/MacOS")
        << QString::fromUtf8("my \xC3\xB6 apps/");
}

void tst_AppPaths::rootRule()
{
    QFETCH(QString, folder);
    QFETCH(QString, root);
    QVERIFY(CopyProgram(FRAME_PROBE, Top() + folder, "a program"));

    const ProgramResult result = RunProgram(Top() + folder + "/a program", {"root"}, Environment());
    QVERIFY(result.finished);
    const QJsonObject found = Parsed(result);
    QCOMPARE(found.size(), 7);
    for (QString const& operation : found.keys())
        QCOMPARE(operation + ": " + found.value(operation).toString(),
                 operation + ": " + Top() + root);
}

void tst_AppPaths::locations_data()
{
    QTest::addColumn<QByteArray>("userFolders");
    QTest::addColumn<QString>("documents");

    QTest::newRow("the usual folder") << QByteArray() << "home/Documents/";
    QTest::newRow("moved by the user")
        << QByteArray("XDG_DOCUMENTS_DIR=\"$HOME/Papers\"\n") << "home/Papers/";
}

void tst_AppPaths::locations()
{
#ifndef Q_OS_LINUX
    QSKIP("the environment names these folders on Linux only");
#endif
    QFETCH(QByteArray, userFolders);
    QFETCH(QString, documents);
    const QProcessEnvironment environment = Environment();
    const QString userFile = Top() + "config/user-dirs.dirs";
    if (!userFolders.isEmpty())
        QVERIFY(TestFiles::write(userFile, userFolders));

    const ProgramResult result = RunProgram(m_probe, {"identity"}, environment);
    QFile::remove(userFile);
    QVERIFY(result.finished);
    const QJsonObject found = Parsed(result);
    QCOMPARE(found.value("RootPath").toString(), Top() + "tool/");
    QCOMPARE(found.value("DataPath").toString(),
             m_tree.path() + "/data/yourorganization/yourproduct/");
    QCOMPARE(found.value("DocPath").toString(), m_tree.path() + "/" + documents);
}

void tst_AppPaths::identity_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<QString>("organization");
    QTest::addColumn<QString>("product");

    const QString org("yourorganization");
    const QString prod("yourproduct");
    const QByteArray o("<arg key=\"organization\">O</arg>\n");
    const QByteArray p("<arg key=\"product\">P</arg>\n");

    QTest::newRow("both") << o + p << "O"
                          << "P";
    QTest::newRow("organization only") << o << "O" << prod;
    QTest::newRow("product only") << p << org << "P";
    QTest::newRow("empty file") << QByteArray("") << org << prod;
    QTest::newRow("declaration only") << QByteArray("<?xml version=\"1.0\"?>\n") << org << prod;
    QTest::newRow("comment only") << QByteArray("<!-- nothing -->") << org << prod;
    QTest::newRow("wrapped in a root") << "<options>" + o + p + "</options>" << org << prod;
    QTest::newRow("key is the second attribute")
        << QByteArray("<arg id=\"1\" key=\"product\">P</arg>") << org << prod;
    QTest::newRow("letter case differs: neither is used")
        << p + "<arg key=\"Organization\">O</arg>" << org << prod;
    QTest::newRow("unknown key last: neither is used")
        << o + p + "<arg key=\"colour\">red</arg>" << org << prod;
    QTest::newRow("unknown key first: neither is used")
        << "<arg key=\"colour\">red</arg>" + o + p << org << prod;
    QTest::newRow("malformed: neither is used") << o + p + "<" << org << prod;
    QTest::newRow("another element after the first arg") << o + "<name key=\"product\">P</name>"
                                                         << "O"
                                                         << "P";
    QTest::newRow("the later of two wins") << p + "<arg key=\"product\">Q</arg>" << org << "Q";
    QTest::newRow("empty organization") << "<arg key=\"organization\"/>" + p << ""
                                        << "P";
    QTest::newRow("blanks are kept")
        << QByteArray("<arg key=\"organization\"> O </arg>") << " O " << prod;
    QTest::newRow("line breaks are kept")
        << QByteArray("<arg key=\"organization\">\nO\n</arg>") << "\nO\n"
        << prod;
    QTest::newRow("ampersand") << QByteArray("<arg key=\"product\">P&amp;Q</arg>") << org << "P&Q";
    QTest::newRow("letters beyond ASCII")
        << QByteArray("<arg key=\"product\">Ger\xC3\xA4t \xE2\x82\xAC</arg>") << org
        << QString::fromUtf8("Ger\xC3\xA4t \xE2\x82\xAC");
    QTest::newRow("150 kB of opened elements")
        << o + QByteArray("<a>").repeated(50000) << org << prod;
    QTest::newRow("opened elements after an instruction that looks like a comment")
        << o + "<?><!--?>" + QByteArray("<a>").repeated(50000) << org << prod;
    QTest::newRow("10 MB of opened elements")
        << o + QByteArray("<a>").repeated(10 * 1000 * 1000 / 3) << org << prod;
}

void tst_AppPaths::identity()
{
    QFETCH(QByteArray, file);
    QVERIFY(TestFiles::write(m_dataFile, file));

    const ProgramResult result = RunProgram(m_probe, {"identity"}, Environment());
    QVERIFY2(result.finished && result.exitCode == 0, "the program did not end normally");
    const QJsonObject found = Parsed(result);
    QTEST(found.value("organization").toString(), "organization");
    QTEST(found.value("product").toString(), "product");
    QCOMPARE(TestFiles::read(m_dataFile), file);
}

void tst_AppPaths::identityWithoutFile()
{
    const ProgramResult result = RunProgram(m_probe, {"identity"}, Environment());
    QVERIFY(result.finished);
    const QJsonObject found = Parsed(result);
    QCOMPARE(found.value("organization").toString(), QString("yourorganization"));
    QCOMPARE(found.value("product").toString(), QString("yourproduct"));
    QCOMPARE(result.errors, QByteArray());
    QVERIFY(!QFile::exists(m_dataFile));
}

void tst_AppPaths::identityWithFolderInItsPlace()
{
    QVERIFY(QDir().mkpath(m_dataFile));
    const ProgramResult result = RunProgram(m_probe, {"identity"}, Environment());
    QVERIFY(QDir().rmdir(m_dataFile));
    QVERIFY(result.finished);
    QCOMPARE(Parsed(result).value("organization").toString(), QString("yourorganization"));
    QCOMPARE(Parsed(result).value("product").toString(), QString("yourproduct"));
}

void tst_AppPaths::identityOfUnreadableFile()
{
#ifdef Q_OS_UNIX
    QString program = m_probe;
    QStringList arguments{"identity"};
    if (geteuid() == 0) {
        // Nothing is unreadable to the superuser.
        program = QStandardPaths::findExecutable("setpriv");
        if (program.isEmpty())
            QSKIP("running as root, and there is no setpriv to run as another user");
        arguments =
            QStringList{"--reuid=65534", "--regid=65534", "--clear-groups", m_probe, "identity"};
        QVERIFY(QFile::setPermissions(m_tree.path(), QFile::permissions(m_tree.path()) |
                                                         QFile::ReadOther | QFile::ExeOther));
    }
    QVERIFY(TestFiles::write(m_dataFile, "<arg key=\"product\">P</arg>"));
    QVERIFY(QFile::setPermissions(m_dataFile, QFile::Permissions()));

    const ProgramResult result = RunProgram(program, arguments, Environment());
    QVERIFY2(result.finished && result.exitCode == 0, result.errors.constData());
    QCOMPARE(Parsed(result).value("product").toString(), QString("yourproduct"));
#else
    QSKIP("needs file permissions");
#endif
}

void tst_AppPaths::identityInABundle()
{
    const QString folder = Top() + "bundle/Some.app/Contents/MacOS";
    QVERIFY(CopyProgram(FRAME_PROBE, folder, "probe"));
    QVERIFY(TestFiles::write(Top() + "bundle/appdata.cfg", "<arg key=\"product\">Bundled</arg>"));

    const ProgramResult result = RunProgram(folder + "/probe", {"identity"}, Environment());
    QVERIFY(result.finished);
    QCOMPARE(Parsed(result).value("product").toString(), QString("Bundled"));
    QCOMPARE(Parsed(result).value("RootPath").toString(), Top() + "bundle/");
}

// Neither the program's own folder nor the working directory is the root.
void tst_AppPaths::identityReadsTheRootOnly()
{
    const QString beside = Top() + "tool/bin/appdata.cfg";
    QVERIFY(TestFiles::write(beside, "<arg key=\"product\">Beside</arg>"));
    const QString before = QDir::currentPath();
    QVERIFY(QDir::setCurrent(Top() + "tool/bin"));
    const ProgramResult result = RunProgram(m_probe, {"identity"}, Environment());
    QVERIFY(QDir::setCurrent(before));
    QVERIFY(QFile::remove(beside));

    QVERIFY(result.finished);
    QCOMPARE(Parsed(result).value("product").toString(), QString("yourproduct"));
}

// Qt then knows no program folder, so the root is "/".
void tst_AppPaths::withoutApplicationObject()
{
    if (QFile::exists("/appdata.cfg"))
        QSKIP("there is launch data in the root of the file system");
    const ProgramResult result = RunProgram(m_probe, {"bare"}, Environment());
    QVERIFY2(result.finished && result.exitCode == 0, result.errors.constData());
    const QJsonObject found = Parsed(result);

    const QJsonObject roots = found.value("roots").toObject();
    QCOMPARE(roots.size(), 6);
    for (QString const& operation : roots.keys())
        QCOMPARE(operation + ": " + roots.value(operation).toString(), operation + ": /");

    QCOMPARE(found.value("defaults").toObject(),
             QJsonObject({{"organization", "yourorganization"}, {"product", "yourproduct"}}));
    QCOMPARE(found.value("paths").toObject(),
             QJsonObject({{"organization", "First Org"}, {"product", "First Product"}}));
    QCOMPARE(found.value("utils").toObject(),
             QJsonObject({{"organization", "Second Org"}, {"product", "Second Product"}}));
#ifdef Q_OS_LINUX
    QCOMPARE(found.value("data").toString(), m_tree.path() + "/data/First Org/First Product/");
    QCOMPARE(found.value("utilsData").toString(),
             m_tree.path() + "/data/Second Org/Second Product/");
    QCOMPARE(found.value("documents").toString(), m_tree.path() + "/home/Documents/");
    QCOMPARE(found.value("utilsDocuments").toString(), m_tree.path() + "/home/Documents/");
#endif
    QCOMPARE(found.value("laterProperties").toInt(), 0);
}

QTEST_GUILESS_MAIN(tst_AppPaths)
#include "tst_AppPaths.moc"
