// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/logfile/LogIndex.h"
#include "app/logfile/LogUpdate.h"

#include <QDateTime>
#include <QObject>
#include <QString>

#include <atomic>

class QFile;

namespace Velocor {

/// Reads a log file in a thread of its own and tells what rows a view of it has.
///
/// The file is read in slices through an ordinary handle: a mapped one would end the program when
/// the file is cut short. It is recognised by its first bytes and by those before the place where
/// reading goes on; if either has changed, it is another file or another run and is read anew.
///
/// Requests are numbered; Want() with a later number stops the work on an earlier one.
/// Want() is for any thread, everything else for the scanner's own.
class LogScanner : public QObject
{
    Q_OBJECT

public:
    explicit LogScanner(QObject* parent = nullptr);

    /// Announces the request that counts from now on.
    void Want(int request) { m_wanted = request; }

public Q_SLOTS:
    /// Reads a file from its start.
    void Open(int request, QString const& path, Velocor::LogLineParser const& parser,
              Velocor::LogFilter const& filter);

    /// Looks for changes and reads them. Always answers with polled().
    void Poll();

    /// Shows other rows of the same file.
    void SetFilter(int request, Velocor::LogFilter const& filter);

Q_SIGNALS:
    void updated(Velocor::LogUpdate const& update);
    void progressed(int request, int percent);
    void polled();

private:
    bool isWanted() const { return m_wanted == m_request; }
    void readAnew();
    bool readFrom(QFile& file, qint64 offset);
    bool looksUnchanged() const;
    bool isSameFile(QFile& file) const;
    void noteFile(QFile& file);
    void tellMissing();
    void tell(bool isReset);
    void startOver();

    std::atomic<int> m_wanted{0};
    int m_request = 0;
    QString m_path;
    LogLineParser m_parser;
    LogFilter m_filter;
    LogIndex m_index;
    std::shared_ptr<LogRows const> m_rows;

    bool m_exists = false;
    bool m_complete = false;
    QString m_error;
    qint64 m_size = 0;
    QDateTime m_modified;
    QByteArray m_head;
    QByteArray m_anchor;
    qint64 m_anchorEnd = 0;
};

} // namespace Velocor

Q_DECLARE_METATYPE(Velocor::LogFilter)
Q_DECLARE_METATYPE(Velocor::LogLineParser)
