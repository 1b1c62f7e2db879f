// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Lines of other programs' logs, in the formats that they document.

#include "app/logfile/ForeignLine.h"
#include "app/logfile/LogLineParser.h"
#include "support/GuardedBytes.h"

#include <QtTest>

#include <random>

using namespace Velocor;

Q_DECLARE_METATYPE(LogEntry::Severity)

namespace {

LogLineParser ForeignParser()
{
    LogFileType type;
    type.isForeign = true;
    type.encoding = LogEncoding::Utf8;
    type.latest = QDate(2026, 11, 25);
    LogLineParser parser;
    parser.SetFileType(type);
    return parser;
}

bool IsSame(ForeignLine const& one, ForeignLine const& other)
{
    const auto isSame = [](ForeignLine::Span a, ForeignLine::Span b) {
        return a.start == b.start && a.length == b.length;
    };
    return one.isEntry == other.isEntry && one.isSure == other.isSure &&
           isSame(one.time, other.time) && one.isEpoch == other.isEpoch &&
           one.timeKey == other.timeKey && one.hasDate == other.hasDate &&
           one.resolution == other.resolution && one.severity == other.severity &&
           isSame(one.message, other.message) && isSame(one.program, other.program) &&
           one.isEscaped == other.isEscaped;
}

// Whether each beginning of a line is read in the same way, whatever is before and after it.
bool IsCutAnywhere(QByteArray const& line)
{
    const QDate latest(2026, 11, 25);
    GuardedBytes guarded;
    for (int length = 0; length <= line.size(); ++length) {
        const QByteArray part = line.left(length);
        const ForeignLine alone = ForeignLine::Read(guarded.Put(part, true), length, latest);
        for (char next : {' ', ']', ')', ':', '=', '"', '}', '>', '[', 'E', '0', '/', 'm', '\n'}) {
            const QByteArray followed = '[' + part + QByteArray(20, next);
            if (!IsSame(ForeignLine::Read(followed.constData() + 1, length, latest), alone)) {
                qWarning("%d bytes, followed by %d", length, next);
                return false;
            }
        }
        if (!IsSame(ForeignLine::Read(guarded.Put(part, false), length, latest), alone))
            return false;
    }
    return true;
}

} // namespace

class tst_ForeignLine : public QObject
{
    Q_OBJECT

private slots:
    void formats_data();
    void formats();
    void severities_data();
    void severities();
    void noEntries_data();
    void noEntries();
    void zeroBytes();
    void longLines();
    void keys_data();
    void keys();
    void epochs_data();
    void epochs();
    void resolutions_data();
    void resolutions();
    void programs_data();
    void programs();
    void wholeLines();
    void journalExports();
    void epochText();
    void anyBytes();
};

