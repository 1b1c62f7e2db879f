// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The life of two programs that log and save in one folder: they start, write entries from several
// threads, rotate, save, meet a full disk, are killed, and start again, while their clock jumps. At
// every step the disk is put into states that a crash may leave, of the programs or of the machine,
// and a new program is started on each. One seed decides all of it.
//
//     VELOCOR_LIVES  how many lives; they differ
//     VELOCOR_SEED   the seed: see tests/plain/Rounds.h

#include "common/config/TorkConfigFile.h"
#include "common/log/TorkLog.h"
#include "log/LogFolder.h"
#include "plain/Rounds.h"
#include "reliability/CrashDisk.h"
#include "reliability/DiskRecorder.h"
#include "reliability/Figures.h"
#include "support/TestClock.h"

#include <QtTest>

#include <array>
#include <condition_variable>
#include <csignal>
#include <functional>
#include <memory>
#include <mutex>
#include <random>
#include <sys/socket.h>
#include <sys/wait.h>
#include <thread>
#include <unistd.h>

class tst_Life : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void cleanup();
    void life_data();
    void life();
    void cleanupTestCase();

private:
    QtMessageHandler m_handler = nullptr;
    bool m_failed = false;
};

namespace {

int s_operations = 0;
int s_killedStates = 0;
int s_cutStates = 0;
int s_restarts = 0;
int s_kills = 0;

constexpr int Threads = 3;
constexpr int MaxLogFiles = 3;
const QString stampFormat = "yyyy-MM-dd hh:mm:ss.zzz";

// Where everything is, below a folder that ends in "/".
const QString logFolder = "logs/";
const QString atomicFile = "settings/viewer.cfg";
const QString plainFile = "settings/plain.cfg";

QString logName(int program)
{
    return program == 0 ? "app" : "other";
}

// Settings of both programs' logs.
QString settingsFile(int program)
{
    return "settings/" + logName(program) + "-log.cfg";
}

QByteArray configuration(int version)
{
    return "<VelocorSettings>\n<state>\n<version>" + QByteArray::number(version) +
           "</version>\n<filler>" + QByteArray(version * 37 % 300 + 1, 'f') +
           "</filler>\n</state>\n</VelocorSettings>\n";
}

void fill(TorkConfigFile& settings, int version)
{
    settings.WriteItem("state", "version", QString::number(version));
    settings.WriteItem("state", "filler", QString(version * 37 % 300 + 1, 'f'));
}

QByteArray message(int number)
{
    return "<" + QByteArray::number(number) + ' ' + QByteArray(number * 7 % 60, 'm') + '>';
}

// The line of an entry at this moment.
QByteArray line(qint64 now, int number)
{
    return QDateTime::fromMSecsSinceEpoch(now).toString(stampFormat).toLatin1() + " Error " +
           message(number) + '\n';
}

// What a program is told to do.
struct Command
{
    enum Kind { Entry, QtMessage, CloseLog, SaveAtomically, Save, Quit };

    Kind kind = Quit;
    int thread = 0;
    int number = 0; // of the entry or version
    qint64 now = 0; // of its clock
};

// A thread that waits for work.
class Worker
{
public:
    Worker() : m_thread([this] { loop(); }) {}
    ~Worker()
    {
        run(nullptr);
        m_thread.join();
    }
    Q_DISABLE_COPY(Worker)

    // Returns when the work is done. No work: it ends.
    void run(std::function<void()> const& work)
    {
        std::unique_lock<std::mutex> lock(m_mutex);
        m_work = work;
        m_isBusy = true;
        m_changed.notify_all();
        m_changed.wait(lock, [this] { return !m_isBusy; });
    }

private:
    void loop()
    {
        std::unique_lock<std::mutex> lock(m_mutex);
        for (bool isOver = false; !isOver;) {
            m_changed.wait(lock, [this] { return m_isBusy; });
            isOver = !m_work;
            if (m_work)
                m_work();
            m_isBusy = false;
            m_changed.notify_all();
        }
    }

