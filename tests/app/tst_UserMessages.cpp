// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/UserMessages.h"
#include "common/log/TorkLog.h"
#include "support/TestFiles.h"

#include <QAbstractButton>
#include <QApplication>
#include <QLoggingCategory>
#include <QMessageBox>
#include <QPointer>
#include <QTemporaryDir>
#include <QTest>
#include <QTimer>

#include <functional>

namespace {

using MessageFunction = void (*)(QWidget*, QString const&, bool);

struct LogMessage
{
    QtMsgType type;
    QString text;
    QString category;
    bool hasPlace; ///< it came with a file, a line or a function
    bool boxIsStillThere;
};

QVector<LogMessage> g_messages;
QPointer<QMessageBox> g_box;

void Record(QtMsgType type, QMessageLogContext const& context, QString const& text)
{
    g_messages.append({type, text, context.category,
                       context.file != nullptr || context.line != 0 || context.function != nullptr,
                       !g_box.isNull()});
}

// What the user saw, recorded while the box was open.
struct SeenBox
{
    int count = 0;
    QString title;
    QString text;
    QString otherTexts;
    QMessageBox::Icon icon = QMessageBox::NoIcon;
    QMessageBox::StandardButtons standardButtons;
    QList<QAbstractButton*>::size_type buttons = 0;
    QWidget* parent = nullptr;
    bool modal = false;
    bool visible = false;
    int messagesBefore = -1;
};

// Inspects the box that the next event loop shows, then closes it.
class BoxCloser : public QObject
{
public:
    using Close = std::function<void(QMessageBox&)>;

    explicit BoxCloser(Close const& close = [](QMessageBox& box) {
        box.button(QMessageBox::Ok)->click();
    })
    {
        QTimer::singleShot(0, this, [this, close] {
            auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
            if (box == nullptr)
                return;
            g_box = box;
            Note(*box);
            close(*box);
        });
    }

    SeenBox seen;

private:
    void Note(QMessageBox const& box)
    {
        ++seen.count;
        seen.title = box.windowTitle();
        seen.text = box.text();
        seen.otherTexts = box.informativeText() + box.detailedText();
        seen.icon = box.icon();
        seen.standardButtons = box.standardButtons();
        seen.buttons = box.buttons().size();
        seen.parent = box.parentWidget();
        seen.modal = box.isModal();
        seen.visible = box.isVisible();
        seen.messagesBefore = g_messages.size();
    }
};

int OpenBoxes()
{
    int count = 0;
    for (QWidget const* widget : QApplication::topLevelWidgets())
        count += qobject_cast<QMessageBox const*>(widget) != nullptr ? 1 : 0;
    return count;
}

} // namespace

Q_DECLARE_METATYPE(MessageFunction)
Q_DECLARE_METATYPE(QMessageBox::Icon)
Q_DECLARE_METATYPE(QtMsgType)

class tst_UserMessages : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void init();
    void cleanup();
    void box_data();
    void box();
    void logOnly_data();
    void logOnly();
    void boxTexts_data();
    void boxTexts();
    void titles_data();
    void titles();
    void captionNeverSet();
    void parents_data();
    void parents();
    void closedByKey_data();
    void closedByKey();
    void nothingIsLoggedWhileTheBoxIsOpen();
    void twoBoxesInTurn();
    void textOfTheCallerStays();
    void inTheLogFile_data();
    void inTheLogFile();
    void stripFormatting_data();
    void stripFormatting();
    void stripFormattingReturnsItsArgument();
    void formatError_data();
    void formatError();
    void formatErrorReturnsItsArgument();
    void formatErrorOfOneObject();

private:
    QtMessageHandler m_handler = nullptr;
};

// Without a window manager Qt warns about the focus of every box.
void tst_UserMessages::initTestCase()
{
    QLoggingCategory::setFilterRules("qt.qpa.*=false");
}

void tst_UserMessages::init()
{
    qApp->setProperty("caption", "The caption");
    g_messages.clear();
    g_box.clear();
    m_handler = qInstallMessageHandler(Record);
}

void tst_UserMessages::cleanup()
{
    qInstallMessageHandler(m_handler);
    QCOMPARE(OpenBoxes(), 0);
}

void tst_UserMessages::box_data()
{
    QTest::addColumn<MessageFunction>("function");
    QTest::addColumn<QMessageBox::Icon>("icon");
    QTest::addColumn<QtMsgType>("type");

    QTest::newRow("critical") << MessageFunction(CriticalMessage) << QMessageBox::Critical
                              << QtCriticalMsg;
    QTest::newRow("warning") << MessageFunction(WarningMessage) << QMessageBox::Warning
                             << QtWarningMsg;
    QTest::newRow("debug") << MessageFunction(DebugMessage) << QMessageBox::Information
                           << QtDebugMsg;
}

