// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Runs the built program the way its user does.

#include <QDir>
#include <QFile>
#include <QProcess>
#include <QTemporaryDir>
#include <QtTest>

class tst_Bookmarks : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void sample();
    void writtenBytes();
    void roundTrip_data();
    void roundTrip();
    void broken_data();
    void broken();
    void missingInput();
    void outputThatCannotBeWritten_data();
    void outputThatCannotBeWritten();
    void filesReadSoFar();
    void brokenSettingsAreLeft();
    void usage_data();
    void usage();

private:
    struct Result
    {
        int exitCode;
        QString output;
        QString errors;
    };

    QString settingsFile() const { return m_data->filePath("Tork/Bookmarks/bookmarks.cfg"); }
    Result run(QStringList const& arguments) const;
    QString written(QByteArray const& content) const;
    QByteArray read(QString const& path) const;

    QTemporaryDir m_folder;
    QScopedPointer<QTemporaryDir> m_data; // the program's data
};

void tst_Bookmarks::init()
{
    m_data.reset(new QTemporaryDir);
    QVERIFY2(m_data->isValid(), qPrintable(m_data->errorString()));
}

tst_Bookmarks::Result tst_Bookmarks::run(QStringList const& arguments) const
{
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert("HOME", m_data->path()); // for systems without the XDG folders
    environment.insert("XDG_DATA_HOME", m_data->path());
    QProcess process;
    process.setProcessEnvironment(environment);
    process.start(BOOKMARKS_PROGRAM, arguments);
    if (!process.waitForFinished(60000) || process.exitStatus() != QProcess::NormalExit)
        return {-1, QString(), process.errorString()};
    return {process.exitCode(), QString::fromUtf8(process.readAllStandardOutput()),
            QString::fromUtf8(process.readAllStandardError())};
}

QString tst_Bookmarks::written(QByteArray const& content) const
{
    const QString path = m_folder.filePath("in.xbel");
    QFile file(path);
    if (!file.open(QIODevice::WriteOnly) || file.write(content) != content.size())
        qFatal("%s: %s", qPrintable(path), qPrintable(file.errorString()));
    return path;
}

QByteArray tst_Bookmarks::read(QString const& path) const
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll()
                                          : "(" + file.errorString().toUtf8() + ")";
}

void tst_Bookmarks::sample()
{
    const Result result = run({BOOKMARKS_SAMPLE});
    QCOMPARE(result.errors, QString());
    QCOMPARE(result.exitCode, 0);
    QCOMPARE(
        result.output,
        QString::fromUtf8("Reading list/\n"
                          "  Standards/\n"
                          "    Extensible Markup Language (XML) 1.0 <https://www.w3.org/TR/xml/>\n"
                          "    Research & development/\n"
                          "      a < b <https://example.org/search?q=a&lang=en>\n"
                          "    Über Größen <https://example.org/%C3%BCber>\n"
                          "   <file:///usr/share/doc/>\n"));
}

void tst_Bookmarks::writtenBytes()
{
    const QString in = written("<xbel><title>A &amp; B</title><folder><title>F</title>"
                               "<bookmark href='x:1&amp;2'><title>\xc3\xa9]]&gt;</title></bookmark>"
                               "<bookmark href='x:3'/></folder></xbel>");
    const QString out = m_folder.filePath("out.xbel");
    QCOMPARE(run({in, "--write", out}).exitCode, 0);
    QCOMPARE(read(out), QByteArray("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n"
                                   "<!DOCTYPE xbel>\n"
                                   "<xbel  version=\"1.0\">\n"
                                   "  <title><![CDATA[A & B]]></title>\n"
                                   "  <folder>\n"
                                   "    <title>F</title>\n"
                                   "    <bookmark  href=\"x:1&amp;2\">\n"
                                   "      <title><![CDATA[\xc3\xa9]]]]><![CDATA[>]]></title>\n"
                                   "    </bookmark>\n"
                                   "    <bookmark  href=\"x:3\"/>\n"
                                   "  </folder>\n"
                                   "</xbel>\n"));
}