    std::mutex m_mutex;
    std::condition_variable m_changed;
    std::function<void()> m_work;
    bool m_isBusy = false;
    std::thread m_thread; // after what it uses
};

// The program: does what it is told until it is told to quit.
void live(QString const& root, int program, qint64 now, int socket)
{
    TestClock::set(QDateTime::fromMSecsSinceEpoch(now));
    TorkLog* const log = TorkLog::initialize(root + logFolder, logName(program),
                                             root + settingsFile(program), false);
    std::array<std::unique_ptr<Worker>, Threads> workers;
    for (auto& worker : workers)
        worker = std::make_unique<Worker>();
    char answer = '+';
    if (::write(socket, &answer, 1) != 1)
        return;

    Command command;
    while (::read(socket, &command, sizeof command) == sizeof command) {
        TestClock::set(QDateTime::fromMSecsSinceEpoch(command.now));
        answer = '+';
        workers[static_cast<size_t>(command.thread)]->run([&] {
            const QByteArray text = message(command.number);
            switch (command.kind) {
            case Command::Entry:
                log->error(QString::fromLatin1(text));
                break;
            case Command::QtMessage:
                qCritical("%s", text.constData());
                break;
            case Command::CloseLog:
                log->close();
                break;
            case Command::SaveAtomically: {
                TorkConfigFile settings(root + atomicFile);
                fill(settings, command.number);
                answer = settings.SaveAtomically() ? '+' : '-';
                break;
            }
            case Command::Save: {
                TorkConfigFile settings(root + plainFile);
                fill(settings, command.number);
                settings.Save();
                break;
            }
            case Command::Quit:
                TorkLog::shutdown();
                break;
            }
        });
        if (::write(socket, &answer, 1) != 1 || command.kind == Command::Quit)
            return;
    }
}

// A process that does what it is told.
class Program
{
public:
    Program() = default;
    ~Program() { end(); }
    Q_DISABLE_COPY(Program)

    // False if it is dead.
    bool start(QString const& root, int program, qint64 now)
    {
        std::array<int, 2> sockets = {};
        if (socketpair(AF_UNIX, SOCK_STREAM, 0, sockets.data()) != 0)
            return false;
        m_process = fork();
        if (m_process == 0) {
            alarm(600); // ends one that hangs
            ::close(sockets[0]);
            live(root, program, now, sockets[1]);
            _exit(0);
        }
        ::close(sockets[1]);
        m_socket = sockets[0];
        return answer() == '+';
    }

    // '+': done; '-': failed; 0: it is dead.
    char tell(Command const& command)
    {
        if (::write(m_socket, &command, sizeof command) != sizeof command)
            return 0;
        return answer();
    }

    bool isAlive() const { return m_process > 0; }

    // The status of the process.
    int end()
    {
        if (m_process <= 0)
            return 0;
        ::close(m_socket); // ends it
        int status = 0;
        waitpid(m_process, &status, 0);
        m_process = 0;
        return status;
    }

    void kill()
    {
        if (m_process > 0)
            ::kill(m_process, SIGKILL);
        end();
    }

private:
    char answer() const
    {
        char answer = 0;
        return ::read(m_socket, &answer, 1) == 1 ? answer : '\0';
    }

    pid_t m_process = 0;
    int m_socket = -1;
};

// What the files of a log must contain: the plain version of it.
struct PlainLog
{
    QMap<int, QByteArray> files; // by number; 0 is the current one
    bool isOpen = false;
    int position = 0;
    QByteArray pending; // waits for room on the disk

    // After the last rotation that returned, older files are on the disk; since then, killed ones
    // may have moved them up.
    QMap<int, QByteArray> synced;
    int shifts = 0;

