// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QFile>
#include <QString>
#include <QtGlobal>

#include <limits>

/// The open file of a log, and how it is shared with other programs. For the log's own sources.
///
/// Two programs that write one log file each keep a position of their own. Text that is written at
/// a position beyond the end leaves a gap of NULs, and another program may cut the file down at any
/// moment. So an entry that goes to the end is appended, wherever the end is by then; only writing
/// over old text needs a position, and whoever does that or trims keeps the others from cutting the
/// file down meanwhile. Alone in the file, both come to the same bytes.
///
/// One thread at a time.
class TorkLogWriter
{
public:
    /// A limit that any text fits in.
    static constexpr qint64 NoLimit = std::numeric_limits<qint64>::max();

    /// Whether a file of `size` bytes has room for `length` more; an empty one always has.
    static bool fits(qint64 size, int length, qint64 limit)
    {
        return size < 1 || size + length <= limit;
    }

    /// Opens a file for writing from its start on, without truncating it, after closing the one
    /// that is open.
    ///
    /// @return the reason of a failure; null if the file is open
    QString open(QString const& fileName);

    /// Flushes and closes the file.
    ///
    /// @return whether one was open
    bool close();

    bool isOpen() const { return m_file.isOpen(); }

    /// The name of the file that was opened last.
    QString fileName() const { return m_file.fileName(); }

    /// The file object, for somebody who may seek, read and write. From now on, and for good, this
    /// object writes only through it, at its position.
    QFile* handOut();

    /// Makes room for `length` more bytes in the open file, as far as old text follows.
    void trim(int length, qint64 limit);

    /// Writes one entry into the open file, to the end or over old text. The bytes have reached
    /// the system then; what it does not take yet waits in the file object.
    ///
    /// @param limit  the size that old text after the entry is trimmed for
    void write(char const* bytes, int length, qint64 limit);

private:
    bool place(int length, qint64 limit);
    bool findPlace(int length, qint64 limit);
    void takePosition();
    void cut(int length);

    QFile m_file;
    bool m_handedOut = false;
    bool m_followsEnd = false; // entries that go to the end are appended
    bool m_appends = false;    // the last one was
    bool m_keepsOthersOut = false;
};
