// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// What docs/ shows is what the program does: the samples are generated again here, and the tests
// that the pages name exist.

#include "app/AppUtils.h"
#include "app/LaunchOptionParser.h"
#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "common/xml/TorkXmlStream.h"
#include "common/xml/TorkXml_ParseManager_Base.h"
#include "support/TestFiles.h"

#include <QColor>
#include <QDateTime>
#include <QDebug>
#include <QDir>
#include <QLibraryInfo>
#include <QProcess>
#include <QRegularExpression>
#include <QTemporaryDir>
#include <QVersionNumber>
#include <QXmlInputSource>
#include <QXmlSimpleReader>
#include <QtTest>

class tst_DocSamples : public QObject
{
    Q_OBJECT

private slots:
    void callsAreThoseOfThisTest_data();
    void callsAreThoseOfThisTest();
    void launchData();
    void configFile();
    void logSettings();
    void logFile();
    void logMilliseconds();
    void recentFiles();
    void xmlOutput();
    void xmlReport();
    void xmlReaderIsTheProgram();
    void xmlReader_data();
    void xmlReader();
    void orderReaderIsTheProgram();
    void orderReader_data();
    void orderReader();
    void namedTestsExist_data();
    void namedTestsExist();
    void linkedFilesExist_data();
    void linkedFilesExist();

private:
    static void runReader(QString const& reader);
};

namespace {

QString Read(QString const& path)
{
    return QString::fromUtf8(TestFiles::read(QStringLiteral(PROJECT_FOLDER "/") + path));
}

// The code block below the comment that names it.
QString Sample(QString const& page, QString const& name)
{
    const QRegularExpression block("<!-- sample: " + name + " -->\n```[a-z]*\n(.*?\n)```\n",
                                   QRegularExpression::DotMatchesEverythingOption);
    const QRegularExpressionMatch match = block.match(Read("docs/" + page));
    return match.hasMatch() ? match.captured(1) : "no sample " + name;
}

QString WithoutSpace(QString text)
{
    return text.remove(QRegularExpression("\\s"));
}

// The stamp's digits, and the elapsed time.
QString WithoutTimes(QString text)
{
    text.replace(QRegularExpression("^\\d{4}-\\d\\d-\\d\\d \\d\\d:\\d\\d:\\d\\d\\.\\d{1,3} ",
                                    QRegularExpression::MultilineOption),
                 "STAMP ");
    return text.replace(QRegularExpression("dT:\\[\\d+\\]"), "dT:[N]");
}

} // namespace

void tst_DocSamples::callsAreThoseOfThisTest_data()
{
    QTest::addColumn<QString>("page");
    QTest::addColumn<QString>("sample");

    QTest::newRow("configuration file") << "config-file.md"
                                        << "config-calls";
    QTest::newRow("log file") << "log-file.md"
                              << "log-calls";
    QTest::newRow("XML") << "xml.md"
                         << "xml-calls";
}

void tst_DocSamples::callsAreThoseOfThisTest()
{
    QFETCH(QString, page);
    QFETCH(QString, sample);

    const QString source = WithoutSpace(Read("tests/package/tst_DocSamples.cpp"));
    QVERIFY2(source.contains(WithoutSpace(Sample(page, sample))), qPrintable(Sample(page, sample)));
}

void tst_DocSamples::launchData()
{
    QString sample = Sample("launch-data.md", "launch-data");
    QCOMPARE(sample, Read("packaging/appdata.cfg"));

    LaunchOptionParser parser;
    parser.AddOption(new LaunchOption("organization", "organization", "o", 1, ""));
    parser.AddOption(new LaunchOption("product", "product", "p", 1, ""));
    QVERIFY(parser.ParseOptions(sample));
    QCOMPARE(parser.FindOption("organization")->value, QString("Tork"));
    QCOMPARE(parser.FindOption("product")->value, QString("Velocor"));
}