void tst_UserMessages::box()
{
    QFETCH(MessageFunction, function);
    QFETCH(QMessageBox::Icon, icon);
    QFETCH(QtMsgType, type);

    const BoxCloser closer;
    function(nullptr, "a\nb\tc", true);

    QCOMPARE(closer.seen.count, 1);
    QCOMPARE(closer.seen.title, QString("The caption"));
    QCOMPARE(closer.seen.text, QString("a\nb\tc"));
    QCOMPARE(closer.seen.otherTexts, QString());
    QCOMPARE(closer.seen.icon, icon);
    QCOMPARE(closer.seen.standardButtons, QMessageBox::StandardButtons(QMessageBox::Ok));
    QCOMPARE(static_cast<int>(closer.seen.buttons), 1);
    QVERIFY(closer.seen.modal);
    QVERIFY(closer.seen.visible);
    QCOMPARE(closer.seen.messagesBefore, 0);

    QCOMPARE(g_messages.size(), 1);
    QCOMPARE(g_messages[0].type, type);
    QCOMPARE(g_messages[0].text, QString("\"a b c\""));
    QCOMPARE(g_messages[0].category, QString("default"));
    QVERIFY(!g_messages[0].hasPlace);
    QVERIFY(!g_messages[0].boxIsStillThere);
}

void tst_UserMessages::logOnly_data()
{
    box_data();
}

void tst_UserMessages::logOnly()
{
    QFETCH(MessageFunction, function);
    QFETCH(QtMsgType, type);

    const BoxCloser closer;
    function(nullptr, "a\nb\tc", false);
    QCOMPARE(g_messages.size(), 1);
    QCoreApplication::processEvents();

    QCOMPARE(closer.seen.count, 0);
    QCOMPARE(g_messages.size(), 1);
    QCOMPARE(g_messages[0].type, type);
    QCOMPARE(g_messages[0].text, QString("\"a b c\""));
    QCOMPARE(g_messages[0].category, QString("default"));
    QVERIFY(!g_messages[0].hasPlace);
}

void tst_UserMessages::boxTexts_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("logged");

    const QString line = QString("0123456789").repeated(10);
    QTest::newRow("plain") << "a"
                           << "\"a\"";
    QTest::newRow("empty") << ""
                           << "\"\"";
    QTest::newRow("null") << QString() << "\"\"";
    QTest::newRow("blanks around") << "  a  "
                                   << "\"  a  \"";
    QTest::newRow("line feeds and tabs") << "\n\ta\n\n\tb\t"
                                         << "\"  a   b \"";
    QTest::newRow("carriage return") << "a\r\nb"
                                     << "\"a\\r b\"";
    QTest::newRow("quotes and backslash") << "a\"b\\c"
                                          << "\"a\\\"b\\\\c\"";
    QTest::newRow("markup") << "<b>a</b> &amp; <br>b"
                            << "\"<b>a</b> &amp; <br>b\"";
    QTest::newRow("placeholders") << "%1 %2 %s"
                                  << "\"%1 %2 %s\"";
    QTest::newRow("letters beyond ASCII") << QString::fromUtf8("Ger\xC3\xA4t \xE2\x82\xAC")
                                          << QString::fromUtf8("\"Ger\xC3\xA4t \xE2\x82\xAC\"");
    QTest::newRow("100 kB on 1000 lines")
        << (line + "\n").repeated(1000) << "\"" + (line + " ").repeated(1000) + "\"";
    QTest::newRow("100 kB on one line") << line.repeated(1000) << "\"" + line.repeated(1000) + "\"";
    QTest::newRow("100 kB of words")
        << (line + " ").repeated(1000) << "\"" + (line + " ").repeated(1000) + "\"";
    QTest::newRow("100 kB of markup") << QString("<b>0123456789</b>").repeated(6000)
                                      << "\"" + QString("<b>0123456789</b>").repeated(6000) + "\"";
}

void tst_UserMessages::boxTexts()
{
    QFETCH(QString, text);
    const BoxCloser closer;
    CriticalMessage(nullptr, text, true);
    QCOMPARE(closer.seen.count, 1);
    QCOMPARE(closer.seen.text, text);
    QCOMPARE(closer.seen.otherTexts, QString());

    QCOMPARE(g_messages.size(), 1);
    QTEST(g_messages[0].text, "logged");
    QCOMPARE(g_messages[0].type, QtCriticalMsg);

    g_messages.clear();
    WarningMessage(nullptr, text, false);
    QCOMPARE(g_messages.size(), 1);
    QTEST(g_messages[0].text, "logged");
}