void tst_ForeignLine::formats_data()
{
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<QString>("time");
    QTest::addColumn<LogEntry::Severity>("severity");
    QTest::addColumn<QString>("message");

    const auto none = LogEntry::None;
    const auto trace = LogEntry::Trace;
    const auto note = LogEntry::Notification;
    const auto warning = LogEntry::Warning;
    const auto error = LogEntry::Error;
    const auto fatal = LogEntry::Fatal;
    const auto row = [](char const* name, QByteArray const& line, char const* time,
                        LogEntry::Severity severity, char const* message) {
        QTest::newRow(name) << line << QString(time) << severity << QString(message);
    };

    row("date, time, level", "2026-11-22 14:03:02 ERROR disk full", "2026-11-22 14:03:02", error,
        "disk full");
    row("milliseconds after a dot", "2026-11-22 14:03:02.123 INFO x", "2026-11-22 14:03:02.123",
        note, "x");
    row("milliseconds after a comma", "2026-11-22 14:03:02,123 DEBUG x", "2026-11-22 14:03:02,123",
        trace, "x");
    row("padded level", "2026-11-22 14:03:02.123  WARN 71 --- [main] a.B : x",
        "2026-11-22 14:03:02.123", warning, "71 --- [main] a.B : x");
    row("ISO 8601, UTC", "2026-11-22T14:03:02Z error: x", "2026-11-22T14:03:02Z", error, "x");
    row("ISO 8601, offset", "2026-11-22T14:03:02.123456+01:00 host prog[7]: started",
        "2026-11-22T14:03:02.123456+01:00", none, "host prog[7]: started");
    row("ISO 8601, basic", "20261122T140302Z x", "20261122T140302Z", none, "x");
    row("time zone by name", "2026-11-22 14:03:02.123 UTC [71] FATAL:  no such role",
        "2026-11-22 14:03:02.123 UTC", fatal, "[71] FATAL:  no such role");
    row("slashes", "2026/11/22 14:03:02 listening", "2026/11/22 14:03:02", none, "listening");
    row("German date", "22.11.2026 14:03:02 WARNUNG x", "22.11.2026 14:03:02", none, "WARNUNG x");
    row("time only", "14:03:02.5 [warn] x", "14:03:02.5", warning, "x");
    row("twelve hours, after noon", "11/22/2026 02:03:02 PM ERROR x", "11/22/2026 02:03:02 PM",
        error, "x");
    row("twelve hours, one digit", "1/2/2026 9:03:02.5 AM - INFO - x", "1/2/2026 9:03:02.5 AM",
        note, "x");
    row("java.util.logging", "Nov 22, 2026 2:03:02 PM a.B main", "Nov 22, 2026 2:03:02 PM", none,
        "a.B main");
    row("time alone", "2026-11-22 14:03:02", "2026-11-22 14:03:02", none, "");

    row("stamp and level in brackets", "[2026-11-22 14:03:02.123] [error] x",
        "2026-11-22 14:03:02.123", error, "x");
    row("level in angle brackets", "2026-11-22 14:03:02 <error> x", "2026-11-22 14:03:02", error,
        "x");
    row("level in braces", "2026-11-22 14:03:02 {ERROR} x > y", "2026-11-22 14:03:02", error,
        "x > y");
    row("a logger's name between them", "[2026-11-22 14:03:02.123] [net] [warning] x",
        "2026-11-22 14:03:02.123", warning, "[net] [warning] x");
    row("level within the stamp's brackets", "[2026-11-22T14:03:02Z WARN  net::io] x",
        "2026-11-22T14:03:02Z", warning, "net::io] x");
    row("a thread between them", "2026-11-22 14:03:02,123 [http thread 1] ERROR a.B - x",
        "2026-11-22 14:03:02,123", error, "[http thread 1] ERROR a.B - x");
    row("Python logging", "2026-11-22 14:03:02,123 - net.io - WARNING - slow",
        "2026-11-22 14:03:02,123", warning, "net.io - WARNING - slow");
    row("Python logging without a time", "CRITICAL:root:out of memory", "", fatal,
        "root:out of memory");
    row("level in brackets without a time", "[WARNING] 3 tests skipped", "", warning,
        "3 tests skipped");
    row("level before the stamp", "INFO 2026-11-22 14:03:02,123 x", "2026-11-22 14:03:02,123", note,
        "x");
    row("compiler", "error: linker failed", "", error, "linker failed");
    row("Ruby", "W, [2026-11-22T14:03:02.123456 #71]  WARN -- : x", "2026-11-22T14:03:02.123456",
        warning, "#71]  WARN -- : x");
    row("letter and stamp", "E1122 14:03:02.123456 71 file.cc:12] x", "1122 14:03:02.123456", error,
        "71 file.cc:12] x");
    row("letter and stamp in brackets", "[I 2026-11-22 14:03:02.123 ServerApp] x",
        "2026-11-22 14:03:02.123", note, "ServerApp] x");
    row("letter and short date", "[E 261122 14:03:02 web:1] 500 GET /", "261122 14:03:02", error,
        "web:1] 500 GET /");
    row("Android", "11-22 14:03:02.123  1200  1203 E Camera: lost", "11-22 14:03:02.123", error,
        "1200  1203 E Camera: lost");
    row("colors of a terminal",
        "\x1b[32m2026-11-22 14:03:02\x1b[0m \x1b[1;31mERROR\x1b[0m disk full",
        "2026-11-22 14:03:02", error, "disk full");
    row("a color around all", "\x1b[33m[2026-11-22 14:03:02] [warn] x", "2026-11-22 14:03:02",
        warning, "x");
    row("a color around the level", "\x1b[31m[ERROR]\x1b[0m x", "", error, "x");
    row("colors within the message", "2026-11-22 14:03:02 INFO a \x1b[1mb\x1b[0m",
        "2026-11-22 14:03:02", note, "a \x1b[1mb\x1b[0m");
    row("Redis", "71:M 22 Nov 2026 14:03:02.123 * Ready", "22 Nov 2026 14:03:02.123", none,
        "71:M 22 Nov 2026 14:03:02.123 * Ready");
    row("MySQL", "2026-11-22T14:03:02.123456Z 0 [Warning] [MY-010068] [Server] x",
        "2026-11-22T14:03:02.123456Z", warning, "0 [Warning] [MY-010068] [Server] x");
    row("Go with slog text", "time=2026-11-22T14:03:02.123Z level=WARN msg=\"disk \\\"a\\\" slow\"",
        "2026-11-22T14:03:02.123Z", warning, "disk \"a\" slow");

    row("Apache", "[Sun Nov 22 14:03:02.123456 2026] [core:error] [pid 71:tid 1] AH00126: x",
        "Sun Nov 22 14:03:02.123456 2026", error, "[pid 71:tid 1] AH00126: x");
    row("Apache, older", "[Sun Nov 22 14:03:02 2026] [notice] x", "Sun Nov 22 14:03:02 2026", note,
        "x");
    row("nginx", "2026/11/22 14:03:02 [crit] 71#71: *1 x", "2026/11/22 14:03:02", fatal,
        "71#71: *1 x");
    row("access log", "127.0.0.1 - - [22/Nov/2026:14:03:02 +0000] \"GET / HTTP/1.1\" 200 5",
        "22/Nov/2026:14:03:02 +0000", none,
        "127.0.0.1 - - [22/Nov/2026:14:03:02 +0000] \"GET / HTTP/1.1\" 200 5");

    row("RFC 3164", "Nov 22 14:03:02 host sshd[71]: Accepted key", "Nov 22 14:03:02", none,
        "host sshd[71]: Accepted key");
    row("RFC 3164, one digit", "Nov  2 14:03:02 host cron[71]: x", "Nov  2 14:03:02", none,
        "host cron[71]: x");
    row("RFC 3164, level after the tag", "Nov 22 14:03:02 host app[71]: ERROR disk full",
        "Nov 22 14:03:02", error, "host app[71]: ERROR disk full");
    row("RFC 3164, level with a colon", "Nov 22 14:03:02 host app: warning: disk full",
        "Nov 22 14:03:02", warning, "host app: warning: disk full");
    row("RFC 3164, a word of the message", "Nov 22 14:03:02 host kernel: Error reading x",
        "Nov 22 14:03:02", none, "host kernel: Error reading x");
    row("RFC 3164, a severity further on", "Nov 22 14:03:02 host app[71]: ended with ERROR 7",
        "Nov 22 14:03:02", none, "host app[71]: ended with ERROR 7");
    row("RFC 3164 with its priority", "<34>Oct 11 22:14:15 mymachine su: 'su root' failed",
        "Oct 11 22:14:15", fatal, "mymachine su: 'su root' failed");
    row("RFC 5424", "<165>1 2003-10-11T22:14:15.003Z host app - ID47 - x",
        "2003-10-11T22:14:15.003Z", note, "host app - ID47 - x");
    row("RFC 5424 without a time", "<11>1 - host app - - - x", "", error, "- host app - - - x");
    row("journal, short-full", "Sun 2026-11-22 14:03:02 UTC host app[71]: x",
        "Sun 2026-11-22 14:03:02 UTC", none, "host app[71]: x");
    row("journal, short-monotonic", "[   12.345678] host app[71]: x", "12.345678", none,
        "host app[71]: x");
    row("kernel", "[    0.000000] Linux version 6.1", "0.000000", none, "Linux version 6.1");
    row("kernel with its priority", "<4>[    1.250000] ACPI: x", "1.250000", warning, "ACPI: x");
    row("kernel, decoded", "kern  :err   : [    1.250000] ata1: x", "1.250000", error, "ata1: x");
    row("kernel, time of day", "[Sun Nov 22 14:03:02 2026] usb 1-1: x", "Sun Nov 22 14:03:02 2026",
        none, "usb 1-1: x");
    row("X server", "[    12.345] (EE) Failed to load module", "12.345", error,
        "Failed to load module");
    row("X server, information", "[    12.345] (**) Option x", "12.345", note, "Option x");

    row("dpkg", "2026-11-22 14:03:02 status installed libc6:amd64 2.36", "2026-11-22 14:03:02",
        none, "status installed libc6:amd64 2.36");
    row("apt history", "Start-Date: 2026-11-22  14:03:02", "2026-11-22  14:03:02", none,
        "Start-Date: 2026-11-22  14:03:02");
    row("apt terminal", "Log started: 2026-11-22  14:03:02", "2026-11-22  14:03:02", none,
        "Log started: 2026-11-22  14:03:02");
    row("alternatives", "update-alternatives 2026-11-22 14:03:02: run with x",
        "2026-11-22 14:03:02", none, "update-alternatives 2026-11-22 14:03:02: run with x");

    row("level in small letters", "2026-11-22 14:03:02 error x", "2026-11-22 14:03:02", error, "x");
    row("level in small letters, second word", "2026-11-22 14:03:02 a error x",
        "2026-11-22 14:03:02", none, "a error x");
    row("everyday level in small letters", "2026-11-22 14:03:02 note x", "2026-11-22 14:03:02",
        none, "note x");
    row("everyday level with a colon", "2026-11-22 14:03:02 note: x", "2026-11-22 14:03:02", note,
        "x");
    row("bars", "2026-11-22 14:03:02 | ERROR | x", "2026-11-22 14:03:02", error, "x");
    row("bar right after the level", "2026-11-22 14:03:02 ERROR|x", "2026-11-22 14:03:02", error,
        "x");
    row("commas", "2026-11-22 14:03:02,ERROR,x", "2026-11-22 14:03:02", error, "x");
    row("minus before a number is kept", "2026-11-22 14:03:02 ERROR - -5", "2026-11-22 14:03:02",
        error, "-5");
    row("minus at the end", "2026-11-22 14:03:02 ERROR -", "2026-11-22 14:03:02", error, "");
    row("letter in brackets", "2026-11-22 14:03:02 [W] x", "2026-11-22 14:03:02", warning, "x");
    row("letter in brackets, with blanks", "2026-11-22 14:03:02 [ W ] x", "2026-11-22 14:03:02",
        warning, "x");
    row("level in brackets, with blanks", "2026-11-22 14:03:02 [ error\t] x", "2026-11-22 14:03:02",
        error, "x");
    row("only blanks in brackets", "2026-11-22 14:03:02 [ ] x", "2026-11-22 14:03:02", none,
        "[ ] x");
    row("empty brackets", "2026-11-22 14:03:02 [] x", "2026-11-22 14:03:02", none, "[] x");
    row("level before a slash", "2026-11-22 14:03:02 [INFO/Main] x", "2026-11-22 14:03:02", note,
        "x");
    row("level before a colon", "2026-11-22 14:03:02 [error:core] x", "2026-11-22 14:03:02", none,
        "[error:core] x");
    row("open bracket", "2026-11-22 14:03:02 [error x", "2026-11-22 14:03:02", none, "[error x");
    row("symbol and letters", "2026-11-22 14:03:02 (WW) x", "2026-11-22 14:03:02", warning, "x");
    row("letter in parentheses", "2026-11-22 14:03:02 (W) x", "2026-11-22 14:03:02", none, "(W) x");
    row("level as the sixth word", "2026-11-22 14:03:02 a b c d e ERROR x", "2026-11-22 14:03:02",
        error, "a b c d e ERROR x");
    row("level as the seventh word", "2026-11-22 14:03:02 a b c d e f ERROR x",
        "2026-11-22 14:03:02", none, "a b c d e f ERROR x");
    row("level with a digit", "2026-11-22 14:03:02 DEBUG5 x", "2026-11-22 14:03:02", trace, "x");
    row("level after a digit", "2026-11-22 14:03:02 5DEBUG x", "2026-11-22 14:03:02", none,
        "5DEBUG x");
    row("level before a color", "2026-11-22 14:03:02 ERROR\x1b[0m x", "2026-11-22 14:03:02", error,
        "x");
    row("level before a plus sign", "2026-11-22 14:03:02 ERROR+ x", "2026-11-22 14:03:02", none,
        "ERROR+ x");
    row("short escape sequence", "\x1b[m2026-11-22 14:03:02 x", "2026-11-22 14:03:02", none, "x");
    row("two escape sequences", "\x1b[0m\x1b[1;31mERROR: x", "", error, "x");
    row("stamp in parentheses", "(2026-11-22 14:03:02) x", "2026-11-22 14:03:02", none, "x");
    row("access log without an address", "-[22/Nov/2026:14:03:02 +0000] x",
        "22/Nov/2026:14:03:02 +0000", none, "-[22/Nov/2026:14:03:02 +0000] x");
    row("access stamp first", "[22/Nov/2026:14:03:02 +0000] x", "22/Nov/2026:14:03:02 +0000", none,
        "x");
    row("process of one digit", "7:C 22 Nov 2026 14:03:02.123 * x", "22 Nov 2026 14:03:02.123",
        none, "7:C 22 Nov 2026 14:03:02.123 * x");
    row("apt, end", "End-Date: 2026-11-22  14:03:02", "2026-11-22  14:03:02", none,
        "End-Date: 2026-11-22  14:03:02");
    row("apt terminal, end", "Log ended: 2026-11-22  14:03:02", "2026-11-22  14:03:02", none,
        "Log ended: 2026-11-22  14:03:02");
    row("priority 0", "<0>x", "", fatal, "x");
    row("greatest priority", "<191>x", "", trace, "x");
    row("priority of three digits, without a version", "<165>Nov 22 14:03:02 h x",
        "Nov 22 14:03:02", note, "h x");
    row("letter, comma and stamp without a level", "E, [2026-11-22T14:03:02 #71] x",
        "2026-11-22T14:03:02", error, "#71] x");
    row("level and stamp in brackets", "[INFO] [2026-11-22 14:03:02] x", "2026-11-22 14:03:02",
        note, "x");
    row("level first, another later", "ERROR: 2026-11-22 14:03:02 WARN x", "2026-11-22 14:03:02",
        error, "WARN x");
    row("ids and a letter, further on", "11-22 14:03:02.123  1200  1203 a E x",
        "11-22 14:03:02.123", error, "1200  1203 a E x");
    row("a letter without ids", "2026-11-22 14:03:02 1200 E x", "2026-11-22 14:03:02", none,
        "1200 E x");
    row("kernel, facility with blanks", "daemon :notice: x", "", note, "x");
    row("kernel, facility without blanks", "user:info:x", "", note, "x");
    row("access stamp after a prefix", "Log ended: [22/Nov/2026:14:03:02 +0000] x",
        "22/Nov/2026:14:03:02 +0000", none, "Log ended: [22/Nov/2026:14:03:02 +0000] x");
    row("priority, and a letter that is none", "<34>E, [x] y", "", fatal, "E, [x] y");
    row("JSON, empty message before another", R"({"message":"","level":"info","msg":"x"})", "",
        note, "x");
    row("RFC 5424, one letter after the version", "<11>1 x", "", error, "x");
    row("a priority and one digit", "<11>1 ", "", error, "1 ");
    row("kernel, facility of eight letters", "authpriv:err: x", "", error, "x");
    row("Ruby, nothing after the stamp", "I, [2026-11-22T14:03:02] x", "2026-11-22T14:03:02", note,
        "x");
    row("level at the end of the stamp's brackets", "[2026-11-22T14:03:02Z WARN] x",
        "2026-11-22T14:03:02Z", warning, "x");
    row("two words in front of the level, one in brackets", "2026-11-22 14:03:02 [net] a ERROR x",
        "2026-11-22 14:03:02", error, "[net] a ERROR x");
    row("level first, another as the stamp's letter", "ERROR I1122 14:03:02.000000 x",
        "1122 14:03:02.000000", error, "x");
    row("slashes in brackets that are no date", "2026-11-22 14:03:02 ERROR [ab/cde/fghijklm] x",
        "2026-11-22 14:03:02", error, "[ab/cde/fghijklm] x");
    row("JSON", R"({"time":"2026-11-22T14:03:02Z","level":"error","msg":"disk full"})",
        "2026-11-22T14:03:02Z", error, "disk full");
    row("JSON, level by number", R"({"level":50,"time":"14:03:02","pid":71,"msg":"x"})", "14:03:02",
        error, "x");
    row("JSON, syslog level", R"({"level":4,"short_message":"x"})", "", warning, "x");
    row("JSON, escapes", R"({"message":"a\"b\\c\né\/\q","severity":"WARNING"})", "", warning,
        "a\"b\\c\n\xC3\xA9/\\q");
    row("JSON, nested objects do not count",
        R"({"a":{"level":"fatal","b":["}"]},"level":"info","message":"x"})", "", note, "x");
    row("JSON, blanks", R"({ "ts" : "2026-11-22 14:03:02" , "level" : "debug" , "msg" : "x" })",
        "2026-11-22 14:03:02", trace, "x");
    row("JSON of the journal", R"({"PRIORITY":"3","MESSAGE":"x","_PID":"71"})", "", error, "x");
    row("JSON of containers", R"({"log":"x\n","stream":"stderr","time":"2026-11-22T14:03:02.1Z"})",
        "2026-11-22T14:03:02.1Z", none, "x\n");
    row("JSON of containers, severity of what they wrote",
        R"({"log":"2026-11-22 14:03:02 ERROR full\n","stream":"stdout","time":"09:00:00"})",
        "09:00:00", error, "2026-11-22 14:03:02 ERROR full\n");
    row("JSON of containers, with a severity",
        R"({"log":"ERROR full\n","level":"info","time":"09:00:00"})", "09:00:00", note,
        "ERROR full\n");
    row("only what containers wrote is searched", R"({"time":"09:00:00","msg":"ERROR full"})",
        "09:00:00", none, "ERROR full");
    row("JSON of a database",
        R"({"t":{"$date":"2026-11-22T14:03:02.123+00:00"},"s":"E","c":"NETWORK","msg":"full"})",
        "2026-11-22T14:03:02.123+00:00", error, "full");
    row("JSON of a database, debug level",
        R"({"t" : { "$date" : "2026-11-22 14:03:02" } ,"s":"D2","msg":"x"})", "2026-11-22 14:03:02",
        trace, "x");
    row("an object that is no date", R"({"t":{"$data":"2026-11-22 14:03:02"},"s":"I","msg":"x"})",
        "", note, "x");
    row("JSON, several times and messages",
        R"({"date":"2026-11-20","timestamp":"2026-11-22 14:03:02","t":"09:00:00","event":"a",)"
        R"("message":"b","text":"c","severity":"info","priority":"3"})",
        "2026-11-22 14:03:02", note, "b");
    row("JSON, a time that is none before another", R"({"time":"soon","t":"09:00:00","msg":"x"})",
        "09:00:00", none, "x");
    row("JSON, a level that is none before another",
        R"({"level":"high","severity":"warning","msg":"x"})", "", warning, "x");
    row("JSON, the same name twice",
        R"({"t":"09:00:00","t":"10:00:00","s":"E","s":"I","msg":"a","msg":"b"})", "09:00:00", error,
        "a");
    row("JSON, empty level", R"({"level":"","msg":"x"})", "", none, "x");
    row("JSON, level of three digits", R"({"level":"030","msg":"x"})", "", note, "x");
    row("JSON, level of four digits", R"({"level":"0030","msg":"x"})", "", none, "x");
    row("JSON without a message", R"({"level":"info","a":1})", "", note,
        R"({"level":"info","a":1})");
    row("JSON that is cut", R"({"level":"info","msg":"abc)", "", note,
        R"({"level":"info","msg":"abc)");
    row("journal export", "__CURSOR=s=1\nPRIORITY=4\nMESSAGE=a\n_PID=7", "", warning, "a");
    constexpr char sized[] = "__CURSOR=s=1\nPRIORITY=2\nMESSAGE\n\x03\0\0\0\0\0\0\0a\nb\n_PID=7";
    row("journal export, value with its size", QByteArray(sized, sizeof sized - 1), "", fatal,
        "a\nb");
}

