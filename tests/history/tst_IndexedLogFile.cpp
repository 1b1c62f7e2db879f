// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/IndexedLogFile.h"

#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

using namespace Velocor;

namespace {

const auto GoesOn = [] {
    return true;
};

LogFilter Text(QString const& text)
{
    LogFilter filter;
    filter.SetText(text, false, true);
    return filter;
}

// Lines that end with their numbers; longer together than what is read at a time.
QByteArray ManyLines(int count)
{
    QByteArray lines;
    for (int i = 0; i < count; ++i)
        lines += QByteArray(90, 'x') + " line " + QByteArray::number(i) + '\n';
    return lines;
}

} // namespace

class tst_IndexedLogFile : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void rows_data();
    void rows();
    void searchesAgain();
    void searchesWhatIsLeft();
    void searchesPiecesThatAreLeft();
    void readsWhatIsLeft();
    void stops();
    void isUnchanged_data();
    void isUnchanged();
    void identities();
    void noFile();

private:
    QStringList shown(IndexedLogFile const& file) const;
    void join(IndexedLogFile const& file, OlderLogFiles& files) const;

    QTemporaryDir m_folder;
    QString m_path;
};

void tst_IndexedLogFile::initTestCase()
{
    m_path = m_folder.filePath("a.log.1");
}

// The numbers of the lines that are shown.
QStringList tst_IndexedLogFile::shown(IndexedLogFile const& file) const
{
    QStringList lines;
    for (size_t row = 0; row < file.rows().size(); ++row)
        lines.append(file.rows().isHeading(row) ? "|" : QString::number(file.rows().line(row)));
    return lines;
}

// The file after another one.
void tst_IndexedLogFile::join(IndexedLogFile const& file, OlderLogFiles& files) const
{
    const QString before = m_folder.filePath("a.log.2");
    TestFiles::write(before, "line 7\n");
    auto opened = std::make_shared<QFile>(before);
    opened->open(QIODevice::ReadOnly);
    files.Add(before, opened, 7, "");
    files.Add(file.path(), file.file(), file.size(), file.Separator());
}

void tst_IndexedLogFile::rows_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<int>("lines");
    QTest::addColumn<QByteArray>("separator");
    QTest::newRow("empty") << QByteArray() << 0 << QByteArray();
    QTest::newRow("one byte") << QByteArray("x") << 1 << QByteArray("\n");
    QTest::newRow("whole lines") << QByteArray("a\nb\n") << 2 << QByteArray();
    QTest::newRow("without the last line end") << QByteArray("a\nb") << 2 << QByteArray("\n");
    QTest::newRow("more than is read at a time") << ManyLines(3000) << 3000 << QByteArray();
    QTest::newRow("a byte more than is read at a time")
        << QByteArray(1 << 17, 'x') + 'y' << 1 << QByteArray("\n");
}

void tst_IndexedLogFile::rows()
{
    QFETCH(QByteArray, content);
    QVERIFY(TestFiles::write(m_path, content));
    IndexedLogFile file;
    QVERIFY(file.Open(m_path));
    QVERIFY(file.Read(LogLineParser(), LogFilter(), GoesOn));
    QCOMPARE(file.size(), qint64(content.size()));
    QCOMPARE(file.path(), m_path);
    QTEST(int(file.index().size()), "lines");
    QTEST(file.Separator(), "separator");
    QCOMPARE(file.rows().size(), file.index().size());
}

void tst_IndexedLogFile::searchesAgain()
{
    QVERIFY(TestFiles::write(m_path, ManyLines(3000)));
    IndexedLogFile file;
    QVERIFY(file.Open(m_path));
    QVERIFY(file.Read(LogLineParser(), Text("line 1000"), GoesOn));
    QCOMPARE(shown(file), QStringList("1000"));
    OlderLogFiles files;
    join(file, files);
    QVERIFY(file.Search(files, files.start(1), Text("line 7\n"), GoesOn));
    QCOMPARE(shown(file), QStringList());
    QVERIFY(file.Search(files, files.start(1), Text("line 29"), GoesOn));
    QCOMPARE(shown(file).size(), 111);
    QCOMPARE(shown(file).last(), QString("2999"));
    QVERIFY(file.Search(files, files.start(1), Text("line 0"), GoesOn));
    QCOMPARE(shown(file), QStringList("0"));
}

// A file may have been shortened meanwhile.
void tst_IndexedLogFile::searchesWhatIsLeft()
{
    QVERIFY(TestFiles::write(m_path, "line a\nline b\nline c\n"));
    IndexedLogFile file;
    QVERIFY(file.Open(m_path));
    QVERIFY(file.Read(LogLineParser(), Text("line"), GoesOn));
    OlderLogFiles files;
    join(file, files);
    QVERIFY(QFile::resize(m_path, 9));
    QVERIFY(file.Search(files, files.start(1), Text("line"), GoesOn));
    QCOMPARE(shown(file), QStringList("0"));
    QVERIFY(QFile::resize(m_path, 0));
    QVERIFY(file.Search(files, files.start(1), Text("\001"), GoesOn));
    QCOMPARE(shown(file), QStringList());
}

