// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The bytes of settings files as text and back, and how bytes are saved.

#include "app/settingsfile/SettingsFileWriter.h"
#include "app/settingsfile/SettingsText.h"
#include "support/ProcessLimits.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#include <sys/stat.h>
#include <unistd.h>

#include <random>

using namespace Velocor;

class tst_SettingsText : public QObject
{
    Q_OBJECT

private slots:
    void textOfBytes_data();
    void textOfBytes();
    void anyBytesComeBack();
    void firstLineBreak();
    void unwritable_data();
    void unwritable();
    void saveKeepsTheRights_data();
    void saveKeepsTheRights();
    void saveFollowsALink();
    void saveReplacesOwnFiles();
    void fullDiskOfAnotherUsersFile_data();
    void fullDiskOfAnotherUsersFile();
    void savesOnlyToFiles();
};

void tst_SettingsText::textOfBytes_data()
{
    QTest::addColumn<QByteArray>("bytes");
    QTest::addColumn<QString>("text");
    QTest::newRow("ASCII") << QByteArray("<a>\n") << "<a>\n";
    QTest::newRow("UTF-8") << QByteArray("\xC3\xA4") << QString(QChar(0xe4));
    QTest::newRow("Latin-1") << QByteArray("\xE4") << QString(QChar(0xe4));
    QTest::newRow("byte order mark") << QByteArray("\xEF\xBB\xBF<a>") << "<a>";
    QTest::newRow("carriage returns") << QByteArray("a\r\nb\r\n") << "a\nb\n";
    QTest::newRow("one carriage return") << QByteArray("a\r\n") << "a\n";
    QTest::newRow("mixed line breaks") << QByteArray("a\r\nb\n") << "a\r\nb\n";
    QTest::newRow("nothing") << QByteArray() << "";
}

void tst_SettingsText::textOfBytes()
{
    QFETCH(QByteArray, bytes);
    QFETCH(QString, text);
    const SettingsText file = SettingsText::Of(bytes);
    QCOMPARE(file.text, text);
    QCOMPARE(file.ToBytes(file.text), bytes);
}

void tst_SettingsText::anyBytesComeBack()
{
    const QList<QByteArray> pieces{"a",
                                   "\r\n",
                                   "\n",
                                   "\r",
                                   "\xC3\xA4",
                                   "\xE4",
                                   "\xEF\xBB\xBF",
                                   "\xF0\x9F\x98\x80",
                                   "\xED\xA0\x80",
                                   QByteArray(1, '\0')};
    std::mt19937 random(1);
    for (int round = 0; round < 20000; ++round) {
        QByteArray bytes;
        for (auto left = random() % 8; left > 0; --left)
            bytes += pieces.at(static_cast<int>(random() % static_cast<unsigned>(pieces.size())));
        const SettingsText file = SettingsText::Of(bytes);
        QCOMPARE(file.ToBytes(file.text), bytes);
        QCOMPARE(file.FirstUnwritable(file.text), -1);
    }
}

// A file without line breaks gets those of this system.
void tst_SettingsText::firstLineBreak()
{
    QCOMPARE(SettingsText::Of("a").ToBytes("a\nb"), QByteArray("a\nb"));
}

void tst_SettingsText::unwritable_data()
{
    QTest::addColumn<QByteArray>("file");
    QTest::addColumn<QString>("edited");
    QTest::addColumn<int>("position");
    const QString euro(QChar(0x20ac));
    QTest::newRow("in UTF-8, everything") << QByteArray("\xC3\xA4") << euro << -1;
    QTest::newRow("in UTF-8, half a character")
        << QByteArray() << "ab" + QString(QChar(0xd800)) << 2;
    QTest::newRow("in Latin-1, a letter of it") << QByteArray("\xE4") << QString(QChar(0xf6)) << -1;
    QTest::newRow("in Latin-1, another one") << QByteArray("\xE4") << "abc" + euro + 'd' << 3;
}

void tst_SettingsText::unwritable()
{
    QFETCH(QByteArray, file);
    QFETCH(QString, edited);
    QTEST(SettingsText::Of(file).FirstUnwritable(edited), "position");
}