    void open(bool rotates)
    {
        if (rotates && !files.value(0).isEmpty()) {
            QMap<int, QByteArray> shifted;
            for (auto file = files.begin(); file != files.end(); ++file) {
                if (file.key() < MaxLogFiles)
                    shifted[file.key() + 1] = *file;
            }
            files = shifted;
            synced = shifted;
            shifts = 0;
        }
        files[0]; // created
        isOpen = true;
        position = 0;
    }

    // @param room  how many bytes fit on the disk; -1: all
    void write(QByteArray const& line, bool rotates, int room = -1)
    {
        if (!isOpen)
            open(rotates);
        pending += line;
        const QByteArray fits = room < 0 ? pending : pending.left(room);
        pending = pending.mid(fits.size());
        files[0].replace(position, fits.size(), fits);
        position += fits.size();
    }

    void close()
    {
        if (isOpen)
            write("", false);
        isOpen = false;
    }

    void die()
    {
        isOpen = false;
        pending.clear();
    }
};

// All that the promises are about.
struct World
{
    std::array<PlainLog, 2> logs;
    QByteArray atomic;
    QByteArrayList formerAtomic; // what it may be after a power cut, if the last save was killed
    QByteArray plain;
};

// One command in the record.
struct Moment
{
    World before;
    World after; // as if it were done
    Command command;
    int program = 0;
    bool returned = false;
    int begin = 0; // operations
    int end = 0;
};

QByteArray logPath(int program, int number)
{
    const QByteArray current = (logFolder + logName(program) + ".log").toLatin1();
    return number ? current + '.' + QByteArray::number(number) : current;
}

QMap<int, QByteArray> logFiles(CrashDisk::State const& state, int program)
{
    QMap<int, QByteArray> files;
    for (int number = 0; number <= MaxLogFiles + 1; ++number) {
        const QByteArray path = logPath(program, number);
        if (state.files.contains(path))
            files[number] = state.files[path].content;
    }
    return files;
}

QByteArray contentOf(CrashDisk::State const& state, QString const& path)
{
    return state.files.value(path.toLatin1()).content;
}

// Whether `found` is `before`, with a first part of `more` at a position.
bool isUnderWay(QByteArray const& found, QByteArray const& before, int position,
                QByteArray const& more)
{
    for (int length = 0; length <= more.size(); ++length) {
        QByteArray content = before;
        content.replace(position, length, more.left(length));
        if (found == content)
            return true;
    }
    return false;
}

QString describe(CrashDisk::State const& state)
{
    QString text;
    for (auto file = state.files.begin(); file != state.files.end(); ++file)
        text += QString("  %1 (%2): %3\n")
                    .arg(QString::fromLatin1(file.key()))
                    .arg(file->node)
                    .arg(QString::fromLatin1(file->content.left(900).replace('\0', '@')));
    return text;
}

// Errors are reported as a text; empty: none.

// Older files keep their number or move up, whole; above the limit they may be pruned.
QString wrongInOlderFiles(QMap<int, QByteArray> const& before, int shifts,
                          QMap<int, QByteArray> const& found)
{
    for (auto file = before.begin(); file != before.end(); ++file) {
        const int number = file.key();
        bool isKept = number < 1 || number + shifts > MaxLogFiles;
        for (int at = number; at <= number + shifts; ++at)
            isKept = isKept || found.value(at) == *file;
        if (!isKept)
            return QString("older file %1 is lost or changed").arg(number);
    }
    return QString();
}

// No numbered file is anything but a whole one.
QString wrongInNumberedFiles(QSet<QByteArray> const& whole, QMap<int, QByteArray> const& found)
{
    for (auto file = found.begin(); file != found.end(); ++file) {
        if (file.key() >= 1 && !whole.contains(*file))
            return QString("older file %1 is none that there was").arg(file.key());
    }
    return QString();
}

// After the programs were killed in the middle of a command.
QString wrongAfterKill(Moment const& moment, CrashDisk::State const& state,
                       QSet<QByteArray> const& whole)
{
    for (int program = 0; program < 2; ++program) {
        PlainLog const& before = moment.before.logs[static_cast<size_t>(program)];
        PlainLog const& after = moment.after.logs[static_cast<size_t>(program)];
        const QMap<int, QByteArray> found = logFiles(state, program);
        if (program != moment.program && found != before.files)
            return "another program's log is changed";
        const QString wrong =
            wrongInOlderFiles(before.files, 1, found) + wrongInNumberedFiles(whole, found);
        if (!wrong.isEmpty())
            return wrong;
        QByteArray const& old = before.files.value(0);
        const int position = before.isOpen ? before.position : 0;
        const QByteArray more = after.files.value(0).mid(position, after.position - position);
        const bool isNew =
            isUnderWay(found.value(0), "", 0, after.files.value(0)) && found.value(1) == old;
        if (before.files.contains(0) && !isNew && !isUnderWay(found.value(0), old, position, more))
            return "an entry whose call returned is lost";
        if (!before.files.contains(0) && !after.files.value(0).startsWith(found.value(0)))
            return "the first file is something else";
    }
    const QByteArray atomic = contentOf(state, atomicFile);
    if (atomic != moment.before.atomic && atomic != moment.after.atomic)
        return "the file replaced atomically is neither old nor new";
    const QByteArray plain = contentOf(state, plainFile);
    if (plain != moment.before.plain && !moment.after.plain.startsWith(plain))
        return "the saved file is neither old nor the beginning of the new one";
    return QString();
}

// When no command is under way everything is as the plain version has it.
QString wrongBetween(World const& world, CrashDisk::State const& state)
{
    for (int program = 0; program < 2; ++program) {
        if (logFiles(state, program) != world.logs[static_cast<size_t>(program)].files)
            return "the log is not what its entries make it";
    }
    if (contentOf(state, atomicFile) != world.atomic)
        return "the file replaced atomically is not the last one";
    if (contentOf(state, plainFile) != world.plain)
        return "the saved file is not the last one";
    const bool mayHaveLeftover = !world.formerAtomic.isEmpty();
    if (!mayHaveLeftover && state.files.contains((atomicFile + ".saving").toLatin1()))
        return "the new file is left beside it";
    return QString();
}

// After a power cut.
//
// @param before     at the beginning of the command, with all that the system was given
// @param isOrdered  folders change in order
QString wrongAfterCut(Moment const& moment, bool isOver, CrashDisk::State const& state,
                      CrashDisk::State const& before, QSet<QByteArray> const& whole, int baseNodes,
                      bool isOrdered)
{
    const bool isReturned = isOver && moment.returned;
    World const& sure = isReturned ? moment.after : moment.before;
    for (int program = 0; program < 2; ++program) {
        PlainLog const& log = sure.logs[static_cast<size_t>(program)];
        const QMap<int, QByteArray> found = logFiles(state, program);
        const int shifts = log.shifts + (isReturned || program != moment.program ? 0 : 1);
        const QString wrong =
            (isOrdered ? wrongInOlderFiles(log.synced, shifts, found) : QString()) +
            wrongInNumberedFiles(whole, found);
        if (!wrong.isEmpty())
            return wrong;
        // A file that was on the disk is there, or the copy of it.
        const QByteArray path = logPath(program, 0);
        CrashDisk::File const& current = before.files.value(path);
        const bool wasOnDisk = current.node > 0 && current.node <= baseNodes;
        if (wasOnDisk && state.files.value(path).node != current.node &&
            !found.values().contains(current.content))
            return "the current file is gone";
    }
    const QByteArray atomic = contentOf(state, atomicFile);
    if (atomic != sure.atomic && atomic != moment.after.atomic &&
        !sure.formerAtomic.contains(atomic))
        return "the file replaced atomically is neither old nor new";
    return QString();
}

void materialize(CrashDisk::State const& state, QString const& root)
{
    QDir().mkpath(root + logFolder);
    for (auto file = state.files.begin(); file != state.files.end(); ++file)
        TestFiles::write(root + QString::fromLatin1(file.key()), file->content);
}

CrashDisk::State stateOf(QString const& root)
{
    CrashDisk::State state;
    const QDir top(root);
    QDirIterator walk(root, QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot,
                      QDirIterator::Subdirectories);
    while (walk.hasNext()) {
        const QString path = walk.next();
        const QByteArray name = top.relativeFilePath(path).toLatin1();
        if (walk.fileInfo().isDir())
            state.folders.insert(name + '/');
        else
            state.files[name].content = TestFiles::read(path);
    }
    return state;
}

bool areEqual(CrashDisk::State const& left, CrashDisk::State const& right)
{
    return left.files.keys() == right.files.keys() && left.folders == right.folders &&
           std::equal(left.files.begin(), left.files.end(), right.files.begin(),
                      [](CrashDisk::File const& a, CrashDisk::File const& b) {
                          return a.content == b.content;
                      });
}

// Starts a program on what a crash has left: it reads, logs and saves, and disturbs nothing.
QString wrongInNextStart(CrashDisk::State const& state, bool rotates, int program, qint64 now)
{
    LogFolder folder;
    const QString root = folder.root();
    materialize(state, root);
    const pid_t process = fork();
    if (process == 0) {
        alarm(60); // ends one that hangs
        TestClock::set(QDateTime::fromMSecsSinceEpoch(now));
        TorkConfigFile atomic(root + atomicFile);
        if (!atomic.Load())
            _exit(1);
        TorkConfigFile plain(root + plainFile);
        if (plain.Load() && TestFiles::read(root + plainFile).contains('\0'))
            _exit(2); // a gap is taken for text
        TorkLog* const log = TorkLog::initialize(root + logFolder, logName(program),
                                                 root + settingsFile(program), false);
        log->error("<next>");
        TorkConfigFile next(root + plainFile);
        fill(atomic, 1);
        fill(next, 2);
        const bool isSaved = atomic.SaveAtomically() && next.Save();
        TorkLog::shutdown();
        _exit(isSaved ? 0 : 3);
    }
    int status = -1;
    waitpid(process, &status, 0);
    if (status != 0)
        return QString("the next start ended with status %1: ").arg(status) +
               QString::fromLatin1(contentOf(state, plainFile).replace('\0', '@'));

    const CrashDisk::State next = stateOf(root);
    PlainLog log;
    log.files = logFiles(state, program);
    const QByteArray entry =
        QDateTime::fromMSecsSinceEpoch(now).toString(stampFormat).toLatin1() + " Error <next>\n";
    const bool isRotated = rotates && !log.files.value(0).isEmpty();
    log.write(entry, rotates);
    if (logFiles(next, program) != log.files)
        return "the next start does not log as it should:\n" + describe(next);
    const int otherProgram = 1 - program;
    if (logFiles(next, otherProgram) != logFiles(state, otherProgram))
        return "the next start changes another program's log";
    if (contentOf(next, atomicFile) != configuration(1) ||
        contentOf(next, plainFile) != configuration(2))
        return "the next start does not save";
    for (auto file = next.files.begin(); file != next.files.end(); ++file) {
        const bool isUnfinishedCopy =
            file.key().startsWith(logPath(program, 0)) && file.key().endsWith(".part");
        if (file.key().endsWith(".saving") || (isRotated && isUnfinishedCopy))
            return "the next start leaves " + QString::fromLatin1(file.key());
    }
    ++s_restarts;
    return QString();
}

void dropMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

// One life: what happens, then what a crash at each step leaves.
class Life
{
public:
    Life(quint32 seed, bool rotates, bool hasUnnamedFiles)
        : m_random(seed), m_rotates(rotates), m_hasUnnamedFiles(hasUnnamedFiles)
    {
        m_now = QDateTime(QDate(2025, 6, 1), QTime(12, 0)).toMSecsSinceEpoch();
        for (int program = 0; program < 2; ++program) {
            const LogFolder::Settings settings = {{"filePrefix", logName(program)},
                                                  {"dateTimeFormat", stampFormat},
                                                  {"maxLogFiles", QString::number(MaxLogFiles)},
                                                  {"maxLogFileSize", rotates ? "1" : "2000000000"}};
            TestFiles::write(m_folder.root() + settingsFile(program),
                             LogFolder::settingsText(settings));
        }
        TestFiles::write(m_folder.root() + atomicFile, configuration(3));
        TestFiles::write(m_folder.root() + plainFile, configuration(4));
        TestFiles::write(m_folder.root() + "notes.txt", "of the user\n");
        m_world.atomic = configuration(3);
        m_world.plain = configuration(4);
        // An entry of the run before each.
        for (int program = 0; program < 2; ++program) {
            TestFiles::write(m_folder.root() + QString::fromLatin1(logPath(program, 0)),
                             "older entries\n");
            m_world.logs[static_cast<size_t>(program)].files[0] = "older entries\n";
        }
    }

