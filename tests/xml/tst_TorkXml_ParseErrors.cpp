// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkXml_ParseManager_Base.h"

#include "common/log/TorkLog.h"

#include "support/MessageCapture.h"
#include "support/TestFiles.h"
#include "xml/ScriptedStates.h"
#include "xml/VirtualSlot.h"

#include <QTemporaryDir>
#include <QtTest>

#include <limits>

using namespace ScriptedStates;

namespace {

// The process-wide log in its own folder; restores the previous message handler when it is gone.
class ProcessWideLog
{
public:
    ProcessWideLog() : m_handler(qInstallMessageHandler(nullptr))
    {
        TorkLog::initialize(m_dir.path() + "/", "xml", QString(), true);
    }

    ~ProcessWideLog()
    {
        TorkLog::shutdown();
        qInstallMessageHandler(m_handler);
    }

    ProcessWideLog(ProcessWideLog const&) = delete;
    ProcessWideLog& operator=(ProcessWideLog const&) = delete;

    QByteArray Content() const { return TestFiles::read(m_dir.filePath("xml.log")); }

private:
    QTemporaryDir m_dir;
    QtMessageHandler m_handler;
};

} // namespace

class tst_TorkXml_ParseErrors : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();

    void appendError_data();
    void appendError();
    void appendErrorWithCode_data();
    void appendErrorWithCode();
    void appendErrorOfElement_data();
    void appendErrorOfElement();
    void formatErrors_data();
    void formatErrors();
    void errorsOfStatesDoNotStop();
    void errorsOutliveADocument();
    void stacksAreEmptyForTheNextDocument();

    void noWarningWithoutTheLog();
    void warningWithTheLog_data();
    void warningWithTheLog();
    void warningReachesTheLogFile();
    void refusedContentWarnsOfNothing();
};

void tst_TorkXml_ParseErrors::init()
{
    ScriptedState::alive = 0;
    QVERIFY(!TorkLog::m_gLog);
}

void tst_TorkXml_ParseErrors::cleanup()
{
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseErrors::appendError_data()
{
    QTest::addColumn<QString>("text");

    QTest::newRow("plain") << "something is wrong";
    QTest::newRow("empty") << "";
    QTest::newRow("placeholder") << "%1 and %2";
    QTest::newRow("several lines") << "first\nsecond";
    QTest::newRow("quotes and backslashes") << "say \"a\\b\"";
    QTest::newRow("outside Latin-1") << QString::fromUtf8("größe 長");
    QTest::newRow("1 MB") << QString(1 << 20, 'x');
}

void tst_TorkXml_ParseErrors::appendError()
{
    QFETCH(QString, text);

    TorkXml_ParseManager_Base manager;
    manager.AppendError(text);
    QCOMPARE(Report(manager), ReportHeader + text + "\n");
}

void tst_TorkXml_ParseErrors::appendErrorWithCode_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("expected");

    QTest::newRow("plain") << "no title" << 2001 << "Error: 2001 no title";
    QTest::newRow("code 0") << "no title" << 0 << "Error: 0 no title";
    QTest::newRow("negative code") << "no title" << -7 << "Error: -7 no title";
    QTest::newRow("largest code") << "t" << std::numeric_limits<int>::max()
                                  << "Error: 2147483647 t";
    QTest::newRow("smallest code")
        << "t" << std::numeric_limits<int>::min() << "Error: -2147483648 t";
    QTest::newRow("no text") << "" << 5 << "Error: 5 ";
    QTest::newRow("placeholders in the text") << "%1 %2 %3" << 5 << "Error: 5 %1 %2 %3";
}

void tst_TorkXml_ParseErrors::appendErrorWithCode()
{
    QFETCH(QString, text);
    QFETCH(int, code);
    QFETCH(QString, expected);

    TorkXml_ParseManager_Base manager;
    manager.AppendError(text, code);
    QCOMPARE(Report(manager), ReportHeader + expected + "\n");
}

