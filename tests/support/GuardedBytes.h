// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QByteArray>
#include <QtGlobal>

#ifdef Q_OS_UNIX
#include <cstring>

#include <sys/mman.h>
#include <unistd.h>
#endif

/// Bytes with a page before and after them that must not be read: who reads what is not his, even
/// one byte, crashes. Only on Unix; elsewhere, they are not guarded.
///
///     GuardedBytes guarded;
///     char const* const at = guarded.Put("abc", true);
///     search(at, at + 3);
#ifdef Q_OS_UNIX

class GuardedBytes
{
public:
    GuardedBytes()
        : m_pageSize(size_t(sysconf(_SC_PAGESIZE))),
          m_pages(mmap(nullptr, 3 * m_pageSize, PROT_READ | PROT_WRITE, MAP_PRIVATE | MAP_ANONYMOUS,
                       -1, 0))
    {
        if (m_pages == MAP_FAILED || mprotect(page(0), m_pageSize, PROT_NONE) != 0 ||
            mprotect(page(2), m_pageSize, PROT_NONE) != 0)
            qFatal("no memory to guard");
    }
    ~GuardedBytes() { munmap(m_pages, 3 * m_pageSize); }
    Q_DISABLE_COPY(GuardedBytes)

    /// Where a copy of these bytes, at most a page, now is: right before the last page or right
    /// after the first one. What was put before is gone.
    char const* Put(QByteArray const& bytes, bool isAtEnd)
    {
        const auto size = size_t(bytes.size());
        Q_ASSERT(size <= m_pageSize);
        char* const at = isAtEnd ? page(2) - size : page(1);
        std::memcpy(at, bytes.constData(), size);
        return at;
    }

private:
    char* page(size_t number) const { return static_cast<char*>(m_pages) + number * m_pageSize; }

    size_t m_pageSize;
    void* m_pages;
};

#else

class GuardedBytes
{
public:
    char const* Put(QByteArray const& bytes, bool)
    {
        m_bytes = bytes;
        return m_bytes.constData();
    }

private:
    QByteArray m_bytes;
};

#endif