    // Empty, or what is wrong.
    QString run(int commands)
    {
        const CrashDisk::State base = stateOf(m_folder.root());
        DiskRecorder::start(m_folder.root(), m_hasUnnamedFiles);
        QString wrong;
        for (int i = 0; i < commands && wrong.isEmpty(); ++i)
            wrong = step();
        for (Program& program : m_programs)
            program.kill();
        const QVector<DiskRecorder::Operation> record = DiskRecorder::stop();
        if (!wrong.isEmpty())
            return wrong;
        s_operations += record.size();

        const CrashDisk disk(base, record);
        if (!areEqual(disk.stateAt(record.size(), CrashDisk::Killed, m_random),
                      stateOf(m_folder.root())))
            return "the record is not what was done:\n" +
                   describe(disk.stateAt(record.size(), CrashDisk::Killed, m_random)) +
                   describe(stateOf(m_folder.root()));
        m_baseNodes = base.files.size();
        for (Moment const& moment : m_moments) {
            noteWholeFiles(moment);
            for (int at = moment.begin; at <= moment.end && wrong.isEmpty(); ++at)
                wrong = crashAt(disk, moment, at);
        }
        return wrong;
    }

private:
    int below(int bound) { return static_cast<int>(m_random() % static_cast<unsigned>(bound)); }