void tst_TorkXml_ParseErrors::appendErrorOfElement_data()
{
    QTest::addColumn<QString>("element");
    QTest::addColumn<QString>("content");
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("expected");

    QTest::newRow("plain") << "title"
                           << "?" << 2001 << "Error: 2001 on Element: title\nContent: ?";
    QTest::newRow("negative code") << "title"
                                   << "?" << -1 << "Error: -1 on Element: title\nContent: ?";
    QTest::newRow("no element") << ""
                                << "?" << 5 << "Error: 5 on Element: \nContent: ?";
    QTest::newRow("no content") << "title"
                                << "" << 5 << "Error: 5 on Element: title\nContent: ";
    QTest::newRow("placeholders in the element")
        << "%1%2%3"
        << "?" << 5 << "Error: 5 on Element: %1%2%3\nContent: ?";
    QTest::newRow("placeholders in the content")
        << "title"
        << "%1%2%3" << 5 << "Error: 5 on Element: title\nContent: %1%2%3";
    QTest::newRow("content of several lines")
        << "title"
        << "a\nb" << 5 << "Error: 5 on Element: title\nContent: a\nb";
}

void tst_TorkXml_ParseErrors::appendErrorOfElement()
{
    QFETCH(QString, element);
    QFETCH(QString, content);
    QFETCH(int, code);
    QFETCH(QString, expected);

    TorkXml_ParseManager_Base manager;
    manager.AppendError(element, content, code);
    QCOMPARE(Report(manager), ReportHeader + expected + "\n");
}

void tst_TorkXml_ParseErrors::formatErrors_data()
{
    QTest::addColumn<QStringList>("errors");
    QTest::addColumn<QString>("expected");

    QTest::newRow("none gives the header") << QStringList{} << ReportHeader;
    QTest::newRow("one") << QStringList{"a"} << ReportHeader + "a\n";
    QTest::newRow("several in order") << QStringList{"b", "a", "c"} << ReportHeader + "b\na\nc\n";
    QTest::newRow("same twice") << QStringList{"a", "a"} << ReportHeader + "a\na\n";
    QTest::newRow("empty one") << QStringList{"", "a"} << ReportHeader + "\na\n";
    QTest::newRow("placeholder") << QStringList{"%1", "%2"} << ReportHeader + "%1\n%2\n";
}

void tst_TorkXml_ParseErrors::formatErrors()
{
    QFETCH(QStringList, errors);
    QFETCH(QString, expected);
    TorkXml_ParseManager_Base manager;
    for (QString const& error : errors)
        manager.AppendError(error);

    QString report("left over from before");
    manager.FormatErrors(report);
    QCOMPARE(report, expected);
    manager.FormatErrors(report);
    QCOMPARE(report, expected); // nothing was cleared, and nothing added
}

void tst_TorkXml_ParseErrors::errorsOfStatesDoNotStop()
{
    Script script;
    script.reported << "b=bad"
                    << "x=1";
    ScriptedManager manager(script);

    QVERIFY(Parse(manager, "<a><b x='1'>bad</b><b>good</b></a>"));
    QCOMPARE(Report(manager), ReportHeader + "Error: 2000 on Element: x\nContent: 1\n"
                                             "Error: 2000 on Element: b\nContent: bad\n");
    QCOMPARE(ScriptedState::alive, 0);
}

void tst_TorkXml_ParseErrors::errorsOutliveADocument()
{
    TorkXml_ParseManager_Base manager;
    QVERIFY(!Parse(manager, "<a/>"));
    const QString first = Report(manager);
    QCOMPARE(OpenElements(manager), QStringList{"a"});
    QVERIFY(!Parse(manager, "<b/>"));

    QCOMPARE(Report(manager), first + "Error: 1016 No initial parse state for element \"b\".\n");
}

