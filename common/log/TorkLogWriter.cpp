// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/log/TorkLogWriter_p.h"

#include "common/TorkQt_p.h"
#include "common/log/TorkLogPlace_p.h"

#include <QTextStream>

QString TorkLogWriter::open(QString const& fileName)
{
    close();
    m_file.setFileName(fileName);
    m_appends = false;
    // Checked before opening, so that the other end of a pipe is not disturbed, and after it, as
    // the name may refer to another file by then. Neither appending nor truncating: entries
    // overwrite the old content from its start.
    const bool mayBeLog = TorkLogPlace::MayBeLog(fileName);
    const bool opened = mayBeLog && m_file.open(QIODevice::ReadWrite | QIODevice::Text);
    if (mayBeLog && !opened)
        return m_file.errorString();
    if (!mayBeLog || !TorkLogPlace::MayBeLog(m_file)) {
        m_file.close();
        return QStringLiteral("Not a regular file");
    }
    // Qt compares with the position in the file before, and would seek with the first write, which
    // after fork() would take the other process back to the start, too.
    m_file.seek(0);
    m_followsEnd = !m_handedOut && TorkLogPlace::IsRegular(m_file);
    return QString();
}

bool TorkLogWriter::close()
{
    if (!m_file.isOpen())
        return false;

    m_file.close();
    return true;
}

QFile* TorkLogWriter::handOut()
{
    if (m_file.isOpen() && m_followsEnd) {
        // Text that waits for room on the disk goes to its place, not over what follows it.
        const bool isWritten = m_file.flush();
        TorkLogPlace::SetAppending(m_file, false);
        if (isWritten)
            takePosition();
    }
    m_handedOut = true;
    m_followsEnd = false;
    return &m_file;
}

void TorkLogWriter::write(char const* bytes, int length, qint64 limit)
{
    // Past the file object, which would copy the entry into its buffer and out again. The file
    // object gets only what the system does not take. For the goal "entry, 1 thread" in
    // docs/performance.md; tests/plain/tst_PlainLogFiles.cpp compares the files with those of a log
    // that writes through the file object.
    const bool isPlaced = place(length, limit);
    const int written = isPlaced ? TorkLogPlace::Write(m_file, bytes, length) : 0;
    if (isPlaced && written < length)
        takePosition();
    if (!isPlaced || written < length) {
        m_file.write(bytes + written, length - written);
        m_file.flush();
    }
    if (m_keepsOthersOut)
        TorkLogPlace::LetOthersIn(m_file);
    m_keepsOthersOut = false;
}

// Makes the system's position that of an entry. Returns false if the entry must go through the file
// object, because the file was handed out or earlier text still waits there.
bool TorkLogWriter::place(int length, qint64 limit)
{
    // Text that waits for room on the disk has its place, and this entry follows it.
    if (!m_followsEnd || !m_file.flush()) {
        trim(length, limit);
        return false;
    }

    // Usual, and without the system calls below: for the same goal, compared by the same test.
    if (m_appends && TorkLogPlace::IsAtEnd(m_file))
        return true;

    // The first entry, or old content follows, or another program has cut the file down or added to
    // it. After fork() another process may have moved on, so only the system knows the position.
    m_keepsOthersOut = TorkLogPlace::KeepOthersOut(m_file);
    return findPlace(length, limit);
}

// The same for an entry that may not belong to where the last one ended.
bool TorkLogWriter::findPlace(int length, qint64 limit)
{
    qint64 size = TorkLogPlace::Size(m_file);
    qint64 position = TorkLogPlace::Position(m_file);
    if (position < size && m_keepsOthersOut && !fits(size, length, limit)) {
        TorkLogPlace::SetAppending(m_file, true);
        takePosition();
        cut(length);
        size = TorkLogPlace::Size(m_file);
        position = TorkLogPlace::Position(m_file);
    }

    m_appends = position >= size || !m_keepsOthersOut;
    TorkLogPlace::SetAppending(m_file, m_appends);
    return m_file.flush();
}

// Moves the file object to where the system will write next. It does not notice what is written
// past it, or by another process after fork().
void TorkLogWriter::takePosition()
{
    m_file.seek(TorkLogPlace::Position(m_file));
}

void TorkLogWriter::trim(int length, qint64 limit)
{
    if (!fits(m_file.size(), length, limit))
        cut(length);
}

// Looks for old content after the last entry and, if there is any, cuts it down: without the
// lines that the new text needs room for, and without their line ends. Usually nothing follows
// and the file grows beyond its limit; it is rotated when it is next opened.
void TorkLogWriter::cut(int length)
{
    QTextStream stream(&m_file);
    TorkQt::UseLatin1(stream); // byte for byte, in any locale
    stream.setAutoDetectUnicode(false);

    QString kept;
    qint64 count = 0;
    bool keep = false;
    while (!stream.atEnd()) {
        const QString line = stream.readLine();
        // A file that cannot be read never comes to its end, nor does one whose end is not where
        // the file object takes it to be.
        if (line.isNull())
            break;
        count += line.length();
        keep = keep || count >= length;
        if (keep)
            kept += line;
        m_file.resize(0);
        stream << kept;
    }
}