    // The clock goes on, jumps ahead, or back.
    void passTime()
    {
        const int choice = below(12);
        m_now += choice == 0   ? -qint64(below(100000000))
                 : choice == 1 ? qint64(below(100000000))
                               : below(70000);
    }

    Command draw()
    {
        static const std::array<Command::Kind, 12> kinds = {
            Command::Entry,          Command::Entry,          Command::Entry,    Command::Entry,
            Command::QtMessage,      Command::QtMessage,      Command::CloseLog, Command::CloseLog,
            Command::SaveAtomically, Command::SaveAtomically, Command::Save,     Command::Quit};
        Command command;
        command.kind = kinds[static_cast<size_t>(below(static_cast<int>(kinds.size())))];
        command.thread = below(Threads);
        command.number = 10 + ++m_number;
        command.now = m_now;
        return command;
    }

    // What the command will have done.
    World expect(int program, Command const& command, int room) const
    {
        World world = m_world;
        PlainLog& log = world.logs[static_cast<size_t>(program)];
        switch (command.kind) {
        case Command::Entry:
        case Command::QtMessage:
            log.write(line(command.now, command.number), m_rotates, room);
            break;
        case Command::CloseLog:
        case Command::Quit:
            log.close();
            break;
        case Command::SaveAtomically:
            if (room < 0) {
                world.atomic = configuration(command.number);
                world.formerAtomic.clear();
            }
            break;
        case Command::Save:
            world.plain =
                room < 0 ? configuration(command.number) : configuration(command.number).left(room);
            break;
        }
        return world;
    }

