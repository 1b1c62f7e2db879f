// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/xml/TorkErrorHandler.h"

#include "common/log/TorkLog.h"
#include "support/MessageCapture.h"
#include "support/TestFiles.h"

#include <QRegularExpression>
#include <QTemporaryDir>
#include <QXmlDefaultHandler>
#include <QXmlInputSource>
#include <QXmlParseException>
#include <QXmlSimpleReader>
#include <QtTest>

#include <functional>
#include <type_traits>

static_assert(std::is_convertible<TorkErrorHandler*, QXmlErrorHandler*>::value,
              "the reader takes it for its error handler");

namespace {

using Report = std::function<bool(QXmlErrorHandler&, QXmlParseException const&)>;

const Report Warning = [](QXmlErrorHandler& handler, QXmlParseException const& exception) {
    return handler.warning(exception);
};
const Report Error = [](QXmlErrorHandler& handler, QXmlParseException const& exception) {
    return handler.error(exception);
};
const Report FatalError = [](QXmlErrorHandler& handler, QXmlParseException const& exception) {
    return handler.fatalError(exception);
};

} // namespace

Q_DECLARE_METATYPE(Report)

class tst_TorkErrorHandler : public QObject
{
    Q_OBJECT

private slots:
    void startsWithoutError();
    void format_data();
    void format();
    void formatReturnsItsBuffer();
    void formatIssuesNothing();
    void report_data();
    void report();
    void lastProblemCounts();
    void reader_data();
    void reader();
    void readerGoesOnAfterAWarning();
    void logEntries_data();
    void logEntries();
    void destructorIsVirtual();
};

void tst_TorkErrorHandler::startsWithoutError()
{
    const TorkErrorHandler handler(nullptr);
    QVERIFY(handler.errorString().isEmpty());
    QVERIFY(!handler.errorString().isNull());
}

void tst_TorkErrorHandler::format_data()
{
    QTest::addColumn<QString>("message");
    QTest::addColumn<QString>("publicId");
    QTest::addColumn<QString>("systemId");
    QTest::addColumn<int>("line");
    QTest::addColumn<int>("column");
    QTest::addColumn<QString>("expected");

    QTest::newRow("everything known") << "no such element"
                                      << "-//X//Y"
                                      << "file.xml" << 3 << 7
                                      << "no such element\n"
                                         "Public ID: -//X//Y, System ID: file.xml\n"
                                         "Line: 3, Column: 7";
    QTest::newRow("no identifiers")
        << "bad"
        << ""
        << "" << 1 << 1 << "bad\nPublic ID: , System ID: \nLine: 1, Column: 1";
    QTest::newRow("nothing known")
        << ""
        << ""
        << "" << -1 << -1 << "\nPublic ID: , System ID: \nLine: -1, Column: -1";
    QTest::newRow("large numbers without separators")
        << "bad"
        << ""
        << "" << 2147483647 << 1234567
        << "bad\nPublic ID: , System ID: \nLine: 2147483647, Column: 1234567";
    QTest::newRow("lines in the message")
        << "one\ntwo"
        << ""
        << "" << 1 << 2 << "one\ntwo\nPublic ID: , System ID: \nLine: 1, Column: 2";

    // The arguments are substituted one at a time, each at the lowest marker left by then.
    QTest::newRow("message holds %1") << "50 %1 off"
                                      << "P"
                                      << "S" << 3 << 7
                                      << "50 P off\nPublic ID: S, System ID: 3\n"
                                         "Line: 7, Column: %5";
    QTest::newRow("message holds %5")
        << "%5"
        << "P"
        << "S" << 3 << 7 << "7\nPublic ID: P, System ID: S\nLine: 3, Column: 7";
    QTest::newRow("message holds %6")
        << "%6"
        << "P"
        << "S" << 3 << 7 << "%6\nPublic ID: P, System ID: S\nLine: 3, Column: 7";
    QTest::newRow("public identifier holds %1") << "m"
                                                << "%1"
                                                << "S" << 3 << 7
                                                << "m\nPublic ID: S, System ID: 3\n"
                                                   "Line: 7, Column: %5";
    QTest::newRow("system identifier holds %4") << "m"
                                                << "P"
                                                << "%4" << 3 << 7
                                                << "m\nPublic ID: P, System ID: 3\n"
                                                   "Line: 3, Column: 7";
    QTest::newRow("bare percent sign")
        << "100 %"
        << "P"
        << "S" << 3 << 7 << "100 %\nPublic ID: P, System ID: S\nLine: 3, Column: 7";
}