void tst_ForeignLine::formats()
{
    QFETCH(QByteArray, line);
    const LogEntry entry = ForeignParser().Parse(line);
    QVERIFY(entry.isEntry);
    QTEST(entry.time, "time");
    QTEST(entry.severity, "severity");
    QTEST(entry.message, "message");

    // What the index finds is what the table shows.
    const LogLineParser::Parts parts = ForeignParser().Find(line.constData(), line.size());
    QVERIFY(parts.isEntry);
    QCOMPARE(parts.severity, entry.severity);
    QCOMPARE(parts.timeLength > 0, !entry.time.isEmpty());
    QCOMPARE(parts.timeKey >= 0, !entry.time.isEmpty());

    const bool hasDate = entry.time.contains(QRegularExpression("[-/ ]|[0-9]T|\\d\\.\\d+\\."));
    QCOMPARE(parts.hasDate, hasDate);
    QVERIFY(IsCutAnywhere(line));
}

void tst_ForeignLine::severities_data()
{
    QTest::addColumn<LogEntry::Severity>("severity");
    const auto rows = [](LogEntry::Severity severity, QStringList const& names) {
        for (QString const& name : names)
            QTest::newRow(qPrintable(name)) << severity;
    };
    rows(LogEntry::Fatal, {"EMERG", "PANIC", "ALERT", "CRIT", "CRITICAL", "FATAL"});
    rows(LogEntry::Error, {"ERROR", "ERR", "SEVERE"});
    rows(LogEntry::Warning, {"WARNING", "WARN"});
    rows(LogEntry::Notification, {"NOTICE", "INFO", "LOG", "SUCCESS"});
    rows(LogEntry::Trace, {"DEBUG", "TRACE", "VERBOSE", "FINE", "FINEST"});
    rows(LogEntry::None, {"INFOS", "XERROR", "GET", "ER"});
}