    QString step()
    {
        passTime();
        const int number = below(2);
        Program& program = m_programs[static_cast<size_t>(number)];
        PlainLog& log = m_world.logs[static_cast<size_t>(number)];
        if (!program.isAlive()) {
            if (!program.start(m_folder.root(), number, m_now))
                return "a program does not start";
            return QString();
        }

        Moment moment;
        moment.command = draw();
        moment.program = number;
        // A rotation on a full disk loses the current file, deliberately.
        const bool mayBeFull = log.isOpen && moment.command.kind != Command::CloseLog &&
                               moment.command.kind != Command::Quit;
        const int room = mayBeFull && below(10) == 0 ? below(40) : -1;
        moment.before = m_world;
        moment.after = expect(number, moment.command, room);
        moment.begin = DiskRecorder::mark(0) + 1;
        DiskRecorder::limitBytes(room);
        DiskRecorder::killAt(room < 0 && below(6) == 0 ? 1 + below(9) : 0, below(100));
        const char answer = program.tell(moment.command);
        DiskRecorder::killAt(0, 0);
        DiskRecorder::limitBytes(-1);
        moment.end = DiskRecorder::mark(0);
        moment.returned = answer != 0;
        m_moments.append(moment);

        if (answer == 0)
            return afterDeath(moment, program.end());
        const bool isFailure = moment.command.kind == Command::SaveAtomically && room >= 0;
        if (answer != (isFailure ? '-' : '+'))
            return "a save says the wrong thing";
        m_world = moment.after;
        if (moment.command.kind == Command::Quit && program.end() != 0)
            return "a program does not end well";
        return QString();
    }

