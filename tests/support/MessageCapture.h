// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QMutex>
#include <QString>
#include <QStringList>
#include <QtGlobal>

/// Collects Qt messages while it lives, then restores the previous handler.
///
/// One at a time. Messages may come from any thread.
///
///     MessageCapture messages;
///     qWarning("no");
///     QCOMPARE(messages.texts(), QStringList("warning: no"));
class MessageCapture
{
public:
    struct Message
    {
        QtMsgType type;
        QString category;
        bool hasPlace; ///< whether it came with a file, a line or a function
        QString text;
    };

    MessageCapture()
    {
        s_current = this;
        m_previous = qInstallMessageHandler(take);
    }

    ~MessageCapture()
    {
        qInstallMessageHandler(m_previous);
        s_current = nullptr;
    }

    Q_DISABLE_COPY(MessageCapture)

    QList<Message> messages() const
    {
        QMutexLocker lock(&m_mutex);
        return m_messages;
    }

    /// One text per message, prefixed by its type: "debug: ", "info: ", "warning: ", "critical: ".
    QStringList texts() const
    {
        QStringList result;
        const QList<Message> all = messages();
        for (Message const& message : all)
            result.append(typeName(message.type) + ": " + message.text);
        return result;
    }

private:
    static QString typeName(QtMsgType type)
    {
        switch (type) {
        case QtDebugMsg:
            return "debug";
        case QtInfoMsg:
            return "info";
        case QtWarningMsg:
            return "warning";
        case QtCriticalMsg:
            return "critical";
        case QtFatalMsg:
            return "fatal";
        }
        return "unknown";
    }

    static void take(QtMsgType type, QMessageLogContext const& context, QString const& text)
    {
        const bool hasPlace = context.file || context.function || context.line;
        QMutexLocker lock(&s_current->m_mutex);
        s_current->m_messages.append({type, QString::fromUtf8(context.category), hasPlace, text});
    }

    static inline MessageCapture* s_current = nullptr;
    mutable QMutex m_mutex;
    QList<Message> m_messages;
    QtMessageHandler m_previous;
};