void tst_TorkErrorHandler::format()
{
    QFETCH(QString, message);
    QFETCH(QString, publicId);
    QFETCH(QString, systemId);
    QFETCH(int, line);
    QFETCH(int, column);
    QFETCH(QString, expected);
    TorkErrorHandler handler(nullptr);

    QCOMPARE(handler.format(QXmlParseException(message, column, line, publicId, systemId)),
             expected);
    QCOMPARE(handler.errorString(), "Xml Parse Failure.\n" + expected);
}

void tst_TorkErrorHandler::formatReturnsItsBuffer()
{
    TorkErrorHandler handler(nullptr);
    QString const& first = handler.format(QXmlParseException("first", 1, 1));
    QString const& second = handler.format(QXmlParseException("second", 2, 2));
    QCOMPARE(&first, &second);
    QCOMPARE(first, QString("second\nPublic ID: , System ID: \nLine: 2, Column: 2"));
}

void tst_TorkErrorHandler::formatIssuesNothing()
{
    const MessageCapture messages;
    TorkErrorHandler handler(nullptr);
    handler.format(QXmlParseException("problem", 1, 1));
    QCOMPARE(messages.texts(), QStringList());
}

void tst_TorkErrorHandler::report_data()
{
    QTest::addColumn<Report>("report");
    QTest::addColumn<QString>("message");
    QTest::addColumn<bool>("goOn");
    QTest::addColumn<QStringList>("issued");

    QTest::newRow("warning: the detail only")
        << Warning << "odd" << true
        << QStringList{"warning: \"odd\\nPublic ID: P, System ID: S\\nLine: 3, Column: 7\""};
    QTest::newRow("error: label, then the full text")
        << Error << "wrong" << true
        << QStringList{"critical: TorkErrorHandler::error  \"Xml Parse Failure.\\nwrong\\n"
                       "Public ID: P, System ID: S\\nLine: 3, Column: 7\""};
    QTest::newRow("fatal error: label with a colon, then the full text")
        << FatalError << "broken" << false
        << QStringList{"critical: TorkErrorHandler::fatalError:  \"Xml Parse Failure.\\nbroken\\n"
                       "Public ID: P, System ID: S\\nLine: 3, Column: 7\""};
    QTest::newRow("quotation marks in the message")
        << Warning << "a \"b\"" << true
        << QStringList{"warning: \"a \\\"b\\\"\\nPublic ID: P, System ID: S\\n"
                       "Line: 3, Column: 7\""};
}

void tst_TorkErrorHandler::report()
{
    QFETCH(Report, report);
    QFETCH(QString, message);
    QFETCH(QStringList, issued);
    TorkErrorHandler handler(nullptr);

    const MessageCapture messages;
    QTEST(report(handler, QXmlParseException(message, 7, 3, "P", "S")), "goOn");

    QCOMPARE(messages.texts(), issued);
    QCOMPARE(messages.messages()[0].category, QString("default"));
    QVERIFY(!messages.messages()[0].hasPlace);
    QCOMPARE(handler.errorString(),
             "Xml Parse Failure.\n" + message + "\nPublic ID: P, System ID: S\nLine: 3, Column: 7");
}

void tst_TorkErrorHandler::lastProblemCounts()
{
    const MessageCapture messages;
    TorkErrorHandler handler(nullptr);
    handler.fatalError(QXmlParseException("first", 1, 1));
    handler.warning(QXmlParseException("second", 2, 2));
    QCOMPARE(handler.errorString(),
             QString("Xml Parse Failure.\nsecond\nPublic ID: , System ID: \nLine: 2, Column: 2"));
    QCOMPARE(messages.texts().size(), 2);
}

void tst_TorkErrorHandler::reader_data()
{
    QTest::addColumn<QString>("document");
    QTest::addColumn<bool>("parses");
    QTest::addColumn<QString>("errorString");

    const QString ids("\nPublic ID: , System ID: \n");
    QTest::newRow("well-formed") << "<r><s/></r>" << true << "";
    QTest::newRow("mismatched end tag in line 3, column 7")
        << "<r>\n<s>\n   </r>\n"
        << false << "Xml Parse Failure.\ntag mismatch" + ids + "Line: 3, Column: 7";
    QTest::newRow("ends too early")
        << "<r>" << false
        << "Xml Parse Failure.\nunexpected end of file" + ids + "Line: 1, Column: 4";
    QTest::newRow("empty") << "" << false
                           << "Xml Parse Failure.\nunexpected end of file" + ids +
                                  "Line: 1, Column: 1";
}