void tst_UserMessages::titles_data()
{
    QTest::addColumn<QVariant>("caption");
    QTest::addColumn<QString>("title");

    QTest::newRow("plain") << QVariant("Velocor") << "Velocor";
    QTest::newRow("empty") << QVariant("") << "";
    QTest::newRow("blanks") << QVariant(" A B ") << " A B ";
    QTest::newRow("letters beyond ASCII")
        << QVariant(QString::fromUtf8("Ger\xC3\xA4t")) << QString::fromUtf8("Ger\xC3\xA4t");
    QTest::newRow("a number becomes a text") << QVariant(42) << "42";
    QTest::newRow("not a string: empty") << QVariant(QRect(1, 2, 3, 4)) << "";
}

void tst_UserMessages::titles()
{
    QFETCH(QVariant, caption);
    qApp->setProperty("caption", caption);
    for (MessageFunction function : {CriticalMessage, WarningMessage, DebugMessage}) {
        const BoxCloser closer;
        function(nullptr, "text", true);
        QCOMPARE(closer.seen.count, 1);
        QTEST(closer.seen.title, "title");
    }
}

void tst_UserMessages::captionNeverSet()
{
    qApp->setProperty("caption", QVariant());
    for (MessageFunction function : {CriticalMessage, WarningMessage, DebugMessage}) {
        const BoxCloser closer;
        function(nullptr, "text", true);
        QCOMPARE(closer.seen.count, 1);
        QCOMPARE(closer.seen.title, QString());
    }
    QCOMPARE(g_messages.size(), 3);
}

void tst_UserMessages::parents_data()
{
    box_data();
}

void tst_UserMessages::parents()
{
    QFETCH(MessageFunction, function);
    QWidget parent;
    parent.show();
    {
        const BoxCloser closer;
        function(&parent, "text", true);
        QCOMPARE(closer.seen.parent, &parent);
    }
    const BoxCloser closer;
    function(nullptr, "text", true);
    QCOMPARE(closer.seen.count, 1);
    QVERIFY(closer.seen.parent == nullptr);
}

void tst_UserMessages::closedByKey_data()
{
    QTest::addColumn<int>("key");

    QTest::newRow("enter") << int(Qt::Key_Return);
    QTest::newRow("escape") << int(Qt::Key_Escape);
}

// A single button: every way out of the box is that button.
void tst_UserMessages::closedByKey()
{
    QFETCH(int, key);
    const BoxCloser closer(
        [key](QMessageBox& box) { QTest::keyClick(&box, static_cast<Qt::Key>(key)); });
    WarningMessage(nullptr, "text", true);
    QCOMPARE(closer.seen.count, 1);
    QCOMPARE(g_messages.size(), 1);
}

void tst_UserMessages::nothingIsLoggedWhileTheBoxIsOpen()
{
    int messagesLater = -1;
    const BoxCloser closer([&messagesLater](QMessageBox& box) {
        // The event loop runs a few times before the user decides.
        for (int turn = 0; turn < 5; ++turn)
            QCoreApplication::processEvents();
        messagesLater = g_messages.size();
        box.button(QMessageBox::Ok)->click();
    });
    CriticalMessage(nullptr, "text", true);
    QCOMPARE(messagesLater, 0);
    QCOMPARE(g_messages.size(), 1);
    QVERIFY(!g_messages[0].boxIsStillThere);
}

void tst_UserMessages::twoBoxesInTurn()
{
    {
        const BoxCloser closer;
        CriticalMessage(nullptr, "one", true);
        QCOMPARE(closer.seen.text, QString("one"));
    }
    {
        const BoxCloser closer;
        DebugMessage(nullptr, "two", true);
        QCOMPARE(closer.seen.text, QString("two"));
    }
    QCOMPARE(g_messages.size(), 2);
    QCOMPARE(g_messages[0].text, QString("\"one\""));
    QCOMPARE(g_messages[1].text, QString("\"two\""));
}

void tst_UserMessages::textOfTheCallerStays()
{
    const QString text("a\nb\tc");
    CriticalMessage(nullptr, text, false);
    WarningMessage(nullptr, text, false);
    DebugMessage(nullptr, text, false);
    QCOMPARE(text, QString("a\nb\tc"));
}