void tst_ForeignLine::severities()
{
    QFETCH(LogEntry::Severity, severity);
    const QByteArray name(QTest::currentDataTag());
    const LogLineParser parser = ForeignParser();
    const QByteArray stamp("2026-11-22 14:03:02 ");
    QCOMPARE(parser.Parse(stamp + name + " x").severity, severity);
    QCOMPARE(parser.Parse(stamp + '[' + name.toLower() + "] x").severity, severity);
    QCOMPARE(parser.Parse("{\"level\":\"" + name.toLower() + "\"}").severity, severity);
}

void tst_ForeignLine::noEntries_data()
{
    QTest::addColumn<QByteArray>("line");
    const auto row = [](char const* name, char const* line) {
        QTest::newRow(name) << QByteArray(line);
    };
    row("empty", "");
    row("text", "and so on");
    row("stack trace", "    at a.b.C.run(C.java:12)");
    row("stack trace of Python", "  File \"a.py\", line 12, in f");
    row("indented stamp of more than a blank", "    2026-11-22 14:03:02 x");
    row("everyday word", "Note that this is text");
    row("hour of more than twelve with PM", "11/22/2026 14:03:02 PM x");
    row("severity in small letters", "error in line 3");
    row("list", "[1] a source");
    row("list of letters", "[x] done");
    row("impossible month", "2026-13-22 14:03:02 x");
    row("impossible day", "2026-11-32 14:03:02 x");
    row("impossible minute", "2026-11-22 14:63:02 x");
    row("longer number", "2026-11-22 14:03:021 x");
    row("a version", "10.2.2026 is no time");
    row("priority out of range", "<192>x");
    row("markup", "<b>x</b>");
    row("empty JSON", "{}");
    row("JSON without known members", "{\"a\":1}");
    row("assignment", "a=1 b=2");
    row("list of a level's letter", "[E] done");
    row("letter, comma and no stamp", "E, [x] y");
    row("JSON, no time", R"({"time":"soon"})");
    row("level after what is no stamp", "Log started: ERROR: x");
    row("facility without a level", "kern : x : y");
    row("facility without a second colon", "kern :err x");
    row("priority without a digit", "<>x");
    row("priority of four digits", "<0034>x");
    row("priority that is not closed", "<34 x");
    row("only a priority's bracket", "<");
    row("seconds without brackets", "12.345678 x");
    row("seconds in parentheses", "(12.345678) x");
    row("seconds and more in brackets", "[12.345678 x] y");
    row("small letter and stamp", "e1122 14:03:02.123456 x");
    row("letter, blank and compact stamp", "x E1122 14:03:02");
    row("blank before known pairs", " level=error msg=x");
    row("symbol without a time", "(EE) failed");
    row("only a level's letter in brackets", "[E]");
    row("empty brackets first", "[] x");
    row("unknown facility", "game  :err   : x");
    row("process without a number", ":M 22 Nov 2026 14:03:02.123 * Ready");
    row("process that is no number", "x:M 22 Nov 2026 14:03:02.123 * Ready");
    row("letter, blank and stamp without brackets", "E 2026-11-22 14:03:02 x");
    row("unknown pair first", "a=1 level=error msg=x");
}

