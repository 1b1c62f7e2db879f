// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/StandardInput.h"

#include <QDir>
#include <QSocketNotifier>

#include <array>
#include <cerrno>
#include <fcntl.h>
#include <unistd.h>

namespace Velocor {

namespace {

constexpr size_t ReadSize = 1 << 16; // bytes; what a pipe usually holds

// Closing the descriptor would give its number to the next file that is opened.
void EndInput()
{
    const int nothing = open("/dev/null", O_RDONLY | O_CLOEXEC);
    if (nothing < 0)
        return;
    dup2(nothing, STDIN_FILENO);
    close(nothing);
}

} // namespace

StandardInput::StandardInput(QObject* parent)
    : QObject(parent), m_folder(QDir::tempPath() + QLatin1String("/velocor-XXXXXX"))
{
    m_file.setFileName(m_folder.filePath(tr("Standard input")));
    if (!m_folder.isValid() || !m_file.open(QIODevice::WriteOnly | QIODevice::Unbuffered))
        return;
    m_notifier = new QSocketNotifier(STDIN_FILENO, QSocketNotifier::Read, this);
    connect(m_notifier, &QSocketNotifier::activated, this, [this] { readSome(); });
}

StandardInput::~StandardInput()
{
    delete m_notifier;
    EndInput();
}

QString StandardInput::path() const
{
    return m_file.isOpen() ? m_file.fileName() : QString();
}

// There is something to read, so this does not wait for more.
void StandardInput::readSome()
{
    std::array<char, ReadSize> slice{};
    const ssize_t size = read(STDIN_FILENO, slice.data(), slice.size());
    if (size < 0 && (errno == EINTR || errno == EAGAIN))
        return;
    if (size < 0)
        stop(tr("Standard input cannot be read: %1").arg(qt_error_string(errno)));
    else if (size == 0)
        stop(QString());
    else if (m_file.write(slice.data(), size) != size)
        stop(tr("Standard input is cut off, because %1 cannot be written: %2")
                 .arg(m_file.fileName(), m_file.errorString()));
}

void StandardInput::stop(QString const& reason)
{
    m_notifier->setEnabled(false);
    EndInput();
    if (!reason.isEmpty())
        Q_EMIT failed(reason);
}

} // namespace Velocor
