// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Any sequence of log calls, while other programs change the log's files: an entry is in the file,
// whole and where it belongs, or errorString() says why not; older files stay; a pipe or a folder
// in the way blocks nothing; files that are not the log's stay as they are.

#include "FuzzInput.h"

#include "common/log/TorkLog.h"

#include <QByteArray>
#include <QTemporaryDir>

#include <algorithm>
#include <cerrno>
#include <dirent.h>
#include <fcntl.h>
#include <map>
#include <memory>
#include <sys/stat.h>
#include <unistd.h>
#include <vector>

#ifdef __linux__
#include <linux/capability.h>
#include <sys/syscall.h>
#endif

namespace {

using Bytes = QByteArray;

// Root could open any file. Without this right it is an ordinary user, whose own files these are.
void ObeyPermissions()
{
#ifdef __linux__
    __user_cap_header_struct header = {_LINUX_CAPABILITY_VERSION_3, 0};
    __user_cap_data_struct rights[2] = {};
    if (::syscall(SYS_capget, &header, rights) != 0)
        return;
    rights[0].effective &= ~(1U << CAP_DAC_OVERRIDE | 1U << CAP_DAC_READ_SEARCH);
    ::syscall(SYS_capset, &header, rights);
#endif
}

bool GetStatus(Bytes const& path, struct stat& status)
{
    return ::stat(path.constData(), &status) == 0;
}

bool IsRegular(Bytes const& path)
{
    struct stat status = {};
    return GetStatus(path, status) && S_ISREG(status.st_mode);
}

Bytes Contents(int file)
{
    struct stat status = {};
    Require(::fstat(file, &status) == 0);
    Bytes bytes(int(status.st_size), '\0');
    Require(::pread(file, bytes.data(), size_t(bytes.size()), 0) == bytes.size());
    return bytes;
}

void Write(Bytes const& path, Bytes const& bytes, int flags)
{
    const int file = ::open(path.constData(), O_WRONLY | O_CREAT | O_NONBLOCK | flags, 0644);
    if (file < 0)
        return;
    if (::write(file, bytes.constData(), size_t(bytes.size())) < 0)
        Require(errno == EAGAIN || errno == ENOSPC);
    ::close(file);
}

// Everything in a folder by name: the text of a file, or what else it is.
using Entries = std::map<Bytes, Bytes>;

Bytes Text(Bytes const& path, mode_t mode)
{
    const bool isReadable = (mode & 0400) != 0;
    if (!isReadable)
        ::chmod(path.constData(), 0600);
    const int file = ::open(path.constData(), O_RDONLY);
    const Bytes text = Contents(file);
    ::close(file);
    if (!isReadable)
        ::chmod(path.constData(), mode & 07777);
    return text;
}

std::vector<Bytes> Names(Bytes const& folder)
{
    std::vector<Bytes> names;
    DIR* const list = ::opendir(folder.constData());
    while (dirent const* entry = list ? ::readdir(list) : nullptr) {
        const Bytes name = entry->d_name;
        if (name != "." && name != "..")
            names.push_back(name);
    }
    if (list)
        ::closedir(list);
    return names;
}

Entries List(Bytes const& folder)
{
    struct stat status = {};
    const bool isClosed = GetStatus(folder, status) && (status.st_mode & 0700) != 0700;
    if (isClosed)
        ::chmod(folder.constData(), 0700);
    Entries entries;
    for (Bytes const& name : Names(folder)) {
        const Bytes path = folder + '/' + name;
        struct stat file = {};
        Require(::lstat(path.constData(), &file) == 0);
        entries[name] = S_ISREG(file.st_mode) ? ':' + Text(path, file.st_mode)
                                              : '|' + Bytes::number(int(file.st_mode & S_IFMT));
    }
    if (isClosed)
        ::chmod(folder.constData(), status.st_mode & 07777);
    return entries;
}

mode_t TypeOf(Bytes const& path)
{
    struct stat status = {};
    return ::lstat(path.constData(), &status) == 0 ? status.st_mode & S_IFMT : 0;
}

// A file, or a folder with what is in it. Never changes what a link points to.
void Remove(Bytes const& path)
{
    if (TypeOf(path) != S_IFDIR) {
        ::unlink(path.constData());
        return;
    }
    ::chmod(path.constData(), 0700);
    for (Bytes const& name : Names(path))
        Remove(path + '/' + name);
    ::rmdir(path.constData());
}

bool Holds(Entries const& entries, Bytes const& name, Bytes const& contents)
{
    const auto found = entries.find(name);
    return found != entries.end() && found->second == contents;
}

// The older file `number` of a log, which must have moved up or stayed.
void CheckOlderFile(Entries const& before, Entries const& after, Bytes const& log, int number,
                    int limit)
{
    const Bytes name = log + '.' + Bytes::number(number);
    const Bytes next = log + '.' + Bytes::number(number + 1);
    const auto found = before.find(name);
    if (found == before.end() || !found->second.startsWith(':'))
        return;
    Require(number >= limit || Holds(after, next, found->second) ||
            Holds(after, name, found->second));
}

// What the promises say about a rotation of `log`.
void CheckRotation(Entries const& before, Entries const& after, Bytes const& log, int limit,
                   bool maySeeAll)
{
    for (int number = 1; number < 12; ++number)
        CheckOlderFile(before, after, log, number, limit);
    for (auto const& entry : before) {
        if (entry.second == "|" + Bytes::number(int(S_IFDIR)))
            Require(Holds(after, entry.first, entry.second));
    }
    if (!maySeeAll)
        return;
    const auto part = after.find(log + ".1.aBcDeF.part");
    Require(part == after.end() || !part->second.startsWith(':'));
    for (auto const& entry : after)
        Require(!entry.first.endsWith(".part") || before.count(entry.first) != 0);
    // Number 1 can always move away if number 2 is free.
    const auto current = before.find(log);
    const auto first = before.find(log + ".1");
    const bool isFree =
        first == before.end() || (first->second.startsWith(':') && before.count(log + ".2") == 0);
    if (isFree && current != before.end() && current->second.startsWith(':'))
        Require(Holds(after, log + ".1", current->second));
}

// A log in a folder that others use, too.
class Scene
{
public:
    Scene(Bytes const& top, FuzzInput& input) : m_top(top), m_logs(top + "/logs"), m_input(input)
    {
        Remove(m_top);
        ::mkdir(m_top.constData(), 0755);
        ::mkdir(m_logs.constData(), 0755);
        for (Bytes const& name : m_others)
            Write(m_logs + '/' + name, name, 0);
        m_log.setOutputPath(QString::fromLatin1(m_logs + '/'));
        changeSettings();
        m_log.setEnable(true);
    }

