// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The only place from which the program starts another one: it shows folders in the desktop's file
// manager. Whatever they are called, their address arrives as one argument and no shell interprets
// it.

#include "app/window/PlacesPanel.h"
#include "reliability/Figures.h"
#include "support/TestFiles.h"

#include <QGuiApplication>
#include <QTemporaryDir>
#include <QUrl>
#include <QtTest>

using namespace Velocor;

class tst_ShownFolders : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void namesArriveAsOneArgument_data();
    void namesArriveAsOneArgument();
    void cleanupTestCase();

private:
    QTemporaryDir m_folder;
    QString m_opener;
    int m_arrived = 0;
};

// A program of our own is found where Qt looks, once, for the desktop's.
void tst_ShownFolders::initTestCase()
{
    if (QGuiApplication::platformName() != "xcb")
        QSKIP("Only a desktop has a file manager.");
    const QString bin = m_folder.path() + "/bin/";
    m_opener = bin + "xdg-open";
    QVERIFY(TestFiles::write(m_opener,
                             "#!/bin/sh\n"
                             "for argument; do printf '<%s>' \"$argument\"; done >\"$0.new\"\n"
                             "mv \"$0.new\" \"$0.arguments\"\n"));
    const QFile::Permissions own = QFile::ReadOwner | QFile::WriteOwner | QFile::ExeOwner;
    QVERIFY(QFile::setPermissions(m_opener, own));
    qputenv("PATH", QFile::encodeName(bin) + ':' + qgetenv("PATH"));

    // Anything that a shell creates would be created there.
    const QString work = m_folder.path() + "/work";
    QVERIFY(QDir().mkpath(work) && QDir::setCurrent(work));
}

void tst_ShownFolders::namesArriveAsOneArgument_data()
{
    QTest::addColumn<QString>("name");

    QTest::newRow("plain") << "logs";
    QTest::newRow("blanks") << "my logs of today";
    QTest::newRow("command in parentheses") << "$(touch made)";
    QTest::newRow("command in back quotes") << "`touch made`";
    QTest::newRow("second command") << "a; touch made";
    QTest::newRow("pipe") << "a | touch made";
    QTest::newRow("output") << "a > made";
    QTest::newRow("single quotation mark") << "a' ; touch made ; '";
    QTest::newRow("double quotation mark") << "a\" ; touch made ; \"";
    QTest::newRow("line feed") << "a\ntouch made\n";
    QTest::newRow("parts of an address") << "a?b#c%20d&e";
}

void tst_ShownFolders::namesArriveAsOneArgument()
{
    QFETCH(QString, name);
    const QTemporaryDir folder;
    const QString path = folder.path() + '/' + name;
    QVERIFY(QDir().mkpath(path));

    QVERIFY(PlacesPanel::OpenPlace(path));
    const QString arguments = m_opener + ".arguments";
    QVERIFY(QTest::qWaitFor([&] { return QFile::exists(arguments); }, 60000));
    QCOMPARE(TestFiles::read(arguments), '<' + QUrl::fromLocalFile(path).toEncoded() + '>');
    QVERIFY(QFile::remove(arguments));
    QCOMPARE(TestFiles::listing(QDir::currentPath()), QStringList());
    ++m_arrived;
}

void tst_ShownFolders::cleanupTestCase()
{
    Figures::print(
        QString("trust in names: %1 names with commands in them, each arrived at the file "
                "manager as one argument")
            .arg(m_arrived));
}

QTEST_MAIN(tst_ShownFolders)

#include "tst_ShownFolders.moc"