void tst_UserMessages::inTheLogFile_data()
{
    QTest::addColumn<MessageFunction>("function");
    QTest::addColumn<QByteArray>("severity");

    QTest::newRow("critical") << MessageFunction(CriticalMessage) << QByteArray("Error");
    QTest::newRow("warning") << MessageFunction(WarningMessage) << QByteArray("Warning");
    QTest::newRow("debug") << MessageFunction(DebugMessage) << QByteArray("Trace");
}

void tst_UserMessages::inTheLogFile()
{
    QFETCH(MessageFunction, function);
    QFETCH(QByteArray, severity);
    const QTemporaryDir folder;
    const QString path = folder.path() + "/";
    // A constant stamp, so that the whole file can be compared.
    QVERIFY(
        TestFiles::write(path + "settings.cfg",
                         "<LogSettings>\n<config>\n<filePrefix>app</filePrefix>\n"
                         "<dateTimeFormat>'now'</dateTimeFormat>\n</config>\n</LogSettings>\n"));
    TorkLog* log = TorkLog::initialize(path, "app", path + "settings.cfg", false);
    QVERIFY(log != nullptr);
    QCOMPARE(log->enabled(), true);

    function(nullptr, "a\nb\tc", false);
    {
        const BoxCloser closer;
        function(nullptr, "shown", true);
        QCOMPARE(closer.seen.count, 1);
    }
    TorkLog::shutdown();
    QCOMPARE(TestFiles::read(path + "app.log"),
             "now " + severity + " \"a b c\"\nnow " + severity + " \"shown\"\n");
}

void tst_UserMessages::stripFormatting_data()
{
    QTest::addColumn<QString>("text");
    QTest::addColumn<QString>("stripped");

    QTest::newRow("plain") << "abc"
                           << "abc";
    QTest::newRow("empty") << ""
                           << "";
    QTest::newRow("line feed") << "a\nb"
                               << "a b";
    QTest::newRow("tab") << "a\tb"
                         << "a b";
    QTest::newRow("line feed and tab") << "a\nb\tc"
                                       << "a b c";
    QTest::newRow("each becomes its own space") << "\n\n\t\t"
                                                << "    ";
    QTest::newRow("at both ends") << "\na\t"
                                  << " a ";
    QTest::newRow("repeated blanks stay") << "a   b"
                                          << "a   b";
    QTest::newRow("carriage return stays") << "a\r\nb\r"
                                           << "a\r b\r";
    QTest::newRow("vertical tab and form feed stay") << "a\vb\fc"
                                                     << "a\vb\fc";
    QTest::newRow("markup stays") << "<br>a&amp;"
                                  << "<br>a&amp;";
    QTest::newRow("written-out escapes stay") << "a\\nb\\tc"
                                              << "a\\nb\\tc";
    QTest::newRow("line separator of Unicode stays")
        << QString("a") + QChar(0x2028) << QString("a") + QChar(0x2028);
    QTest::newRow("a zero stays") << QString::fromLatin1("a\0\nb", 4)
                                  << QString::fromLatin1("a\0 b", 4);
    QTest::newRow("1 MB") << QString("\n\t").repeated(500000) << QString(1000000, ' ');
}

void tst_UserMessages::stripFormatting()
{
    QFETCH(QString, text);
    StripFormatting(text);
    QTEST(text, "stripped");
}

void tst_UserMessages::stripFormattingReturnsItsArgument()
{
    QString text("a\n");
    QString const& result = StripFormatting(text);
    QCOMPARE(&result, &text);
}

void tst_UserMessages::formatError_data()
{
    QTest::addColumn<QString>("error");

    QTest::newRow("plain") << "File not found";
    QTest::newRow("empty") << "";
    QTest::newRow("line breaks and tabs") << "a\r\n\tb";
    QTest::newRow("markup and placeholders") << "<b>%1</b>";
    QTest::newRow("letters beyond ASCII") << QString::fromUtf8("\xC3\xA4\xE2\x82\xAC");
}

void tst_UserMessages::formatError()
{
    QFETCH(QString, error);
    QString out("earlier");
    FormatError(error, out);
    QCOMPARE(out, error);
}

void tst_UserMessages::formatErrorReturnsItsArgument()
{
    QString out;
    QString const& result = FormatError("error", out);
    QCOMPARE(&result, &out);
}

void tst_UserMessages::formatErrorOfOneObject()
{
    QString text("error");
    FormatError(text, text);
    QCOMPARE(text, QString("error"));
}

QTEST_MAIN(tst_UserMessages)
#include "tst_UserMessages.moc"