void tst_DocSamples::configFile()
{
    const QTemporaryDir folder;
    const QString path = folder.filePath("sample.cfg");
    TorkConfigFile settings(path);
    QColor paper(255, 128, 0);
    QSize page(640, 480);
    QPoint position(10, 20);
    QSize size(800, 600);

    settings.WriteItem("Main Window", "title", "R&D: a < b");
    settings.WriteItem("Main Window", "columns", -12);
    settings.WriteItem("Main Window", "limit", 4000000000U);
    settings.WriteBool("Main Window", "tool bar", true);
    settings.WriteColor("Main Window", "paper", paper);
    settings.WriteSize("Main Window", "page", page);
    settings.WriteScreenMetrics("MainWindow", position, size);
    settings.Save();

    QCOMPARE(QString::fromUtf8(TestFiles::read(path)), Sample("config-file.md", "config-file"));
    QVERIFY(settings.Load());
}

void tst_DocSamples::logSettings()
{
    const QTemporaryDir folder;
    const QString path = folder.path() + '/';
    const QtMessageHandler handler = qInstallMessageHandler(nullptr);
    TorkLog::initialize(path, "velocor", QString(), true);
    TorkLog::shutdown();
    qInstallMessageHandler(handler);

    QCOMPARE(QString::fromUtf8(TestFiles::read(path + "logsettings.cfg")),
             Sample("log-settings.md", "log-settings"));
}

void tst_DocSamples::logFile()
{
    const QTemporaryDir folder;
    const QString path = folder.path() + '/';
    const QtMessageHandler handler = qInstallMessageHandler(nullptr);
    TorkLog* log = TorkLog::initialize(path, "velocor", QString(), true);

    qDebug() << "pages" << 3;
    log->write(TorkLog::Notification, "Index saved");
    qWarning("The disk is nearly full");
    log->error("Cannot read notes.txt");
    log->setLogElapsedTime(true);
    log->fatal("The index is damaged");

    TorkLog::shutdown();
    qInstallMessageHandler(handler);

    const QString written = QString::fromUtf8(TestFiles::read(path + "velocor.log"));
    QCOMPARE(WithoutTimes(written), WithoutTimes(Sample("log-file.md", "log-file")));
    QVERIFY(WithoutTimes(written).startsWith("STAMP Trace"));
}

void tst_DocSamples::logMilliseconds()
{
    QStringList lines = Sample("log-file.md", "log-milliseconds").trimmed().split('\n');
    if (QLibraryInfo::version() < QVersionNumber(5, 15))
        QSKIP("the sample shows what Qt 5.15 does");
    QVERIFY2(lines.size() > 2, qPrintable(lines.join('\n')));
    QCOMPARE(lines.takeFirst().simplified(), QString("milliseconds z zzz"));
    for (QString const& line : lines) {
        const QStringList fields = line.simplified().split(' ');
        const QDateTime time(QDate(2025, 3, 3), QTime(9, 2, 11, fields[0].toInt()));
        QCOMPARE(fields.mid(1), QStringList({time.toString("z"), time.toString("zzz")}));
    }
}

void tst_DocSamples::recentFiles()
{
    const QStringList lines = Sample("recent-files.md", "recent-files").trimmed().split('\n');
    QVERIFY2(lines.size() > 2, qPrintable(lines.join('\n')));
    for (QString const& line : lines.mid(1)) {
        QStringList fields = line.split(QRegularExpression(" {2,}"));
        QCOMPARE(fields.size(), 4);
        fields.replaceInStrings("(empty)", "");

        QString list = fields[0];
        const QStringList words = fields[1].split(QRegularExpression("[ ,]+"));
        const bool changed = words[0] == "add"
                                 ? AppUtils::AddToMRUList(words[1], list, words.value(3).toInt())
                                 : AppUtils::RemoveFromMRUList(words[1], list);
        QVERIFY2(list == fields[2], qPrintable(line + " gives " + list));
        QVERIFY2(changed == (fields[3] == "true"), qPrintable(line));
    }
}