// What was there in an earlier piece is not in a later one.
void tst_IndexedLogFile::searchesPiecesThatAreLeft()
{
    QVERIFY(TestFiles::write(m_path, ManyLines(3000)));
    IndexedLogFile file;
    QVERIFY(file.Open(m_path));
    QVERIFY(file.Read(LogLineParser(), LogFilter(), GoesOn));
    OlderLogFiles files;
    join(file, files);
    QVERIFY(QFile::resize(m_path, ManyLines(100).size()));
    QVERIFY(file.Search(files, files.start(1), Text("line"), GoesOn));
    QCOMPARE(shown(file).size(), 100);
}

void tst_IndexedLogFile::readsWhatIsLeft()
{
    QVERIFY(TestFiles::write(m_path, "line a\nline b\nline c\n"));
    IndexedLogFile file;
    QVERIFY(file.Open(m_path));
    QVERIFY(QFile::resize(m_path, 9));
    QVERIFY(file.Read(LogLineParser(), LogFilter(), GoesOn));
    QCOMPARE(file.size(), qint64(9));
    QCOMPARE(file.index().size(), size_t(2));
}

void tst_IndexedLogFile::stops()
{
    QVERIFY(TestFiles::write(m_path, ManyLines(3000)));
    IndexedLogFile file;
    QVERIFY(file.Open(m_path));
    int calls = 0;
    const auto once = [&calls] {
        ++calls;
        return false;
    };
    QVERIFY(!file.Read(LogLineParser(), LogFilter(), once));
    QCOMPARE(calls, 1);
    QVERIFY(file.Read(LogLineParser(), LogFilter(), GoesOn));
    OlderLogFiles files;
    join(file, files);
    QVERIFY(!file.Search(files, files.start(1), Text("line"), once));
    QVERIFY(file.Search(files, files.start(1), Text("line 5"), GoesOn));
    QCOMPARE(shown(file).first(), QString("5"));
}

void tst_IndexedLogFile::isUnchanged_data()
{
    QTest::addColumn<QString>("change");
    QTest::addColumn<bool>("expected");
    QTest::newRow("nothing") << "" << true;
    QTest::newRow("longer") << "longer" << false;
    QTest::newRow("written over") << "time" << false;
    QTest::newRow("replaced by a copy") << "copy" << false;
    QTest::newRow("renamed") << "rename" << false;
}

void tst_IndexedLogFile::isUnchanged()
{
    QFETCH(QString, change);
    const QDateTime time = QDateTime::currentDateTime().addSecs(-100);
    const auto setTime = [](QString const& path, QDateTime const& modified) {
        QFile file(path);
        return file.open(QIODevice::ReadWrite) &&
               file.setFileTime(modified, QFileDevice::FileModificationTime);
    };
    const QString old = m_folder.filePath("old");
    QVERIFY(TestFiles::write(m_path, "a\n"));
    QVERIFY(setTime(m_path, time));
    IndexedLogFile file;
    QVERIFY(file.Open(m_path));
    QVERIFY(file.Read(LogLineParser(), LogFilter(), GoesOn));
    if (change == "longer")
        QVERIFY(QFile::resize(m_path, 3) && setTime(m_path, time));
    else if (change == "time")
        QVERIFY(setTime(m_path, time.addSecs(2)));
    else if (change == "copy")
        QVERIFY(QFile::rename(m_path, old) && QFile::copy(old, m_path) && setTime(m_path, time));
    else if (change == "rename")
        QVERIFY(QFile::rename(m_path, old));
    QTEST(file.IsUnchanged(), "expected");
    QFile::remove(old);
}

void tst_IndexedLogFile::identities()
{
    const QString other = m_folder.filePath("other");
    const QString link = m_folder.filePath("link");
    QVERIFY(TestFiles::write(m_path, "a"));
    QVERIFY(TestFiles::write(other, "a"));
    QVERIFY(QFile::link(other, link));
    QCOMPARE(IndexedLogFile::IdentityOf(link), IndexedLogFile::IdentityOf(other));
    QVERIFY(IndexedLogFile::IdentityOf(m_path) != IndexedLogFile::IdentityOf(other));
    QVERIFY(IndexedLogFile::IdentityOf(other) != 0);
    QCOMPARE(IndexedLogFile::IdentityOf(m_folder.filePath("none")), quint64(0));
}

void tst_IndexedLogFile::noFile()
{
    IndexedLogFile file;
    QVERIFY(!file.Open(m_folder.filePath("none")));
    QVERIFY(!file.Open(m_folder.path()));
}

QTEST_GUILESS_MAIN(tst_IndexedLogFile)
#include "tst_IndexedLogFile.moc"