    ~Scene()
    {
        closePeer();
        m_log.close();
    }

    Scene(Scene const&) = delete;
    Scene& operator=(Scene const&) = delete;

    void step()
    {
        switch (m_input.byte() % 16) {
        case 0:
            close();
            break;
        case 1:
            changeSettings();
            break;
        case 2:
        case 3:
        case 4:
            change(name());
            break;
        case 5:
            put(name());
            break;
        case 6:
            changeFolder();
            break;
        case 7:
            writeByAnother();
            break;
        case 8:
            rotate();
            break;
        case 9:
            handOut();
            break;
        case 10:
            m_log.setEnable(m_input.byte() % 4 != 0);
            break;
        case 11:
            openByName();
            break;
        case 12:
            writeMessage();
            break;
        default:
            writeLine();
        }
    }

    // Files of other names are as they were, unless somebody removed the folder.
    void checkOthers() const
    {
        if (m_isFolderGone)
            return;
        const Entries entries = List(m_logs);
        for (Bytes const& name : m_others)
            Require(Holds(entries, name, ':' + name));
    }

private:
    Bytes path() const { return m_logs + '/' + m_name; }

    QString text()
    {
        QString text = m_input.text();
        return text.repeated(1 << m_input.byte() % 7);
    }

    Bytes name()
    {
        const char* const endings[] = {"",   "",   "",    "",    ".1", ".1",   ".2",
                                       ".3", ".9", ".10", ".11", ".0", ".old", ".1.aBcDeF.part"};
        return m_name + endings[m_input.byte() % std::size(endings)];
    }

    void changeSettings()
    {
        const char* const names[] = {"app", "app", "app", ".app", "a b"};
        const unsigned int sizes[] = {1, 20, 100, 500, 20000, 1000000};
        const int limits[] = {10, 3, 2, 1, 0, 11};
        const Bytes prefix = names[m_input.byte() % std::size(names)];
        m_size = sizes[m_input.byte() % std::size(sizes)];
        m_limit = limits[m_input.byte() % std::size(limits)];
        m_name = prefix + ".log";
        const bool enabled = m_log.enabled();
        const Bytes file = m_top + "/settings.cfg";
        Write(file,
              "<LogSettings><config><filePrefix>" + prefix + "</filePrefix><maxLogFiles>" +
                  Bytes::number(m_limit) + "</maxLogFiles><maxLogFileSize>" +
                  Bytes::number(m_size) +
                  "</maxLogFileSize><dateTimeFormat>'T'</dateTimeFormat></config></LogSettings>",
              O_TRUNC);
        m_log.setPreferencesFileName(QString::fromLatin1(file));
        Require(m_log.loadPreferences());
        m_log.setEnable(enabled);
    }

