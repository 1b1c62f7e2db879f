// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/history/ProgramLogs.h"

#include "app/history/LogFormats.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QtTest>

#ifdef Q_OS_UNIX
#include <sys/stat.h>
#endif

using namespace Velocor;

namespace {

QStringList NamesOf(QList<ProgramLog> const& logs)
{
    QStringList names;
    for (ProgramLog const& log : logs)
        names.append(log.name);
    return names;
}

} // namespace

class tst_ProgramLogs : public QObject
{
    Q_OBJECT

private slots:
    void programLogs();
    void formats_data();
    void formats();
    void elapsedPrefix();
#ifdef Q_OS_UNIX
    void pipeForSettings();
#endif
};

void tst_ProgramLogs::programLogs()
{
    const QTemporaryDir folder;
    for (char const* name : {"Notes/logs/notes.log", "Notes/logs/notes.log.1", "Notes/notes.cfg",
                             "Notes/logs/logsettings.cfg", "Mail/logs/mail.log",
                             "Mail/logs/sync.log.2", "Empty/data.txt", "top.log"})
        QVERIFY(TestFiles::write(folder.filePath(name), "x"));
    const QList<ProgramLog> logs = ProgramLogs::In(folder.path());
    QCOMPARE(NamesOf(logs), QStringList({"Mail/mail", "Mail/sync", "Notes"}));
    QCOMPARE(logs[1].path, folder.filePath("Mail/logs/sync.log"));
    QCOMPARE(NamesOf(ProgramLogs::Named("mail", logs)), QStringList({"Mail/mail", "Mail/sync"}));
    QCOMPARE(NamesOf(ProgramLogs::Named("mail/Sync", logs)), QStringList("Mail/sync"));
    QCOMPARE(NamesOf(ProgramLogs::Named("ma", logs)), QStringList());
    QCOMPARE(ProgramLogs::NameOf(logs[2].path + ".1"), QString("Notes"));
    QCOMPARE(ProgramLogs::NameOf(folder.filePath("top.log.3")), QString("top.log"));
    QCOMPARE(NamesOf(ProgramLogs::In(folder.filePath("none"))), QStringList());
}

void tst_ProgramLogs::formats_data()
{
    QTest::addColumn<QByteArray>("settings");
    QTest::addColumn<bool>("isTimed");
    QTest::newRow("from the settings file")
        << QByteArray("<LogSettings>\n<config>\n<dateTimeFormat><![CDATA[dd/MM/yyyy hh:mm]]>"
                      "</dateTimeFormat>\n</config>\n</LogSettings>\n")
        << true;
    const QByteArray start("<LogSettings><config><dateTimeFormat>dd/MM/yyyy hh:mm</dateTimeFormat>"
                           "<x>");
    const QByteArray end("</x></config></LogSettings>");
    const QByteArray filling((1 << 20) - start.size() - end.size(), 'x');
    QTest::newRow("as large as it may be") << start + filling + end << true;
    QTest::newRow("too large") << start + filling + 'x' + end << false;
    QTest::newRow("no settings file") << QByteArray() << false;
    QTest::newRow("damaged") << QByteArray("<LogSettings><config><dateTimeFormat") << false;
}

void tst_ProgramLogs::formats()
{
    QFETCH(QByteArray, settings);
    QFETCH(bool, isTimed);
    const QTemporaryDir folder;
    if (!settings.isEmpty())
        QVERIFY(TestFiles::write(folder.filePath("logsettings.cfg"), settings));
    const LogLineParser parser = LogFormats::ParserFor(folder.filePath("a.log"));
    const QByteArray line = "03/03/2025 09:00 Trace x";
    QCOMPARE(parser.Find(line.constData(), line.size()).timeKey >= 0, isTimed);
    const QByteArray usual = "2025-03-03 09:02:11.031 Trace pages 3";
    QVERIFY(parser.Find(usual.constData(), usual.size()).timeKey >= 0);
}

void tst_ProgramLogs::elapsedPrefix()
{
    const QTemporaryDir folder;
    QVERIFY(TestFiles::write(folder.filePath("logsettings.cfg"),
                             "<LogSettings><config><elapsedTimePrefix>took:"
                             "</elapsedTimePrefix></config></LogSettings>"));
    const LogLineParser parser = LogFormats::ParserFor(folder.filePath("a.log"));
    const QByteArray line = "2025-03-03 09:02:11.031 Trace took:[12] x";
    QVERIFY(parser.Find(line.constData(), line.size()).elapsedLength > 0);
    const LogLineParser other = LogFormats::ParserFor(folder.filePath("none/a.log"));
    QCOMPARE(other.Find(line.constData(), line.size()).elapsedLength, 0);
}

#ifdef Q_OS_UNIX
// Opening it would wait for somebody who writes.
void tst_ProgramLogs::pipeForSettings()
{
    const QTemporaryDir folder;
    const QByteArray pipe = QFile::encodeName(folder.filePath("logsettings.cfg"));
    QCOMPARE(::mkfifo(pipe.constData(), 0666), 0);
    const LogLineParser parser = LogFormats::ParserFor(folder.filePath("a.log"));
    const QByteArray usual = "2025-03-03 09:02:11.031 Trace pages 3";
    QVERIFY(parser.Find(usual.constData(), usual.size()).timeKey >= 0);
}
#endif

QTEST_GUILESS_MAIN(tst_ProgramLogs)
#include "tst_ProgramLogs.moc"
