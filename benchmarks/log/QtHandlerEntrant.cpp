// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "log/LogEntrants.h"

#include "support/ScratchFolder.h"

#include <QDateTime>
#include <QDebug>
#include <QFile>
#include <QMessageLogger>
#include <QMutex>
#include <QTextStream>

namespace {

QMutex s_mutex;
QTextStream* s_stream = nullptr;

// The way Qt programs write their log when they use nothing but Qt.
void HandleMessage(QtMsgType, QMessageLogContext const&, QString const& message)
{
    const QMutexLocker lock(&s_mutex);
    *s_stream << QDateTime::currentDateTime().toString("yyyy-MM-dd hh:mm:ss.zzz") << " info "
              << message << '\n';
    s_stream->flush();
}

class QtHandlerEntrant : public LogEntrant
{
public:
    explicit QtHandlerEntrant(QString const& folder)
        : m_file(folder + "qt.log"), m_message(QString::fromStdString(LogMessage()))
    {
        Require(m_file.open(QIODevice::WriteOnly), m_file.errorString());
        m_stream.setDevice(&m_file);
        s_stream = &m_stream;
        m_handler = qInstallMessageHandler(HandleMessage);
    }

    ~QtHandlerEntrant() override
    {
        qInstallMessageHandler(m_handler);
        s_stream = nullptr;
    }

    void write() override { QMessageLogger().info().noquote() << m_message; }

private:
    QFile m_file;
    QTextStream m_stream;
    QString m_message;
    QtMessageHandler m_handler = nullptr;
};

} // namespace

std::unique_ptr<LogEntrant> MakeQtHandlerEntrant(QString const& folder)
{
    return std::make_unique<QtHandlerEntrant>(folder);
}