    // Another program's changes to a file.
    void change(Bytes const& name)
    {
        const Bytes file = m_logs + '/' + name;
        const int modes[] = {0, 0200, 0400, 0600, 0644};
        const uint8_t kind = m_input.byte() % 6;
        const uint8_t number = m_input.byte();
        if (kind == 0 && IsRegular(file))
            Write(file, text().toLatin1(), O_APPEND);
        else if (kind == 1 && IsRegular(file))
            Require(::truncate(file.constData(), number * 8) == 0 || errno == EACCES);
        else if (kind == 2)
            Remove(file);
        else if (kind == 3)
            ::rename(file.constData(), (m_logs + '/' + this->name()).constData());
        else if (kind == 4 && TypeOf(file) == S_IFREG)
            ::chmod(file.constData(), mode_t(modes[number % std::size(modes)]));
        else
            writeNew(file);
    }

    void writeNew(Bytes const& file)
    {
        Remove(file);
        // No two have the same text.
        Write(file, Bytes::number(++m_serial) + ' ' + text().toLatin1(), O_TRUNC);
    }

    // What is no log file, in the place of one.
    void put(Bytes const& name)
    {
        const Bytes file = m_logs + '/' + name;
        const char* const targets[] = {"nowhere",   "target", ".",         "app.log",
                                       "app.log.1", "pipe",   "/dev/null", "/dev/full"};
        Remove(file);
        switch (m_input.byte() % 4) {
        case 0:
            ::mkdir(file.constData(), 0755);
            break;
        case 1:
            ::mkfifo(file.constData(), 0644);
            break;
        case 2:
            ::mkfifo((m_logs + "/pipe").constData(), 0644);
            Write(m_logs + "/target", "target", O_TRUNC);
            [[fallthrough]];
        default:
            Require(::symlink(targets[m_input.byte() % std::size(targets)], file.constData()) ==
                        0 ||
                    errno != ENAMETOOLONG);
        }
    }

    void changeFolder()
    {
        const int modes[] = {0755, 0755, 0555, 0333, 0111, 0};
        const uint8_t kind = m_input.byte();
        if (kind % 4 != 0) {
            ::chmod(m_logs.constData(), mode_t(modes[kind / 4 % std::size(modes)]));
            return;
        }
        m_isFolderGone = true;
        if (kind % 8 == 0)
            ::rename(m_logs.constData(), (m_top + "/old" + Bytes::number(++m_serial)).constData());
        else
            Remove(m_logs);
        if (kind % 32 == 4)
            Write(m_logs, "a file", 0);
    }

    // A second program does what the text forbids.
    void writeByAnother()
    {
        if (!m_another) {
            m_another = std::make_unique<TorkLog>(QString::fromLatin1(m_logs + '/'));
            m_another->setEnable(true);
        }
        m_another->setPreferencesFileName(QString::fromLatin1(m_top + "/settings.cfg"));
        m_another->loadPreferences();
        m_another->write(text());
        if (m_input.byte() % 4 == 0)
            m_another->close();
    }

    bool maySeeAll() const
    {
        struct stat folder = {};
        struct stat file = {};
        return !m_name.startsWith('.') && GetStatus(m_logs, folder) &&
               (folder.st_mode & 0700) == 0700 && GetStatus(path(), file) &&
               (file.st_mode & 0400) != 0;
    }

    void rotate()
    {
        const bool all = maySeeAll();
        const Entries before = List(m_logs);
        m_log.deleteOldFiles();
        CheckRotation(before, List(m_logs), m_name, m_limit, all);
    }

    void handOut()
    {
        if (m_input.byte() % 8 != 0)
            return;
        m_isFollowed = false;
        closePeer();
        if (QFile* file = m_log.locateLogFile(text())) {
            file->seek(m_input.byte());
            file->write(text().toLatin1());
        }
    }

    void openByName()
    {
        if (!m_isFollowed) {
            m_log.open(QString::fromLatin1(path()));
            return;
        }
        closePeer();
        const bool opened = m_log.open(QString::fromLatin1(path()));
        Require(opened || !m_log.errorString().isEmpty());
        if (opened)
            follow(Bytes(), Bytes(), false);
    }

    void close()
    {
        const bool wasOpen = m_log.close();
        Require(!m_isFollowed || wasOpen == m_isOpen);
        closePeer();
    }

    void closePeer()
    {
        if (m_peer >= 0)
            ::close(m_peer);
        m_peer = -1;
        m_isOpen = false;
    }