void tst_ForeignLine::noEntries()
{
    QFETCH(QByteArray, line);
    const LogEntry entry = ForeignParser().Parse(line);
    QVERIFY(!entry.isEntry);
    QCOMPARE(entry.time, QString());
    QCOMPARE(entry.severity, LogEntry::None);
    QCOMPARE(entry.message, QString::fromUtf8(line));
    QVERIFY(IsCutAnywhere(line));
}

// The log may have been damaged.
void tst_ForeignLine::zeroBytes()
{
    const QByteArray start("2026-11-22 14:03:02 ERROR a");
    const QByteArray whole = start + '\0' + "b";
    const ForeignLine line = ForeignLine::Read(whole.constData(), whole.size(), QDate());
    QCOMPARE(line.severity, LogEntry::Error);
    QCOMPARE(line.message.start, start.size() - 1);
    QCOMPARE(line.message.length, 3);
}

// A severity counts in the first 512 bytes, and so do colors.
void tst_ForeignLine::longLines()
{
    const QByteArray stamp("2026-11-22 14:03:02 ");
    for (int end : {511, 512, 513}) { // of the severity
        QByteArray line = stamp + '[' + QByteArray(end - 28, 'x') + "] ERROR";
        QCOMPARE(line.size(), end);
        line += QByteArray(900, ' ');
        const ForeignLine found = ForeignLine::Read(line.constData(), line.size(), QDate());
        QVERIFY(found.isEntry);
        QCOMPARE(found.severity, end <= 512 ? LogEntry::Error : LogEntry::None);
        QCOMPARE(found.message.start, stamp.size());
        QCOMPARE(found.message.length, line.size() - stamp.size());
    }
    for (char const* last : {"\x1b[0m", "\x1b[31m"}) { // ends at 512 or 513
        const QByteArray line = QByteArray("\x1b[0m").repeated(127) + last + "ERROR: x";
        const ForeignLine found = ForeignLine::Read(line.constData(), line.size(), QDate());
        QCOMPARE(found.isEntry, line.indexOf('E') == 512);
    }
}

