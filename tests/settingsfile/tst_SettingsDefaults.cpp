// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Where the defaults of a settings file are found, and what is read of them.

#include "app/settingsfile/SettingsDefaults.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <memory>

using namespace Velocor;

class tst_SettingsDefaults : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void found_data();
    void found();
    void nearestWins();
    void values_data();
    void values();

private:
    std::unique_ptr<QTemporaryDir> m_folder;
};

void tst_SettingsDefaults::init()
{
    m_folder = std::make_unique<QTemporaryDir>();
    qputenv("XDG_DATA_HOME", QFile::encodeName(m_folder->filePath("home")));
    qputenv("XDG_DATA_DIRS", QFile::encodeName(m_folder->filePath("local")) + ':' +
                                 QFile::encodeName(m_folder->filePath("system")) + ':' +
                                 QFile::encodeName(m_folder->filePath("deep/er")));
}

void tst_SettingsDefaults::found_data()
{
    QTest::addColumn<QString>("settings");
    QTest::addColumn<QString>("defaults");
    QTest::addColumn<bool>("isFound");

    const auto row = [](char const* name, char const* settings, char const* defaults, bool found) {
        QTest::newRow(name) << QString(settings) << QString(defaults) << found;
    };
    row("beside the file", "any/x.cfg", "any/x.defaults.cfg", true);
    row("of another file", "any/x.cfg", "any/y.defaults.cfg", false);
    row("without an ending", "any/x", "any/x.defaults", true);
    row("with two endings", "any/x.y.cfg", "any/x.y.defaults.cfg", true);
    row("another ending", "any/x.xml", "any/x.defaults.cfg", false);
    row("the user's in the data directory", "home/O/P/x.cfg", "home/O/P/x.defaults.cfg", true);
    row("installed by the administrator", "home/O/P/x.cfg", "local/O/P/x.defaults.cfg", true);
    row("installed by the system", "home/O/P/x.cfg", "system/O/P/x.defaults.cfg", true);
    row("of another product", "home/O/P/x.cfg", "system/O/Q/x.defaults.cfg", false);
    row("not from the data directory", "any/O/P/x.cfg", "system/O/P/x.defaults.cfg", false);
    row("not at the same place outside", "O/x.cfg", "deep/O/x.defaults.cfg", false);
    row("from a folder with a similar name", "home2/O/P/x.cfg", "system/O/P/x.defaults.cfg", false);
}

void tst_SettingsDefaults::found()
{
    QFETCH(QString, settings);
    QFETCH(QString, defaults);
    QFETCH(bool, isFound);
    QVERIFY(TestFiles::write(m_folder->filePath(settings), "x"));
    QVERIFY(TestFiles::write(m_folder->filePath(defaults), "x"));
    QVERIFY(QDir().mkpath(m_folder->filePath("deep/er")));
    QCOMPARE(SettingsDefaults::FileFor(m_folder->filePath(settings)),
             isFound ? m_folder->filePath(defaults) : QString());
}

void tst_SettingsDefaults::nearestWins()
{
    const QString settings = m_folder->filePath("home/O/P/x.cfg");
    for (char const* place : {"system", "local", "home"}) {
        const QString defaults = m_folder->filePath(QString(place) + "/O/P/x.defaults.cfg");
        QVERIFY(TestFiles::write(defaults, "x"));
        QCOMPARE(SettingsDefaults::FileFor(settings), defaults);
    }
}

void tst_SettingsDefaults::values_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("value");
    QTest::newRow("a settings file") << QByteArray("<r><s><k>1</k></s></r>") << "1";
    QTest::newRow("a malformed one") << QByteArray("<r><s><k>1</k>") << "";
    QTest::newRow("none") << QByteArray() << "";
}

void tst_SettingsDefaults::values()
{
    QFETCH(QByteArray, content);
    const QString path = m_folder->filePath("x.cfg");
    if (!content.isEmpty())
        QVERIFY(TestFiles::write(m_folder->filePath("x.defaults.cfg"), content));
    QTEST(SettingsDefaults::Of(path).value({"s", "k"}), "value");
}

QTEST_GUILESS_MAIN(tst_SettingsDefaults)

#include "tst_SettingsDefaults.moc"