    void writeMessage()
    {
        const QString message = text();
        checkWrite("T Warning " + message.toLatin1() + '\n', [&] { m_log.warning(message); });
    }

    void writeLine()
    {
        const QString line = text() + QString(m_input.byte() % 8 != 0, '\n');
        checkWrite(line.toLatin1(), [&] { m_log.write(line); });
    }

    template <class Write>
    void checkWrite(Bytes const& entry, Write const& write)
    {
        if (!m_log.enabled() || !m_isFollowed || (m_isOpen && m_peer < 0)) {
            const Entries before = m_log.enabled() ? Entries() : List(m_logs);
            write();
            Require(m_log.enabled() || List(m_logs) == before);
        } else if (m_isOpen) {
            const Bytes before = Contents(m_peer);
            write();
            checkOpen(before, entry);
        } else {
            checkFirst(entry, write);
        }
    }

    // An entry in the open file belongs where the last one ended, or to the end if that is earlier.
    void checkOpen(Bytes const& before, Bytes const& entry)
    {
        const Bytes after = Contents(m_peer);
        const int place = qMin(m_position, before.size());
        const bool isFull = !before.isEmpty() && before.size() + entry.size() > int(m_size);
        if (isFull && place < before.size()) { // old text follows and has been trimmed
            Require(after.endsWith(entry));
            m_position = after.size();
            return;
        }
        Require(after == before.left(place) + entry + before.mid(place + entry.size()));
        m_position = place + entry.size();
    }

    // An entry that opens the file: over the old text, or in a new file after a rotation.
    template <class Write>
    void checkFirst(Bytes const& entry, Write const& write)
    {
        struct stat status = {};
        const bool wasFile = GetStatus(path(), status) && S_ISREG(status.st_mode);
        const bool isRotated = wasFile && !m_name.startsWith('.') && status.st_size > 0 &&
                               status.st_size + entry.size() > qint64(m_size);
        const bool all = isRotated && maySeeAll();
        const Entries before = isRotated ? List(m_logs) : Entries();
        const int old = wasFile ? ::open(path().constData(), O_RDONLY | O_NONBLOCK) : -1;
        const Bytes text = old >= 0 ? Contents(old) : Bytes();
        write();
        if (isRotated)
            CheckRotation(before, List(m_logs), m_name, m_limit, all);
        follow(text, entry, old >= 0 && isSameFile(old));
        if (old >= 0)
            ::close(old);
    }

    bool isSameFile(int file) const
    {
        struct stat left = {};
        struct stat right = {};
        return ::fstat(file, &left) == 0 && GetStatus(path(), right) && left.st_ino == right.st_ino;
    }

    // Opens what the log should have open by now, and checks what is in it.
    void follow(Bytes const& text, Bytes const& entry, bool isSame)
    {
        m_peer = ::open(path().constData(), O_RDWR | O_NONBLOCK | O_CLOEXEC);
        struct stat status = {};
        const bool exists = m_peer >= 0 && ::fstat(m_peer, &status) == 0;
        if (exists && S_ISREG(status.st_mode)) {
            const Bytes old = isSame ? text : Bytes();
            const Bytes after = Contents(m_peer);
            Require(entry.isEmpty() || after == entry + old.mid(entry.size()));
            m_isOpen = true;
            m_position = entry.size();
            return;
        }
        closePeer();
        m_isOpen = exists && S_ISCHR(status.st_mode);
        Require(m_isOpen || !m_log.errorString().isEmpty());
    }

    const std::vector<Bytes> m_others = {"xapp.log.1", "app.log.old1", "app.log.1.abc.part"};
    Bytes m_top;
    Bytes m_logs;
    FuzzInput& m_input;
    Bytes m_name;
    unsigned int m_size = 0;
    int m_limit = 0;
    int m_serial = 0;
    TorkLog m_log;
    std::unique_ptr<TorkLog> m_another;
    int m_peer = -1;          // the log's file, for reading; -1 if it is none
    int m_position = 0;       // where its last entry ended
    bool m_isOpen = false;    // whether the log has a file open
    bool m_isFollowed = true; // until somebody else may write at any place
    bool m_isFolderGone = false;
};

} // namespace

extern "C" int LLVMFuzzerInitialize(int*, char***)
{
    SilenceMessages();
    ObeyPermissions();
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    static const QTemporaryDir folder;
    static const Bytes top = folder.path().toLatin1() + "/top";
    FuzzInput input(data, size);
    Scene scene(top, input);
    for (int steps = 0; steps < 32 && !input.atEnd(); ++steps)
        scene.step();
    scene.checkOthers();
    return 0;
}
