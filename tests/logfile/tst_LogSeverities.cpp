// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/logfile/LogSeverities.h"

#include <QtTest>

using namespace Velocor;

class tst_LogSeverities : public QObject
{
    Q_OBJECT

private slots:
    void severities_data();
    void severities();
    void translatedName();
};

void tst_LogSeverities::severities_data()
{
    QTest::addColumn<int>("severity");
    QTest::addColumn<QString>("name");
    QTest::addColumn<bool>("isProblem");
    QTest::newRow("trace") << int(LogEntry::Trace) << "Trace" << false;
    QTest::newRow("notification") << int(LogEntry::Notification) << "Notification" << false;
    QTest::newRow("warning") << int(LogEntry::Warning) << "Warning" << true;
    QTest::newRow("error") << int(LogEntry::Error) << "Error" << true;
    QTest::newRow("fatal") << int(LogEntry::Fatal) << "Fatal" << true;
    QTest::newRow("none") << int(LogEntry::None) << "" << false;
}

void tst_LogSeverities::severities()
{
    QFETCH(int, severity);
    QFETCH(QString, name);
    const auto asked = static_cast<LogEntry::Severity>(severity);
    QCOMPARE(LogSeverities::LoggedName(asked), qPrintable(name));
    QCOMPARE(LogSeverities::Name(asked), name);
    QTEST(LogSeverities::IsProblem(asked), "isProblem");
}

// What a log has is translated where the framework does it, what the window shows in its catalogs.
void tst_LogSeverities::translatedName()
{
    class Translator : public QTranslator
    {
    public:
        QString translate(char const* context, char const* text, char const*, int) const override
        {
            return QString("%1/%2").arg(context, text);
        }
        bool isEmpty() const override { return false; }
    };
    Translator translator;
    QCoreApplication::installTranslator(&translator);
    QCOMPARE(LogSeverities::Name(LogEntry::Error), QString("Velocor::LogSeverities/Error"));
    QCOMPARE(LogSeverities::NameInLog(LogEntry::Error), QString("QObject/Error"));
    QCOMPARE(LogSeverities::NameInLog(LogEntry::None), QString());
    QCOMPARE(LogSeverities::LoggedName(LogEntry::Error), "Error");
    QCOMPARE(LogSeverities::Name(LogEntry::None), QString());
}

QTEST_GUILESS_MAIN(tst_LogSeverities)
#include "tst_LogSeverities.moc"