// Which of two stamps is later, and by how much.
void tst_ForeignLine::keys_data()
{
    QTest::addColumn<QByteArray>("earlier");
    QTest::addColumn<QByteArray>("later");
    QTest::addColumn<qint64>("difference");
    const auto row = [](char const* name, char const* earlier, char const* later,
                        qint64 difference) {
        QTest::newRow(name) << QByteArray(earlier) << QByteArray(later) << difference;
    };
    const qint64 day = 24 * 60 * 60 * 1000;
    row("milliseconds", "2026-11-22 14:03:02.1 x", "2026-11-22 14:03:02,123456 x", 23);
    row("months", "2026-02-28 14:03:02 x", "2026-03-01 14:03:02 x", day);
    row("months by name", "Feb 28 14:03:02 x", "Mar  1 14:03:02 x", day);
    row("a year that is not written", "Dec 31 14:03:02 x", "Jan  1 14:03:02 x", day);
    row("a few days ahead", "Nov 22 14:03:02 x", "Dec  2 14:03:02 x", 10 * day);
    row("different formats", "Nov 22 14:03:02 x", "[Sun Nov 22 14:03:03.5 2026] x", 1500);
    row("with the log's own", "2026-11-22 14:03:02.100 x", "2026-11-22T14:03:02.200 x", 100);
    row("seconds since the start", "[    1.250000] x", "[   12.345] x", 11095);
    row("twelve hours", "11/22/2026 2:03:02 PM x", "2026-11-22 14:03:02 x", 0);
    row("after midnight", "11/22/2026 12:30:00 AM x", "2026-11-22 00:30:00 x", 0);
    row("after noon", "11/22/2026 12:30:00 PM x", "2026-11-22 12:30:00 x", 0);
    row("seconds since 1970", R"({"ts":1795442582})", R"({"ts":1795442582.250})", 250);
    row("from 1970 on", R"({"ts":"0000000000"})", R"({"ts":"0000000001.5"})", 1500);
    row("compact", "I1122 14:03:02.000000 x", "E20261122 14:03:02.500 x", 500);
}

