// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/LargeLog.h"

#include "support/ScratchFolder.h"

#include <QFile>

#include <array>

namespace {

constexpr qint64 Second = 1000; // milliseconds
constexpr qint64 Minute = 60 * Second;
constexpr qint64 Hour = 60 * Minute;
constexpr qint64 Day = 24 * Hour;
constexpr qint64 Step = 8;

constexpr int TextCount = 4096;
constexpr int ShortestText = 26; // bytes
constexpr int LongestText = 89;

// QString::asprintf() would take most of the time.
char* Put(char* at, qint64 value, int digits)
{
    for (int i = digits - 1; i >= 0; --i) {
        at[i] = char('0' + value % 10);
        value /= 10;
    }
    return at + digits;
}

void AppendStamp(QByteArray& text, qint64 time)
{
    std::array<char, 24> stamp;
    char* at = stamp.data();
    const auto put = [&](qint64 value, int digits, char after) {
        at = Put(at, value, digits);
        *at++ = after;
    };
    put(2026, 4, '-');
    put(3, 2, '-');
    put(1 + time / Day, 2, ' ');
    put(time / Hour % 24, 2, ':');
    put(time / Minute % 60, 2, ':');
    put(time / Second % 60, 2, '.');
    put(time % Second, 3, ' ');
    text.append(stamp.data(), int(stamp.size()));
}

char const* SeverityOf(quint32 draw)
{
    return draw < 600   ? "Trace "
           : draw < 950 ? "Notification "
           : draw < 990 ? "Warning "
           : draw < 999 ? "Error "
                        : "Fatal ";
}

} // namespace

LargeLog::LargeLog(qint64 firstLine) : m_number(firstLine)
{
    makeTexts();
}

void LargeLog::makeTexts()
{
    static char const* const words[] = {
        "the",   "index",   "of",     "document", "session", "user",   "has",    "been", "opened",
        "saved", "cache",   "for",    "with",     "queue",   "empty",  "retry",  "in",   "seconds",
        "table", "reading", "from",   "disk",     "image",   "loaded", "window", "no",   "changes",
        "found", "waiting", "worker", "thread",   "started", "done",   "closed", "by",   "request"};
    constexpr quint32 count = sizeof words / sizeof *words;
    m_texts.reserve(TextCount);
    for (int i = 0; i < TextCount; ++i) {
        const int length = ShortestText + int(below(LongestText - ShortestText + 1));
        QByteArray text = i % 1024 == 512 ? Text : words[below(count)];
        while (text.size() < length)
            text += QByteArray(" ") + words[below(count)];
        text.truncate(length);
        m_texts.push_back(text + '\n');
    }
}

void LargeLog::Append(QByteArray& text)
{
    AppendStamp(text, m_number * Step);
    text += SeverityOf(below(1000));
    QByteArray const& words = m_texts[below(TextCount)];
    if (m_number % 2 == 0) {
        std::array<char, 7> number;
        Put(number.data(), m_number, int(number.size()));
        text += "request ";
        text.append(number.data(), int(number.size()));
        text += " took ";
        Put(number.data(), below(10000), 4);
        text.append(number.data(), 4);
        text += " ms: ";
        text += words;
    } else {
        text += words;
    }
    ++m_number;
}

qint64 LargeLog::Write(QString const& fileName, qint64 bytes)
{
    constexpr int Buffered = 1 << 20;
    QFile file(fileName);
    Require(file.open(QIODevice::WriteOnly | QIODevice::Unbuffered), file.errorString());
    LargeLog log;
    QByteArray text;
    text.reserve(2 * Buffered);
    for (qint64 written = 0; written < bytes; written += text.size()) {
        text.resize(0);
        while (text.size() < Buffered)
            log.Append(text);
        Require(file.write(text) == text.size(), file.errorString());
    }
    return log.lines();
}
