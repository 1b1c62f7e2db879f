// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/StandardInput.h"
#include "app/window/widgets/PlainText.h"

#include <QDir>
#include <QRegularExpression>
#include <QSocketNotifier>

#include <array>
#include <cerrno>
#include <fcntl.h>
#include <sys/stat.h>
#include <unistd.h>

namespace Velocor {

namespace {

constexpr size_t ReadSize = 1 << 16; // bytes; what a pipe usually holds

// Closing the descriptor would give its number to the next file that is opened.
void EndInput(int descriptor)
{
    const int nothing = open("/dev/null", O_RDONLY | O_CLOEXEC);
    if (nothing < 0)
        return;
    dup2(nothing, descriptor);
    close(nothing);
}

} // namespace

StandardInput::StandardInput(int descriptor, QObject* parent)
    : QObject(parent), m_descriptor(descriptor),
      m_folder(QDir::tempPath() + QLatin1String("/velocor-XXXXXX"))
{
    m_file.setFileName(m_folder.filePath(
        descriptor == STDIN_FILENO ? tr("Standard input") : tr("Pipe %1").arg(descriptor)));
    if (!m_folder.isValid() || !m_file.open(QIODevice::WriteOnly | QIODevice::Unbuffered))
        return;
    m_notifier = new QSocketNotifier(m_descriptor, QSocketNotifier::Read, this);
    connect(m_notifier, &QSocketNotifier::activated, this, [this] { readSome(); });
}

StandardInput::~StandardInput()
{
    delete m_notifier;
    EndInput(m_descriptor);
}

// Not one that is opened by its name: nobody may write to it, and opening it would block.
int StandardInput::PipeOf(QString const& path)
{
    static const QRegularExpression name(QStringLiteral("^/(dev|proc/self)/fd/([0-9]{1,4})$"));
    const QRegularExpressionMatch match = name.match(path);
    const int descriptor = match.hasMatch() ? match.captured(2).toInt() : -1;
    struct stat status = {};
    const bool isPipe =
        descriptor >= 0 && fstat(descriptor, &status) == 0 && S_ISFIFO(status.st_mode);
    return isPipe ? descriptor : -1;
}

QString StandardInput::path() const
{
    return m_file.isOpen() ? m_file.fileName() : QString();
}

// There is something to read, so this does not wait for more.
void StandardInput::readSome()
{
    std::array<char, ReadSize> slice{};
    const ssize_t size = read(m_descriptor, slice.data(), slice.size());
    if (size < 0 && (errno == EINTR || errno == EAGAIN))
        return;
    if (size < 0)
        stop(tr("Standard input cannot be read: %1").arg(qt_error_string(errno)));
    else if (size == 0)
        stop(QString());
    else if (m_file.write(slice.data(), size) != size)
        stop(tr("Standard input is cut off, because %1 cannot be written: %2")
                 .arg(LeftToRight(m_file.fileName()), m_file.errorString()));
}

void StandardInput::stop(QString const& reason)
{
    m_notifier->setEnabled(false);
    EndInput(m_descriptor);
    if (!reason.isEmpty())
        Q_EMIT failed(reason);
}

} // namespace Velocor