void tst_ForeignLine::keys()
{
    QFETCH(QByteArray, earlier);
    QFETCH(QByteArray, later);
    const LogLineParser parser = ForeignParser();
    const qint64 first = parser.Find(earlier.constData(), earlier.size()).timeKey;
    const qint64 second = parser.Find(later.constData(), later.size()).timeKey;
    QVERIFY(first >= 0);
    QTEST(second - first, "difference");
}

void tst_ForeignLine::epochs_data()
{
    QTest::addColumn<QByteArray>("line");
    const auto row = [](char const* name, char const* line) {
        QTest::newRow(name) << QByteArray(line);
    };
    row("seconds", R"({"ts":1795442582,"level":"info"})");
    row("fraction", R"({"ts":1795442582.000123,"level":"info"})");
    row("milliseconds", R"({"time":1795442582000,"level":30})");
    row("microseconds", R"({"__REALTIME_TIMESTAMP":"1795442582000000","PRIORITY":"6"})");
    row("nanoseconds", R"({"ts":1795442582000000000,"level":"info"})");
    row("journal export", "__CURSOR=s=1\n__REALTIME_TIMESTAMP=1795442582000000\nPRIORITY=6");
}

void tst_ForeignLine::epochs()
{
    QFETCH(QByteArray, line);
    const QDateTime time = QDateTime::fromMSecsSinceEpoch(1795442582000);
    const LogEntry entry = ForeignParser().Parse(line);
    QCOMPARE(entry.time, time.toString("yyyy-MM-dd hh:mm:ss.zzz"));
    QCOMPARE(entry.severity, LogEntry::Notification);
    const QByteArray written = time.toString("yyyy-MM-dd hh:mm:ss.zzz INFO x").toLatin1();
    const LogLineParser parser = ForeignParser();
    QVERIFY(parser.Find(line.constData(), line.size()).hasDate);
    QCOMPARE(parser.Find(line.constData(), line.size()).timeKey,
             parser.Find(written.constData(), written.size()).timeKey);
}