void tst_TorkErrorHandler::reader()
{
    QFETCH(QString, document);
    QFETCH(bool, parses);
    QXmlInputSource source;
    source.setData(document);
    TorkErrorHandler handler(nullptr);
    QXmlSimpleReader reader;
    reader.setErrorHandler(&handler);

    const MessageCapture messages;
    QCOMPARE(reader.parse(source), parses);
    QTEST(handler.errorString(), "errorString");
    QCOMPARE(messages.texts().size(), parses ? 0 : 1);
}

// The reader itself never issues warnings, so an element triggers one instead.
void tst_TorkErrorHandler::readerGoesOnAfterAWarning()
{
    class WarningHandler : public QXmlDefaultHandler
    {
    public:
        explicit WarningHandler(TorkErrorHandler& errors) : m_errors(errors) {}
        bool startElement(QString const&, QString const& localName, QString const&,
                          QXmlAttributes const&) override
        {
            if (localName == "odd")
                return m_errors.warning(QXmlParseException("odd element", 1, 2));
            if (localName == "wrong")
                return m_errors.error(QXmlParseException("wrong element", 1, 2));
            m_last = localName;
            return true;
        }
        QString last() const { return m_last; }

    private:
        TorkErrorHandler& m_errors;
        QString m_last;
    };

    QXmlInputSource source;
    source.setData(QStringLiteral("<r><wrong/><odd/><last/></r>"));
    TorkErrorHandler errors(nullptr);
    WarningHandler content(errors);
    QXmlSimpleReader reader;
    reader.setContentHandler(&content);
    reader.setErrorHandler(&errors);

    const MessageCapture messages;
    QVERIFY(reader.parse(source));
    QCOMPARE(content.last(), QString("last"));
    QCOMPARE(messages.texts().size(), 2);
    QCOMPARE(errors.errorString(), QString("Xml Parse Failure.\nodd element\n"
                                           "Public ID: , System ID: \nLine: 2, Column: 1"));
}

void tst_TorkErrorHandler::logEntries_data()
{
    QTest::addColumn<Report>("report");
    QTest::addColumn<QString>("expected");

    QTest::newRow("warning") << Warning
                             << "Warning \"odd\\nPublic ID: , System ID: \\nLine: 3, Column: 7\"";
    QTest::newRow("error") << Error
                           << "Error TorkErrorHandler::error  \"Xml Parse Failure.\\nodd\\n"
                              "Public ID: , System ID: \\nLine: 3, Column: 7\"";
    QTest::newRow("fatal error") << FatalError
                                 << "Error TorkErrorHandler::fatalError:  \"Xml Parse Failure.\\n"
                                    "odd\\nPublic ID: , System ID: \\nLine: 3, Column: 7\"";
}

// A single entry, on one line: the handler does not write to the log a second time.
void tst_TorkErrorHandler::logEntries()
{
    QFETCH(Report, report);
    QFETCH(QString, expected);
    QTemporaryDir folder;
    const MessageCapture restoresTheMessageHandler;
    TorkLog::initialize(folder.path() + "/", "test", QString(), true);
    {
        TorkErrorHandler handler(TorkLog::logger());
        report(handler, QXmlParseException("odd", 7, 3));
    }
    QVERIFY(TorkLog::logger()); // not owned by the handler
    TorkLog::shutdown();

    QString entries = QString::fromLatin1(TestFiles::read(folder.filePath("test.log")));
    entries.remove(QRegularExpression("^\\S+ \\S+ "));
    QCOMPARE(entries, expected + "\n");
}

void tst_TorkErrorHandler::destructorIsVirtual()
{
    class Derived : public TorkErrorHandler
    {
    public:
        explicit Derived(bool& destroyed) : TorkErrorHandler(nullptr), m_destroyed(destroyed) {}
        ~Derived() override { m_destroyed = true; }

    private:
        bool& m_destroyed;
    };

    bool destroyed = false;
    QXmlErrorHandler* handler = new Derived(destroyed);
    delete handler;
    QVERIFY(destroyed);
}

QTEST_GUILESS_MAIN(tst_TorkErrorHandler)
#include "tst_TorkErrorHandler.moc"