void tst_TorkXml_ParseErrors::stacksAreEmptyForTheNextDocument()
{
    Script script;
    ScriptedManager manager(script);

    QVERIFY(Parse(manager, "<a/>"));
    QVERIFY(Parse(manager, "<b/>"));

    QCOMPARE(script.events,
             QStringList({"first(a)", "a.end(a)", "~a", "first(b)", "b.end(b)", "~b"}));
}

void tst_TorkXml_ParseErrors::noWarningWithoutTheLog()
{
    TorkXml_ParseManager_Base manager;
    MessageCapture captured;

    manager.AppendError("text");
    manager.AppendError("text", 5);
    manager.AppendError("element", "content", 5);
    Parse(manager, "<a/>");

    QCOMPARE(captured.messages().size(), 0);
}

void tst_TorkXml_ParseErrors::warningWithTheLog_data()
{
    QTest::addColumn<QString>("element");
    QTest::addColumn<QString>("text");
    QTest::addColumn<int>("code");
    QTest::addColumn<QString>("expected");

    // The text is streamed as a string: quoted, with unprintable characters escaped.
    QTest::newRow("text") << QString() << "text" << 0 << "\"text\"";
    QTest::newRow("empty text") << QString() << "" << 0 << "\"\"";
    QTest::newRow("text with quotes")
        << QString() << "say \"a\\b\"" << 0 << "\"say \\\"a\\\\b\\\"\"";
    QTest::newRow("text of several lines") << QString() << "a\nb" << 0 << "\"a\\nb\"";
    QTest::newRow("text with a placeholder") << QString() << "%1" << 0 << "\"%1\"";
    QTest::newRow("code and text") << QString() << "text" << 7 << "\"Error: 7 text\"";
    QTest::newRow("element, content and code")
        << "title"
        << "?" << 7 << "\"Error: 7 on Element: title\\nContent: ?\"";
}

void tst_TorkXml_ParseErrors::warningWithTheLog()
{
    QFETCH(QString, element);
    QFETCH(QString, text);
    QFETCH(int, code);
    QFETCH(QString, expected);

    ProcessWideLog log;
    TorkXml_ParseManager_Base manager;
    MessageCapture captured;
    if (!element.isNull())
        manager.AppendError(element, text, code);
    else if (code)
        manager.AppendError(text, code);
    else
        manager.AppendError(text);

    QCOMPARE(captured.messages().size(), 1);
    QCOMPARE(captured.messages()[0].type, QtWarningMsg);
    QCOMPARE(captured.messages()[0].category, QString("default"));
    QCOMPARE(captured.messages()[0].text, expected);
}

void tst_TorkXml_ParseErrors::warningReachesTheLogFile()
{
    ProcessWideLog log;
    TorkXml_ParseManager_Base first;
    QVERIFY(!Parse(first, "<root/>"));
    Script script;
    script.unknown << "a>b";
    ScriptedManager next(script);
    QVERIFY(!Parse(next, "<a><b/></a>"));

    const QList<QByteArray> lines = log.Content().split('\n');
    QCOMPARE(lines.size(), 3);
    const QByteArray firstEnd(" Warning \"Error: 1016 No initial parse state for element "
                              "\\\"root\\\".\"");
    QVERIFY2(lines[0].endsWith(firstEnd), lines[0].constData());
    const QByteArray nextEnd(" Warning \"Error: 1016 Unknown element \\\"b\\\". Parse state "
                             "element \\\"a\\\".\"");
    QVERIFY2(lines[1].endsWith(nextEnd), lines[1].constData());
    QCOMPARE(lines[2], QByteArray());
}

void tst_TorkXml_ParseErrors::refusedContentWarnsOfNothing()
{
    ProcessWideLog log;
    Script script;
    script.refused << "a=x";
    ScriptedManager manager(script);
    MessageCapture captured;

    QVERIFY(!Parse(manager, "<a>x</a>"));
    QCOMPARE(captured.messages().size(), 0);
}

QTEST_GUILESS_MAIN(tst_TorkXml_ParseErrors)

#include "tst_TorkXml_ParseErrors.moc"