    // Its files are what they are now; whether that is right is seen later.
    QString afterDeath(Moment const& moment, int status)
    {
        if (!WIFSIGNALED(status) || WTERMSIG(status) != SIGKILL)
            return QString("a program ended with status %1").arg(status);
        ++s_kills;
        const CrashDisk::State state = stateOf(m_folder.root());
        PlainLog& log = m_world.logs[static_cast<size_t>(moment.program)];
        log.files = logFiles(state, moment.program);
        log.die();
        ++log.shifts;
        m_world.formerAtomic.append(m_world.atomic);
        m_world.formerAtomic.append(moment.after.atomic);
        m_world.atomic = contentOf(state, atomicFile);
        m_world.plain = contentOf(state, plainFile);
        return QString();
    }

    // What a numbered file may be.
    void noteWholeFiles(Moment const& moment)
    {
        for (World const& world : {moment.before, moment.after}) {
            for (PlainLog const& log : world.logs) {
                for (auto file = log.files.begin(); file != log.files.end(); ++file) {
                    if (file.key() >= 1 || !log.isOpen)
                        m_whole.insert(*file);
                }
            }
        }
    }

    QString crashAt(CrashDisk const& disk, Moment const& moment, int at)
    {
        const bool isOver = at == moment.end;
        const auto where = [&](char const* crash, QString const& wrong,
                               CrashDisk::State const& state) {
            return QString("%1 at operation %2, command %3 of program %4 from %5 to %6%7: "
                           "%8\n%9")
                .arg(crash)
                .arg(at)
                .arg(moment.command.kind)
                .arg(moment.program)
                .arg(moment.begin)
                .arg(moment.end)
                .arg(moment.returned ? "" : ", killed")
                .arg(wrong, describe(state));
        };

        const CrashDisk::State killed = disk.stateAt(at, CrashDisk::Killed, m_random);
        ++s_killedStates;
        QString wrong = isOver && moment.returned ? wrongBetween(moment.after, killed)
                                                  : wrongAfterKill(moment, killed, m_whole);
        if (contentOf(killed, "notes.txt") != "of the user\n")
            wrong = "another file is touched";
        if (wrong.isEmpty() && below(6) == 0)
            wrong = wrongInNextStart(killed, m_rotates, below(2), m_now);
        if (!wrong.isEmpty())
            return where("a kill", wrong, killed);

        const CrashDisk::State before = disk.stateAt(moment.begin, CrashDisk::Killed, m_random);
        const int cuts = qMin(4, 1 + disk.openOperations(at));
        for (int cut = 0; cut < cuts; ++cut) {
            for (const auto crash : {CrashDisk::PowerCut, CrashDisk::AnyOrderCut}) {
                const CrashDisk::State state = disk.stateAt(at, crash, m_random);
                ++s_cutStates;
                const bool isOrdered = crash == CrashDisk::PowerCut;
                wrong =
                    wrongAfterCut(moment, isOver, state, before, m_whole, m_baseNodes, isOrdered);
                if (contentOf(state, "notes.txt") != "of the user\n")
                    wrong = "another file is touched";
                if (wrong.isEmpty() && below(20) == 0)
                    wrong = wrongInNextStart(state, m_rotates, below(2), m_now);
                if (!wrong.isEmpty())
                    return where(isOrdered ? "a power cut" : "a power cut in any order", wrong,
                                 state);
            }
        }
        return QString();
    }

