// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "ProgramRuns.h"

#include "app/AppUtils.h"

#include <QFileInfo>
#include <QJsonDocument>
#include <QJsonObject>
#include <QStandardPaths>
#include <QTemporaryDir>
#include <QTest>

namespace {

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

} // namespace

// None of these operations publishes anything: cleanup() checks for properties after every row.
class tst_AppUtilsPaths : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void setupRootPath_data();
    void setupRootPath();
    void setupProgramPath_data();
    void setupProgramPath();
    void setupDataRootPath_data();
    void setupDataRootPath();
    void setupDocumentPath_data();
    void setupDocumentPath();
    void setNames_data();
    void setNames();
    void setNamesInOrder();
    void setupPaths_data();
    void setupPaths();
    void rootRule_data();
    void rootRule();
    void nothingIsCreated();
};

void tst_AppUtilsPaths::init()
{
    QCoreApplication::setOrganizationName("Start Org");
    QCoreApplication::setApplicationName("Start Product");
}

void tst_AppUtilsPaths::cleanup()
{
    QCOMPARE(QCoreApplication::instance()->dynamicPropertyNames(), QList<QByteArray>());
}

void tst_AppUtilsPaths::setupRootPath_data()
{
    QTest::addColumn<QString>("input");
    QTest::addColumn<QString>("output");

    QTest::newRow("empty") << "" << OwnRoot();
    QTest::newRow("null") << QString() << OwnRoot();
    QTest::newRow("not empty: kept") << "/kept"
                                     << "/kept";
    QTest::newRow("a space is not empty") << " "
                                          << " ";
}

void tst_AppUtilsPaths::setupRootPath()
{
    QFETCH(QString, input);
    AppUtils::SetupRootPath(input);
    QTEST(input, "output");
}

// Unlike the publishing operation of the same name, this one keeps what is there.
void tst_AppUtilsPaths::setupProgramPath_data()
{
    setupRootPath_data();
}

void tst_AppUtilsPaths::setupProgramPath()
{
    QFETCH(QString, input);
    AppUtils::SetupProgramPath(input);
    QTEST(input, "output");
}

void tst_AppUtilsPaths::setupDataRootPath_data()
{
    QTest::addColumn<QString>("input");

    QTest::newRow("empty") << "";
    QTest::newRow("null") << QString();
    QTest::newRow("not empty: overwritten") << "/overwritten/";
}

void tst_AppUtilsPaths::setupDataRootPath()
{
    QFETCH(QString, input);
    AppUtils::SetupDataRootPath(input);
    QCOMPARE(input, DataLocation());
}

void tst_AppUtilsPaths::setupDocumentPath_data()
{
    setupDataRootPath_data();
}

void tst_AppUtilsPaths::setupDocumentPath()
{
    QFETCH(QString, input);
    AppUtils::SetupDocumentPath(input);
    QCOMPARE(input, DocumentsLocation());
}

void tst_AppUtilsPaths::setNames_data()
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

void tst_AppUtilsPaths::setNames()
{
    QFETCH(QString, organization);
    QFETCH(QString, product);
    AppUtils::SetOrganizationAndProduct(organization, product);
    QCOMPARE(QCoreApplication::organizationName(), organization);
    QCOMPARE(QCoreApplication::applicationName(), product);
}

void tst_AppUtilsPaths::setNamesInOrder()
{
    QStringList changes;
    QObject context;
    connect(QCoreApplication::instance(), &QCoreApplication::organizationNameChanged, &context,
            [&changes] { changes.append("organization"); });
    connect(QCoreApplication::instance(), &QCoreApplication::applicationNameChanged, &context,
            [&changes] { changes.append("product"); });
    AppUtils::SetOrganizationAndProduct("Org", "Product");
    QCOMPARE(changes, QStringList({"organization", "product"}));
}

void tst_AppUtilsPaths::setupPaths_data()
{
    QTest::addColumn<QString>("root");
    QTest::addColumn<QString>("data");
    QTest::addColumn<QString>("expectedRoot");

    QTest::newRow("both empty") << ""
                                << "" << OwnRoot();
    QTest::newRow("root kept, data overwritten") << "/kept"
                                                 << "/overwritten"
                                                 << "/kept";
    QTest::newRow("data overwritten") << ""
                                      << "/overwritten" << OwnRoot();
}

void tst_AppUtilsPaths::setupPaths()
{
    QFETCH(QString, root);
    QFETCH(QString, data);
    const QString before = DataLocation();
    AppUtils::SetupPaths("New Org", "New Product", root, data);
    QCOMPARE(QCoreApplication::organizationName(), QString("New Org"));
    QCOMPARE(QCoreApplication::applicationName(), QString("New Product"));
    QTEST(root, "expectedRoot");
    QCOMPARE(data, DataLocation());
    QVERIFY(data != before);
}

void tst_AppUtilsPaths::rootRule_data()
{
    QTest::addColumn<QString>("folder");
    QTest::addColumn<QString>("root");

    QTest::newRow("outside a bundle") << "opt/tool/bin"
                                      << "opt/tool/";
    QTest::newRow("in a bundle") << "Applications/Some.app/Contents/MacOS"
                                 << "Applications/";
    QTest::newRow("bundle in a bundle") << "a/X.app/Contents/MacOS/b/Y.app/Contents/MacOS"
                                        << "a/X.app/Contents/MacOS/b/";
    QTest::newRow("lower case is no bundle") << "c/X.app/contents/macos"
                                             << "c/X.app/contents/";
}

// All six operations are called, including those that publish: they share one rule.
void tst_AppUtilsPaths::rootRule()
{
    QFETCH(QString, folder);
    QFETCH(QString, root);
    const QTemporaryDir tree;
    const QString top = QFileInfo(tree.path()).canonicalFilePath() + "/";
    QVERIFY(CopyProgram(FRAME_PROBE, top + folder, "probe"));

    const ProgramResult result =
        RunProgram(top + folder + "/probe", {"root"}, PrivateEnvironment(tree.path()));
    QVERIFY(result.finished);
    const QJsonObject found = QJsonDocument::fromJson(result.output).object();
    for (char const* operation : {"SetupRootPath", "SetupProgramPath", "SetupPaths"})
        QCOMPARE(found.value(QString("AppUtils::") + operation).toString(), top + root);
}

void tst_AppUtilsPaths::nothingIsCreated()
{
    QString root;
    QString data;
    QString documents;
    AppUtils::SetupPaths("Never Seen", "Never Seen Before", root, data);
    AppUtils::SetupDocumentPath(documents);
    QVERIFY(!QFile::exists(data));
    QVERIFY(!QFile::exists(documents));
}

QTEST_GUILESS_MAIN(tst_AppUtilsPaths)
#include "tst_AppUtilsPaths.moc"