void tst_Bookmarks::roundTrip_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("tree");

    QTest::newRow("nothing in it") << QByteArray("<xbel/>") << "/\n";
    QTest::newRow("empty folder") << QByteArray("<xbel><folder/></xbel>") << "/\n  /\n";
    QTest::newRow("bookmark without a title")
        << QByteArray("<xbel><bookmark href=\"a\"/></xbel>") << "/\n   <a>\n";
    QTest::newRow("title in pieces")
        << QByteArray("<xbel><title>a&lt;<![CDATA[b]]>c</title></xbel>") << "a<bc/\n";
    QTest::newRow("end of a CDATA section in a title")
        << QByteArray("<xbel><title>a]]&gt;b]]&gt;</title></xbel>") << "a]]>b]]>/\n";
    QTest::newRow("title over several lines")
        << QByteArray("<xbel><title>\n  a\n  b\n</title></xbel>") << "a b/\n";
    QTest::newRow("quotes in an address")
        << QByteArray("<xbel><bookmark href='a\"b&apos;c'/></xbel>") << "/\n   <a\"b'c>\n";
    QTest::newRow("placeholder in an address")
        << QByteArray("<xbel><bookmark href='a%1%2'/></xbel>") << "/\n   <a%1%2>\n";
    QTest::newRow("address longer than a line")
        << "<xbel><bookmark href='" + QByteArray(200, 'x') + "'/></xbel>"
        << "/\n   <" + QString(200, 'x') + ">\n";
    QTest::newRow("other elements of the same names inside what is skipped")
        << QByteArray("<xbel><info><title>no</title><info/><bookmark href='no'/></info></xbel>")
        << "/\n";
    QTest::newRow("title with markup")
        << QByteArray("<xbel><title>a<b>no<title>no</title></b>c</title></xbel>") << "ac/\n";
    QTest::newRow("other encoding")
        << QByteArray("<?xml version='1.0' encoding='ISO-8859-1'?><xbel><title>\xe9</title></xbel>")
        << QString::fromUtf8("é/\n");
}

void tst_Bookmarks::roundTrip()
{
    QFETCH(QByteArray, content);
    QFETCH(QString, tree);

    const QString first = m_folder.filePath("first.xbel");
    const Result original = run({written(content), "--write", first});
    QCOMPARE(original.errors, QString());
    QCOMPARE(original.exitCode, 0);
    QCOMPARE(original.output, tree);

    const QString second = m_folder.filePath("second.xbel");
    const Result again = run({first, "--write", second});
    QCOMPARE(again.errors, QString());
    QCOMPARE(again.output, tree);
    QCOMPARE(read(second), read(first));
}

void tst_Bookmarks::broken_data()
{
    QTest::addColumn<QByteArray>("content");
    QTest::addColumn<QString>("report");

    const QString heading = "Failed to parse the XML content:\n";
    const QString notUnderstood = "Error: 2002 The document cannot be understood.\n%1\n"
                                  "Public ID: , System ID: \n";
    QTest::newRow("ends early") << QByteArray("<xbel>\n <folder>\n")
                                << heading + notUnderstood.arg("unexpected end of file") +
                                       "Line: 3, Column: 1\n";
    QTest::newRow("end tag of another element")
        << QByteArray("<xbel>\n</folder>")
        << heading + notUnderstood.arg("tag mismatch") + "Line: 2, Column: 9\n";
    QTest::newRow("another kind of document")
        << QByteArray("<html/>")
        << heading + "Error: 1016 No initial parse state for element \"html\".\n" +
               notUnderstood.arg("error triggered by consumer") + "Line: 1, Column: 6\n";
    QTest::newRow("bookmark without an address")
        << QByteArray("<xbel>\n  <bookmark/>\n  <bookmark href=''/>\n</xbel>")
        << heading + "Error: 2003 A bookmark has no address.\nLine: 2, Column: 12\n"
                     "Error: 2003 A bookmark has no address.\nLine: 3, Column: 20\n";
    const QByteArray groups = QByteArray("(").repeated(100000);
    QTest::newRow("groups inside each other that would exhaust the stack")
        << "<!DOCTYPE xbel [<!ELEMENT xbel " + groups + "a" + QByteArray(")").repeated(100000) +
               ">]>\n<xbel/>"
        << heading +
               notUnderstood.arg(
                   "More than 1000 groups are inside each other in a document type.") +
               "Line: 1, Column: 1032\n";
    QTest::newRow("empty") << QByteArray()
                           << heading + notUnderstood.arg("unexpected end of file") +
                                  "Line: 1, Column: 1\n";
}