void tst_DocSamples::xmlOutput()
{
    QString text;
    TorkXmlStream writer(&text);

    writer.WriteElementStart("library", 1);
    writer.WriteElement("title", "Research & development");
    writer.WriteElement("path", "C:\\data");
    writer.WriteElement("owner", "Ada's");
    writer.WriteElement("note", "");
    writer.WriteElementOpen("shelf", 1);
    writer.WriteAttribute("id", "7");
    writer.WriteElementCloseAndEnd("shelf", 1);
    writer.WriteElementOpen("shelf", 1);
    writer.WriteAttribute("id", "8");
    writer.WriteAttribute("room", "east");
    writer.WriteElementClose("shelf", 0);
    writer.WriteElement("book", "one");
    writer.WriteElementEnd("shelf", 1);
    writer.WriteElementOpen("shelf", 1);
    writer.WriteAttribute("first", "a text of some thirty characters");
    writer.WriteAttribute("second", "another one, about as long");
    writer.WriteAttribute("third", "what no longer fits");
    writer.WriteElementCloseAndEnd("shelf", 1);
    writer.WriteElementEnd("library", 1);

    writer.flush();
    QCOMPARE(text, Sample("xml.md", "xml-output"));
}

void tst_DocSamples::xmlReport()
{
    TorkXml_ParseManager_Base manager;
    QXmlInputSource source;
    source.setData(QString("<html/>"));
    QXmlSimpleReader reader;
    reader.setContentHandler(&manager);
    QVERIFY(!reader.parse(source));

    QString report;
    manager.FormatErrors(report);
    QCOMPARE(report, Sample("xml.md", "xml-report"));
}

void tst_DocSamples::xmlReaderIsTheProgram()
{
    const QString program = Read("tests/package/TitleReader.cpp");
    QCOMPARE(program.mid(program.indexOf("#include")), Sample("xml.md", "xml-reader"));
}

void tst_DocSamples::xmlReader_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QString>("output");
    QTest::addColumn<QString>("errors");

    const QString none;
    const QString heading = "Failed to parse the XML content:\n";
    QTest::newRow("titles") << "<library title='x'>\n<title>A</title><n><title>no</title></n>"
                               "<title>B<i>no</i>C</title>\n</library>"
                            << "A\nBC\n"
                            << none;
    QTest::newRow("malformed") << "<library>\n  <title>First</titel>\n</library>\n"
                               << none << Sample("xml.md", "xml-reader-malformed");
    QTest::newRow("unknown") << "<html/>" << none << Sample("xml.md", "xml-reader-unknown");
    QTest::newRow("beyond a limit")
        << "<!DOCTYPE library [<!ELEMENT a " + QString("(").repeated(2000) << none
        << heading + "More than 1000 groups are inside each other in a "
                     "document type.\nPublic ID: , System ID: \n"
                     "Line: 1, Column: 1032\n";
}

void tst_DocSamples::xmlReader()
{
    runReader(TITLE_READER);
}

// Runs the program on the row's document.
void tst_DocSamples::runReader(QString const& reader)
{
    QFETCH(QString, document);
    QFETCH(QString, output);
    QFETCH(QString, errors);
    const QTemporaryDir folder;
    const QString path = folder.filePath("some.xml");
    QVERIFY(TestFiles::write(path, document.toUtf8()));

    QProcess program;
    program.start(reader, {path});
    QVERIFY(program.waitForFinished());
    QCOMPARE(QString::fromUtf8(program.readAllStandardError()), errors);
    QCOMPARE(QString::fromUtf8(program.readAllStandardOutput()), output);
    QCOMPARE(program.exitCode(), errors.isEmpty() ? 0 : 1);
}

void tst_DocSamples::orderReaderIsTheProgram()
{
    const QString program = Read("tests/package/OrderReader.cpp");
    QCOMPARE(program.mid(program.indexOf("#include")), Sample("start-here.md", "order-reader"));
}