void tst_ForeignLine::epochText()
{
    const QString format("yyyy-MM-dd hh:mm:ss.zzz");
    QCOMPARE(ForeignLine::EpochText("0000000000", 10),
             QDateTime::fromMSecsSinceEpoch(0).toString(format));
    QCOMPARE(ForeignLine::EpochText("1795442582.25", 13),
             QDateTime::fromMSecsSinceEpoch(1795442582250).toString(format));
    QCOMPARE(ForeignLine::EpochText("17954425825", 10),
             QDateTime::fromMSecsSinceEpoch(1795442582000).toString(format));
    QCOMPARE(ForeignLine::EpochText("179544258", 9), QString());
}

// How far the stamp may be off, in milliseconds.
void tst_ForeignLine::resolutions_data()
{
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<int>("resolution");
    const auto row = [](char const* name, char const* line, int resolution) {
        QTest::newRow(name) << QByteArray(line) << resolution;
    };
    row("seconds", "2026-11-22 14:03:02 x", 1000);
    row("fraction", "2026-11-22 14:03:02.5 x", 1);
    row("seconds in an object", R"({"time":"2026-11-22 14:03:02"})", 1000);
    row("fraction in an object", R"({"time":"2026-11-22 14:03:02.5"})", 1);
    row("seconds since 1970", R"({"time":1795442582})", 1);
}

void tst_ForeignLine::resolutions()
{
    QFETCH(QByteArray, line);
    QTEST(ForeignLine::Read(line.constData(), line.size(), QDate()).resolution, "resolution");
}

void tst_ForeignLine::programs_data()
{
    QTest::addColumn<QByteArray>("line");
    QTest::addColumn<QByteArray>("program");
    const auto row = [](char const* name, char const* line, char const* program) {
        QTest::newRow(name) << QByteArray(line) << QByteArray(program);
    };
    row("identifier", R"({"SYSLOG_IDENTIFIER":"app","MESSAGE":"x"})", "app");
    row("command", R"({"_COMM":"app.bin","MESSAGE":"x"})", "app.bin");
    row("identifier before the command",
        R"({"SYSLOG_IDENTIFIER":"app","_COMM":"app.bin","MESSAGE":"x"})", "app");
    row("identifier after the command",
        R"({"_COMM":"app.bin","SYSLOG_IDENTIFIER":"app","MESSAGE":"x"})", "app");
    row("the same name twice", R"({"_COMM":"a","_COMM":"b","MESSAGE":"x"})", "a");
    row("neither", R"({"MESSAGE":"x"})", "");
}

void tst_ForeignLine::programs()
{
    QFETCH(QByteArray, line);
    const ForeignLine found = ForeignLine::Read(line.constData(), line.size(), QDate());
    QTEST(line.mid(found.program.start, found.program.length), "program");
}

void tst_ForeignLine::wholeLines()
{
    const ForeignLine found = ForeignLine::Read("and so on", 9, QDate());
    QVERIFY(!found.isEntry);
    QCOMPARE(found.message.start, 0);
    QCOMPARE(found.message.length, 9);
}

void tst_ForeignLine::journalExports()
{
    QVERIFY(ForeignLine::IsJournalExport("__CURSOR=", 9));
    QVERIFY(!ForeignLine::IsJournalExport("__CURSOR=", 8));
    QVERIFY(!ForeignLine::IsJournalExport("__CURSOR:", 9));
}

// No bytes are read beyond the line, and the parts are within it. Also meant for the sanitizers.
void tst_ForeignLine::anyBytes()
{
    std::mt19937 random(1);
    constexpr char sized[] = "__CURSOR=s=1\nMESSAGE\n\x03\0\0\0\0\0\0\0a\nb\nPRIORITY=7";
    const QByteArray seeds[] = {
        "<34>1 2026-11-22T14:03:02.123Z host app[71]: ERROR x",
        "[Sun Nov 22 14:03:02.123456 2026] [core:error] (EE) x",
        "kern  :err   : [    1.250000] W, [2026-11-22 14:03:02 x",
        R"({"time":1795442582.5,"level":"er\"ror","a":{"b":[1]},"msg":"x\u00e9"})",
        "time=2026-11-22T14:03:02.123Z level=WARN msg=\"disk \\\"a\\\" slow\"",
        QByteArray(sized, sizeof sized - 1),
    };
    for (int i = 0; i < 60000; ++i) {
        QByteArray line = seeds[random() % 6];
        line.truncate(static_cast<int>(random() % static_cast<unsigned>(line.size() + 1)));
        for (int change = static_cast<int>(random() % 4); change > 0 && !line.isEmpty(); --change)
            line[static_cast<int>(random() % static_cast<unsigned>(line.size()))] =
                static_cast<char>(random());
        const std::vector<char> exact(line.begin(), line.end());
        const ForeignLine found = ForeignLine::Read(exact.data(), line.size(), QDate(2026, 11, 22));
        QVERIFY(found.time.start >= 0 && found.time.length >= 0);
        QVERIFY(found.time.start + found.time.length <= line.size());
        QVERIFY(found.message.start >= 0 && found.message.length >= 0);
        QVERIFY(found.message.start + found.message.length <= line.size());
        QVERIFY(found.isEntry || found.severity == LogEntry::None);
        ForeignParser().Parse(line);
    }
}

QTEST_GUILESS_MAIN(tst_ForeignLine)
#include "tst_ForeignLine.moc"