void tst_Bookmarks::broken()
{
    QFETCH(QByteArray, content);
    QFETCH(QString, report);

    const QString out = m_folder.filePath("never.xbel");
    const Result result = run({written(content), "--write", out});
    QCOMPARE(result.errors, report);
    QCOMPARE(result.output, QString());
    QCOMPARE(result.exitCode, 1);
    QVERIFY(!QFile::exists(out));
}

void tst_Bookmarks::missingInput()
{
    const QString path = m_folder.filePath("missing.xbel");
    const Result result = run({path});
    QCOMPARE(result.errors, "Failed to parse the XML content:\n"
                            "Error: 2000 The file cannot be read.\n" +
                                path + ": No such file or directory\n");
    QCOMPARE(result.exitCode, 1);
}

void tst_Bookmarks::outputThatCannotBeWritten_data()
{
    QTest::addColumn<QString>("path");
    QTest::addColumn<QString>("reason");

    QTest::newRow("folder missing")
        << m_folder.filePath("missing/out.xbel") << "No such file or directory";
    QTest::newRow("device full") << "/dev/full"
                                 << "No space left on device";
}

void tst_Bookmarks::outputThatCannotBeWritten()
{
    QFETCH(QString, path);
    QFETCH(QString, reason);
    if (path.startsWith("/dev/") && !QFile::exists(path))
        QSKIP("this system has no device that is always full");

    const Result result = run({BOOKMARKS_SAMPLE, "--write", path});
    QCOMPARE(result.errors, path + ": The file cannot be written. " + reason + "\n");
    QCOMPARE(result.exitCode, 1);
}

// Whatever the files and their titles are called.
void tst_Bookmarks::filesReadSoFar()
{
    QCOMPARE(run({"--files"}).output, QString());
    QCOMPARE(run({BOOKMARKS_SAMPLE}).exitCode, 0);

    const QString title = QString::fromUtf8("90%1 ]]> R&D größe");
    const QString path = m_folder.filePath("plan%2Ffinal <1>.xbel");
    QVERIFY(QFile::rename(
        written("<xbel><title>" + title.toHtmlEscaped().toUtf8() + "</title></xbel>"), path));
    QCOMPARE(run({path}).errors, QString());
    QVERIFY(QFile::exists(settingsFile()));

    const Result result = run({"--files"});
    QCOMPARE(result.errors, QString());
    QCOMPARE(result.exitCode, 0);
    QStringList expected = {QFileInfo(BOOKMARKS_SAMPLE).absoluteFilePath() + ": Reading list\n",
                            path + ": " + title + '\n'};
    expected.sort();
    QCOMPARE(result.output, expected.join(QString()));
}

void tst_Bookmarks::brokenSettingsAreLeft()
{
    QVERIFY(QDir().mkpath(QFileInfo(settingsFile()).path()));
    QFile settings(settingsFile());
    QVERIFY(settings.open(QIODevice::WriteOnly) && settings.write("<broken>") == 8);
    settings.close();
    const Result result = run({BOOKMARKS_SAMPLE});
    QCOMPARE(result.exitCode, 0);
    QVERIFY2(
        result.errors.endsWith("bookmarks.cfg: ConfigFile - Could not parse the input file.\n"),
        qPrintable(result.errors));
    QCOMPARE(read(settingsFile()), QByteArray("<broken>"));
}

void tst_Bookmarks::usage_data()
{
    QTest::addColumn<QStringList>("arguments");

    QTest::newRow("no file") << QStringList();
    QTest::newRow("no output") << QStringList({BOOKMARKS_SAMPLE, "--write"});
    QTest::newRow("other option") << QStringList({BOOKMARKS_SAMPLE, "--other", "out"});
}

void tst_Bookmarks::usage()
{
    QFETCH(QStringList, arguments);
    const Result result = run(arguments);
    QCOMPARE(result.errors, QString("usage: bookmarks FILE [--write OUT]\n"
                                    "       bookmarks --files\n"));
    QCOMPARE(result.exitCode, 2);
}

QTEST_GUILESS_MAIN(tst_Bookmarks)

#include "tst_Bookmarks.moc"