void tst_SettingsText::saveKeepsTheRights_data()
{
    QTest::addColumn<unsigned>("owner");
    QTest::addColumn<unsigned>("group");
    QTest::newRow("own file") << geteuid() << getegid();
    QTest::newRow("another user's file") << 1234U << 1235U;
    QTest::newRow("another group's file") << geteuid() << 1235U;
    QTest::newRow("another user's file of the own group") << 1234U << getegid();
}

void tst_SettingsText::saveKeepsTheRights()
{
    QFETCH(unsigned, owner);
    QFETCH(unsigned, group);
    if ((owner != geteuid() || group != getegid()) && geteuid() != 0)
        QSKIP("only the administrator can give files away");
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, "a longer one"));
    const QByteArray name = QFile::encodeName(path);
    QCOMPARE(chown(name.constData(), owner, group), 0);
    QCOMPARE(chmod(name.constData(), 0640), 0);
    QString error;
    QVERIFY(SettingsFileWriter::SaveBytes(path, "new", &error));
    QCOMPARE(TestFiles::read(path), QByteArray("new"));
    struct stat status = {};
    QCOMPARE(stat(name.constData(), &status), 0);
    QCOMPARE(status.st_mode & 0777U, 0640U);
    QCOMPARE(status.st_uid, owner);
    QCOMPARE(status.st_gid, group);
}

void tst_SettingsText::saveFollowsALink()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    const QString link = folder.filePath("link");
    QVERIFY(TestFiles::write(path, "old"));
    QVERIFY(QFile::link(path, link));
    QString error;
    QVERIFY(SettingsFileWriter::SaveBytes(link, "new", &error));
    QVERIFY(QFileInfo(link).isSymLink());
    QCOMPARE(TestFiles::read(path), QByteArray("new"));
    QVERIFY(SettingsFileWriter::SaveBytes(folder.filePath("created"), "new", &error));
    QCOMPARE(TestFiles::read(folder.filePath("created")), QByteArray("new"));
}

// So that a program that reads it meanwhile has all of the old one. Another user's is written over,
// because a new file would not be theirs.
void tst_SettingsText::saveReplacesOwnFiles()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, "old"));
    QFile reader(path);
    QVERIFY(reader.open(QIODevice::ReadOnly));
    QString error;
    QVERIFY(SettingsFileWriter::SaveBytes(path, "new", &error));
    QCOMPARE(reader.readAll(), QByteArray("old"));
    QCOMPARE(TestFiles::read(path), QByteArray("new"));
}

void tst_SettingsText::fullDiskOfAnotherUsersFile_data()
{
    QTest::addColumn<int>("size");
    QTest::newRow("small file") << 1000;
    QTest::newRow("large file") << 1000000;
}

void tst_SettingsText::fullDiskOfAnotherUsersFile()
{
    QFETCH(int, size);
    if (geteuid() != 0)
        QSKIP("only the administrator can give files away");
    const QTemporaryDir folder;
    const QString path = folder.filePath("x.cfg");
    QVERIFY(TestFiles::write(path, "old"));
    QCOMPARE(chown(QFile::encodeName(path).constData(), 1234, 1235), 0);
    if (!ProcessLimits::limitFileSize(100))
        QSKIP("the size of files cannot be limited here");
    QString error;
    const bool isSaved = SettingsFileWriter::SaveBytes(path, QByteArray(size, 'x'), &error);
    ProcessLimits::unlimitFileSize();
    QVERIFY(!isSaved);
    QVERIFY(!error.isEmpty());
}

void tst_SettingsText::savesOnlyToFiles()
{
    const QTemporaryDir folder;
    const QString pipe = folder.filePath("pipe");
    QCOMPARE(mkfifo(QFile::encodeName(pipe).constData(), 0600), 0);
    QString error;
    QVERIFY(!SettingsFileWriter::SaveBytes(pipe, "x", &error)); // would wait for a reader
    QCOMPARE(error, QString("Not a regular file"));
    error.clear();
    QVERIFY(!SettingsFileWriter::SaveBytes(folder.filePath("none/x"), "x", &error));
    QVERIFY(!error.isEmpty());
}

QTEST_GUILESS_MAIN(tst_SettingsText)

#include "tst_SettingsText.moc"
