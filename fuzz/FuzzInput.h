// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QString>

#include <cstdint>
#include <cstdio>
#include <cstdlib>
#include <cstring>

/// Hands out the bytes of a fuzzer's input piece by piece; past the end everything is zero.
class FuzzInput
{
public:
    FuzzInput(uint8_t const* data, size_t size) : m_data(data), m_left(size) {}

    bool atEnd() const { return m_left == 0; }

    uint8_t byte()
    {
        if (m_left == 0)
            return 0;
        --m_left;
        return *m_data++;
    }

    int number()
    {
        uint32_t value = 0;
        for (int i = 0; i < 4; ++i)
            value = value << 8 | byte();
        return static_cast<int>(value);
    }

    /// A short text: one byte gives its length, the rest is UTF-8.
    QString text()
    {
        const size_t length = qMin<size_t>(byte(), m_left);
        const QString piece = QString::fromUtf8(reinterpret_cast<char const*>(m_data), int(length));
        m_data += length;
        m_left -= length;
        return piece;
    }

    /// The rest of the input.
    QByteArray rest()
    {
        const QByteArray all(reinterpret_cast<char const*>(m_data), int(m_left));
        m_left = 0;
        return all;
    }

private:
    uint8_t const* m_data;
    size_t m_left;
};

/// Aborts when a promise is broken, and prints the line; unlike an assertion, in every build.
inline void Require(bool holds, int line = __builtin_LINE())
{
    if (holds)
        return;
    std::fprintf(stderr, "line %d: broken promise\n", line);
    std::abort();
}

/// Suppresses Qt's warnings about broken input.
inline void SilenceMessages()
{
    qInstallMessageHandler([](QtMsgType, QMessageLogContext const&, QString const&) {});
}