void tst_DocSamples::orderReader_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<QString>("output");
    QTest::addColumn<QString>("errors");

    const QString heading = "Failed to parse the XML content:\n";
    const auto row = [&heading](char const* name, char const* document, char const* errors) {
        QTest::newRow(name) << QString(document) << QString() << heading + errors;
    };
    QTest::newRow("counts") << "<order>\n<item count='2'>A</item>\n<item count='3'/></order>"
                            << "5 pieces\n"
                            << QString();
    QTest::newRow("only the first of two wrong attributes")
        << "<order>\n  <item count=\"2\"/>\n  <item count=\"none\"/>\n  <item count='0'/></order>"
        << QString() << Sample("start-here.md", "order-reader-attribute");
    row("end of an element", "<order>\n  <item/>pens</order>",
        "Line 2, column 8: an item without a count\n");
    row("text", "<order>\n  pens<!-- -->and pens</order>",
        "Line 2, column 7: text between the items: pens\n");
    row("unknown element", "<order>\n <pen/></order>",
        "Error: 1016 Unknown element \"pen\". Parse state element \"order\".\n"
        "Line 2, column 6: error triggered by consumer\n");
    row("malformed", "<order>\n</orders>", "Line 2, column 9: tag mismatch\n");
}

void tst_DocSamples::orderReader()
{
    runReader(ORDER_READER);
}

// As "tst_Class::function(row)" or "tst_Class::function".
void tst_DocSamples::namedTestsExist_data()
{
    QTest::addColumn<QString>("test");
    QTest::addColumn<QString>("function");
    QTest::addColumn<QString>("row");

    const QString page = Read("docs/deliberate-oddities.md");
    const QRegularExpression name("`(tst_\\w+)::(\\w+)(?:\\(([^`]*)\\))?`");
    QRegularExpressionMatchIterator found = name.globalMatch(page);
    QVERIFY(found.hasNext());
    while (found.hasNext()) {
        const QRegularExpressionMatch match = found.next();
        QTest::newRow(qPrintable(match.captured(0)))
            << match.captured(1) << match.captured(2) << match.captured(3);
    }
}

void tst_DocSamples::namedTestsExist()
{
    QFETCH(QString, test);
    QFETCH(QString, function);
    QFETCH(QString, row);

    QString source;
    for (char const* folder : {"app", "config", "log", "xml"}) {
        const QString path = QString("tests/%1/%2.cpp").arg(folder, test);
        if (QFile::exists(QStringLiteral(PROJECT_FOLDER "/") + path))
            source = Read(path);
    }
    QVERIFY2(!source.isEmpty(), qPrintable("no test is called " + test));
    QVERIFY2(source.contains("void " + test + "::" + function + "()"), "no such function");
    if (row.isEmpty())
        return;

    // From the function with the rows to the next function.
    const int start = source.indexOf("void " + test + "::" + function + "_data()");
    const QString rows = source.mid(start, source.indexOf("\nvoid ", start + 1) - start);
    QVERIFY2(start >= 0 && rows.contains('"' + row + '"'), "no such row");
}

void tst_DocSamples::linkedFilesExist_data()
{
    QTest::addColumn<QString>("page");

    QTest::newRow("README.md") << "README.md";
    QTest::newRow("CHANGELOG.md") << "CHANGELOG.md";
    const QStringList pages = QDir(PROJECT_FOLDER "/docs").entryList({"*.md"}, QDir::Files);
    for (QString const& page : pages)
        QTest::newRow(qPrintable(page)) << "docs/" + page;
}

void tst_DocSamples::linkedFilesExist()
{
    QFETCH(QString, page);

    const QString text = Read(page);
    const QDir folder = QFileInfo(QStringLiteral(PROJECT_FOLDER "/") + page).dir();
    const QRegularExpression link("\\]\\((?!https?:)([^)#]+)[^)]*\\)");
    QRegularExpressionMatchIterator found = link.globalMatch(text);
    while (found.hasNext()) {
        const QString target = found.next().captured(1);
        QVERIFY2(folder.exists(target), qPrintable(target));
    }
}

QTEST_GUILESS_MAIN(tst_DocSamples)

#include "tst_DocSamples.moc"