    LogFolder m_folder;
    std::mt19937 m_random;
    bool m_rotates;
    bool m_hasUnnamedFiles;
    qint64 m_now = 0;
    int m_number = 0;
    World m_world;
    std::array<Program, 2> m_programs;
    QVector<Moment> m_moments;
    QSet<QByteArray> m_whole;
    int m_baseNodes = 0;
};

} // namespace

void tst_Life::init()
{
    m_handler = qInstallMessageHandler(dropMessage);
}

void tst_Life::cleanup()
{
    qInstallMessageHandler(m_handler);
    m_failed = m_failed || QTest::currentTestFailed();
}

void tst_Life::life_data()
{
    QTest::addColumn<bool>("rotates");
    QTest::addColumn<bool>("hasUnnamedFiles");

    QTest::newRow("each opening writes over the run before") << false << true;
    QTest::newRow("each opening rotates") << true << true;
    QTest::newRow("each opening rotates, no unnamed files") << true << false;
}

void tst_Life::life()
{
    QFETCH(bool, rotates);
    QFETCH(bool, hasUnnamedFiles);
    const int lives = Figures::wanted("VELOCOR_LIVES", 1);
    for (int i = 0; i < lives; ++i) {
        Life life(Rounds::seed() + static_cast<quint32>(i), rotates, hasUnnamedFiles);
        const QString wrong = life.run(40);
        QVERIFY2(wrong.isEmpty(), qPrintable(QString("life %1: %2").arg(i).arg(wrong)));
    }
}

void tst_Life::cleanupTestCase()
{
    if (m_failed)
        return;
    QVERIFY(s_operations > 0 && s_kills > 0 && s_restarts > 0);
    Figures::print(QString("life: %1 file operations with %2 kills; %3 disks after a kill and %4 "
                           "after a power cut, %5 of them started on again; no promise broken")
                       .arg(s_operations)
                       .arg(s_kills)
                       .arg(s_killedStates)
                       .arg(s_cutStates)
                       .arg(s_restarts));
}

int main(int argc, char** argv)
{
    // Hundreds of folders are created and removed: in memory rather than on the disk where
    // possible.
    if (!qEnvironmentVariableIsSet("TMPDIR") && QFileInfo("/dev/shm").isWritable())
        qputenv("TMPDIR", "/dev/shm");
    // At the usual size always the same, so that a change is judged by what it changes.
    if (qEnvironmentVariableIsSet("VELOCOR_LIVES") && !qEnvironmentVariableIsSet("VELOCOR_SEED"))
        qputenv("VELOCOR_SEED", "new");

    QCoreApplication application(argc, argv);
    tst_Life test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_Life.moc"
