// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Compares the log with a plain model on texts in a map, without a file system, through random
// programs of calls: names, entries, opening, trimming, rotation, settings and the echo.
// tst_PlainLogFiles has what only a file system has: links, pipes, other writers, forks.

#include "common/log/TorkLog.h"
#include "log/PlainStamp.h"
#include "plain/PlainLine.h"
#include "plain/Program.h"
#include "support/TestClock.h"
#include "support/TestFiles.h"

#include <QDebug>
#include <QDir>
#include <QMap>
#include <QSet>
#include <QTemporaryDir>
#include <QtTest>

#include <fcntl.h>
#include <memory>
#include <unistd.h>

class tst_PlainLog : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void programs();
};

namespace {

QTemporaryDir* g_folder = nullptr;

QString Root()
{
    return g_folder->path() + '/';
}

// Files by their names, which share their bytes with whoever has them open.
struct PlainDisk
{
    using File = std::shared_ptr<QByteArray>;

    QMap<QString, File> files;
    QSet<QString> folders;

    static QString folderOf(QString const& name) { return name.section('/', 0, -2); }

    bool has(QString const& name) const { return files.contains(name); }

    File make(QString const& name)
    {
        if (!has(name) && folders.contains(folderOf(name)))
            files[name] = std::make_shared<QByteArray>();
        return files.value(name);
    }

    void write(QString const& name, QByteArray const& bytes)
    {
        if (const File file = make(name))
            *file = bytes;
    }

    void rename(QString const& from, QString const& to)
    {
        if (has(from) && !has(to))
            files[to] = files.take(from);
    }

    void makeFolder(QString folder)
    {
        if (folder.endsWith('/'))
            folder.chop(1);
        for (; folder.startsWith(Root()); folder = folderOf(folder))
            folders.insert(folder);
    }

    QStringList listing() const
    {
        QStringList entries;
        for (QString const& folder : folders) {
            if (folder.startsWith(Root()))
                entries.append(folder.mid(Root().length()) + '/');
        }
        for (auto file = files.begin(); file != files.end(); ++file)
            entries.append(file.key().mid(Root().length()) + ": " + QString::fromLatin1(**file));
        return TestFiles::sorted(entries);
    }
};

// Where a log is, what it is called and what it writes, as its settings say.
struct PlainSettings
{
    QString path;
    QString prefix = QLatin1String("");
    QString format = "yyyy-MM-dd hh:mm:ss.z";
    QString elapsedPrefix = "dT:";
    QString fileName = QLatin1String("");
    quint32 maxFiles = 10;
    quint32 maxSize = 1000000;
    bool enabled = false;
    bool elapsed = false;
    bool echo = false;
};

class PlainLog
{
public:
    PlainSettings settings;
    PlainDisk disk;
    QString errorString = QLatin1String("");
    QString openName; // null: closed
    QByteArray echoed;

    QString name() const { return settings.prefix + ".log"; }
    QString fullName() const
    {
        const bool isComplete = settings.path.isEmpty() || settings.path.endsWith('/');
        return settings.path + (isComplete ? "" : "/") + name();
    }

    bool open(QString const& fileName)
    {
        close();
        m_file = disk.make(fileName);
        m_position = 0;
        if (m_file)
            openName = fileName;
        else
            errorString = "No such file or directory";
        return m_file != nullptr;
    }

    bool close()
    {
        const bool wasOpen = m_file != nullptr;
        m_file.reset();
        openName = QString();
        return wasOpen;
    }

    void write(int severity, QString const& message, qint64 now)
    {
        static const QStringList names({"Trace", "Notification", "Warning", "Error", "Fatal"});
        const QDateTime time = QDateTime::fromMSecsSinceEpoch(now);
        QString line = QString::fromLatin1(plainStamp(time, settings.format)) + ' ' +
                       names.value(severity) + ' ';
        if (settings.elapsed)
            line += settings.elapsedPrefix + '[' +
                    QString::number(lastEntryTime.msecsTo(time.time())) + "] ";
        write(line + message + '\n');
        lastEntryTime = time.time();
    }

    void write(QString const& line)
    {
        if (!settings.enabled || !locate(line))
            return;
        const QByteArray bytes = line.toLatin1();
        m_file->replace(m_position, bytes.size(), bytes);
        m_position += bytes.size();
        if (settings.echo) {
            QString quotedLine;
            QDebug(&quotedLine).nospace() << line;
            echoed += quotedLine.toLocal8Bit() + '\n';
        }
    }

    void deleteOldFiles()
    {
        QString folder = settings.path;
        if (folder.endsWith('/'))
            folder.chop(1);
        QMap<int, QString> numbered;
        const QStringList names = disk.files.keys();
        for (QString const& file : names) {
            const QString last = file.section('/', -1);
            bool isNumber = false;
            const int number = last.section('.', -1).toInt(&isNumber);
            if (PlainDisk::folderOf(file) == folder && !last.startsWith('.') &&
                last.startsWith(name() + '.') && isNumber)
                numbered[number] = last;
        }
        if (!numbered.isEmpty()) {
            const int highest = numbered.lastKey();
            for (int i = highest; i >= 1; --i) {
                const QString cut = numbered.value(i).section('.', 0, -2);
                if (numbered.contains(i))
                    disk.rename(settings.path + numbered[i],
                                settings.path + cut + '.' + QString::number(i + 1));
            }
            for (int i = highest + 1;
                 highest >= int(settings.maxFiles) && i > int(settings.maxFiles); --i)
                disk.files.remove(fullName() + '.' + QString::number(i));
        }
        if (disk.has(fullName()) && !disk.has(fullName() + ".1"))
            disk.write(fullName() + ".1", *disk.files[fullName()]);
        disk.files.remove(fullName());
    }

    // The keys that a settings file holds. What is missing gets its default.
    void load(QMap<QString, QString> const& stored)
    {
        const auto number = [&](char const* key, quint32 standard, quint32& value) {
            bool isNumber = false;
            const int read = stored.value(key, QString::number(standard)).toInt(&isNumber);
            if (isNumber)
                value = quint32(read);
        };
        const auto isOn = [&](char const* key, char const* standard) {
            return stored.value(key, standard).toLower() == "yes";
        };
        number("maxLogFiles", 10, settings.maxFiles);
        number("maxLogFileSize", 1000000, settings.maxSize);
        settings.enabled = isOn("loggingEnabled", "yes");
        settings.elapsed = isOn("logElapsedTime", "no");
        settings.echo = isOn("logPipeToConsole", "no");
        settings.format = stored.value("dateTimeFormat", "yyyy-MM-dd hh:mm:ss.z");
        settings.elapsedPrefix = stored.value("elapsedTimePrefix", "dT:");
        settings.prefix = stored.value("filePrefix", "logdata");
    }

    void save()
    {
        const auto onOff = [](bool isOn) {
            return QString(isOn ? "yes" : "no");
        };
        if (settings.fileName.length() < 2)
            return;
        if (PlainDisk::folderOf(settings.fileName) == QDir::cleanPath(settings.path) &&
            !disk.folders.contains(QDir::cleanPath(settings.path)))
            makeFolder();
        disk.write(settings.fileName,
                   "<LogSettings>\n<config>\n" +
                       PlainLine::item("maxLogFiles", QString::number(settings.maxFiles)) +
                       PlainLine::item("maxLogFileSize", QString::number(settings.maxSize)) +
                       PlainLine::item("loggingEnabled", onOff(settings.enabled)) +
                       PlainLine::item("logElapsedTime", onOff(settings.elapsed)) +
                       PlainLine::item("dateTimeFormat", settings.format) +
                       PlainLine::item("elapsedTimePrefix", settings.elapsedPrefix) +
                       PlainLine::item("filePrefix", settings.prefix) +
                       PlainLine::item("logPipeToConsole", onOff(settings.echo)) +
                       "</config>\n</LogSettings>\n");
    }

    QTime lastEntryTime;

private:
    bool locate(QString const& text)
    {
        const auto fits = [&](int size) {
            return size == 0 || qint64(size) + text.length() <= qint64(settings.maxSize);
        };
        if (m_file) {
            if (!fits(m_file->size()))
                trim(text.length());
            return true;
        }
        const QString last = name().section('/', -1);
        const bool isListed = !name().startsWith('.') && last == name() && disk.has(fullName());
        if (!isListed)
            makeFolder();
        else if (!fits(disk.files[fullName()]->size()))
            deleteOldFiles();
        return open(fullName());
    }

    void makeFolder() { disk.makeFolder(settings.path.left(settings.path.length() - 1)); }

    // Each line that is kept adds all kept so far to the file, which is emptied for each line: what
    // was still waiting in the text stream then is not lost.
    void trim(int length)
    {
        constexpr int streamBuffer = 16384;
        const QByteArray rest = m_file->mid(m_position);
        if (rest.isEmpty())
            return;
        QList<QByteArray> lines = rest.split('\n');
        if (lines.last().isEmpty())
            lines.removeLast();
        QByteArray kept;
        QByteArray waiting;
        int count = 0;
        for (QByteArray const& line : lines) {
            count += line.size();
            if (count >= length)
                kept += line;
            m_file->clear();
            waiting += kept;
            if (waiting.size() > streamBuffer)
                m_file->swap(waiting);
        }
        *m_file += waiting;
        m_position = m_file->size();
    }

    PlainDisk::File m_file;
    int m_position = 0;
};

// What the log echoes, or Qt prints, goes to a file while programs run.
class StandardError
{
public:
    static StandardError& only()
    {
        static StandardError instance;
        return instance;
    }

    void clear()
    {
        if (lseek(m_file, 0, SEEK_END) > 0)
            m_isGood = m_isGood && ftruncate(m_file, 0) == 0;
    }

    QByteArray read() const
    {
        QByteArray bytes(int(lseek(m_file, 0, SEEK_END)), '\0');
        const auto size = pread(m_file, bytes.data(), size_t(bytes.size()), 0);
        return m_isGood && size == bytes.size() ? bytes : QByteArray("(not readable)");
    }

    void redirect(bool isOn)
    {
        if (isOn == (m_terminal != -1))
            return;
        if (isOn) {
            m_terminal = dup(STDERR_FILENO);
            dup2(m_file, STDERR_FILENO);
        } else {
            dup2(m_terminal, STDERR_FILENO);
            ::close(m_terminal);
            m_terminal = -1;
        }
    }

private:
    StandardError()
        : m_file(::open(QFile::encodeName(g_folder->path() + ".stderr").constData(),
                        O_RDWR | O_CREAT | O_APPEND | O_CLOEXEC, 0600))
    {
        QFile::remove(g_folder->path() + ".stderr");
    }

    int m_file;
    int m_terminal = -1;
    bool m_isGood = true;
};

// Qt complains of settings that are cut off.
void DropMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

// The log in a folder, beside its model.
class Logs : public Program::Pair
{
public:
    Logs()
    {
        qInstallMessageHandler(DropMessage); // the echo of an earlier program replaced it
        StandardError::only().redirect(true);
        QDir().mkpath(Root() + "logs");
        m_plain.disk.folders.insert(Root().chopped(1));
        m_plain.disk.makeFolder(Root() + "logs");
        m_plain.lastEntryTime = time();
        m_log.setOutputPath(Root() + "logs/");
        m_plain.settings.path = Root() + "logs/";
        m_log.setEnable(true);
        m_plain.settings.enabled = true;
        m_log.setPreferencesFileName("app.cfg");
        m_plain.settings.fileName = Root() + "logs/app.cfg";

        const QString name = m_plain.settings.fileName;
        TestFiles::write(name, "<LogSettings><config><filePrefix>app</filePrefix></config>"
                               "</LogSettings>");
        same("loadPreferences()", m_log.loadPreferences(), true);
        m_plain.load({{"filePrefix", "app"}});
        QFile::remove(name);
    }

    ~Logs()
    {
        m_log.close();
        StandardError::only().clear();
        StandardError::only().redirect(false);
        for (QString const& name : m_plain.disk.files.keys())
            unlink(QFile::encodeName(name).constData());
        for (auto const& entry :
             QDir(Root()).entryInfoList(QDir::AllEntries | QDir::Hidden | QDir::NoDotAndDotDot))
            if (entry.isDir())
                QDir(entry.filePath()).removeRecursively();
            else
                QFile::remove(entry.filePath());
    }

    Q_DISABLE_COPY(Logs)

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        const int kind = draws.below(48);
        if (kind < 8)
            writeLine();
        else if (kind < 16)
            writeEntry();
        else if (kind < 20)
            close();
        else if (kind == 20)
            rotate();
        else if (kind < 26)
            putFile();
        else if (kind < 32)
            change();
        else if (kind < 34)
            changePath();
        else if (kind < 37)
            load();
        else if (kind < 39)
            save();
        else if (kind < 43)
            advance();
        else if (kind < 45)
            open();
        else if (kind == 45)
            nameSettings();
        else if (kind == 46)
            clear();
        else
            look();
        same("enabled()", m_log.enabled(), m_plain.settings.enabled);
        same("maxLogFiles()", m_log.maxLogFiles(), m_plain.settings.maxFiles);
        same("maxLogFileSize()", m_log.maxLogFileSize(), m_plain.settings.maxSize);
    }

    void finish()
    {
        compareGetters();
        same("files", listing(), m_plain.disk.listing());
        same("echo", StandardError::only().read(), m_plain.echoed);
    }

private:
    template <class... Arguments>
    void tell(char const* call, Arguments const&... arguments)
    {
        m_draws->tell([&] {
            QString text(call);
            QStringList values({Program::quoted(arguments)...});
            for (QString const& value : values)
                text = text.replace(text.indexOf('#'), 1, QString(value).replace(Root(), "/"));
            return text;
        });
    }

    static QTime time()
    {
        return QDateTime::fromMSecsSinceEpoch(QDateTime::currentMSecsSinceEpoch()).time();
    }

    static QStringList listing()
    {
        QStringList entries;
        walk(Root().chopped(1), entries);
        return TestFiles::sorted(entries);
    }

    static void walk(QString const& folder, QStringList& entries)
    {
        const QDir::Filters all =
            QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot;
        const QFileInfoList found = QDir(folder).entryInfoList(all, QDir::Unsorted);
        for (QFileInfo const& entry : found) {
            const QString path = entry.filePath().mid(Root().length());
            if (entry.isDir()) {
                entries.append(path + '/');
                walk(entry.filePath(), entries);
            } else {
                entries.append(path + ": " +
                               QString::fromLatin1(TestFiles::read(entry.filePath())));
            }
        }
    }

    QString line()
    {
        static const QString letters = QString::fromUtf8("aab cäÿ日\t\"%aab cäÿ日\t\"%\n");
        static int const lengths[] = {5, 5, 12, 40, 120, 300};
        const bool isComplete = !m_draws->once(5);
        if (m_draws->once(2)) // often as long as another one
            return m_draws->text("a", 4) + (isComplete ? "\n" : "");
        const int length = m_draws->oneOf(lengths);
        return m_draws->text(letters, length) + (isComplete ? "\n" : "");
    }

    void writeLine()
    {
        const QString text = line();
        tell("log.write(#)", text);
        m_log.write(text);
        m_plain.write(text);
    }

    void writeEntry()
    {
        const int severity = m_draws->below(7) - 1;
        QString message = line();
        if (!m_draws->once(4))
            message = message.simplified();
        const bool isShort = m_draws->once(3);
        tell(isShort ? "short form of log.write(#, #)" : "log.write(#, #)", severity, message);
        if (isShort && severity == TorkLog::Trace)
            m_log.trace(message);
        else if (isShort && severity == TorkLog::Warning)
            m_log.warning(message);
        else if (isShort && severity == TorkLog::Error)
            m_log.error(message);
        else if (isShort && severity == TorkLog::Fatal)
            m_log.fatal(message);
        else
            m_log.write(severity, message);
        m_plain.write(severity, message, QDateTime::currentMSecsSinceEpoch());
    }

    void close()
    {
        tell("log.close()");
        same("close()", m_log.close(), m_plain.close());
    }

    void look()
    {
        tell("the getters");
        compareGetters();
    }

    void rotate()
    {
        tell("log.deleteOldFiles()");
        m_log.deleteOldFiles();
        m_plain.deleteOldFiles();
    }

    // What an earlier run or a user left. Never over the file that is open.
    void putFile()
    {
        static char const* const ends[] = {"",       "",    ".1",  ".1",  ".2",   ".3",
                                           ".4",     ".0",  ".10", ".11", ".old", ".03",
                                           ".old.2", ".-1", ".60", ".2.", ".1.1"};
        const bool isNamedWithoutSlash = m_draws->once(10);
        const QString name = isNamedWithoutSlash
                                 ? m_plain.settings.path + m_plain.name() + m_draws->oneOf(ends)
                                 : m_plain.fullName() + m_draws->oneOf(ends);
        QByteArray bytes;
        for (int lines = m_draws->below(6); lines > 0; --lines)
            bytes += line().toLatin1();
        const QString folder = PlainDisk::folderOf(name);
        const bool isThere = m_plain.disk.folders.contains(folder);
        if (name == m_plain.openName || (!isThere && !m_draws->once(2)))
            return;
        m_plain.disk.makeFolder(folder);
        tell("file # = #", name, bytes);
        m_plain.disk.files.remove(name);
        m_plain.disk.write(name, bytes);
        QFile::remove(name);
        TestFiles::write(name, bytes);
    }

    void change()
    {
        static uint const counts[] = {0, 1, 2, 3, 100, 101, 500};
        static uint const sizes[] = {0, 100, 2047, 2048, 5000};
        PlainSettings& plain = m_plain.settings;
        const bool isOn = !m_draws->once(3);
        switch (m_draws->below(6)) {
        case 0:
            tell("log.setEnable(#)", isOn);
            m_log.setEnable(isOn);
            plain.enabled = isOn;
            break;
        case 1:
            tell("log.setLogElapsedTime(#)", isOn);
            m_log.setLogElapsedTime(isOn);
            plain.elapsed = isOn;
            break;
        case 2:
            tell("log.setLogPipeToConsole(#)", isOn);
            m_log.setLogPipeToConsole(isOn);
            plain.echo = isOn;
            break;
        case 3: {
            const uint count = m_draws->oneOf(counts);
            tell("log.setMaxLogFiles(#)", count);
            m_log.setMaxLogFiles(count);
            plain.maxFiles = count == 0 ? 2 : plain.maxFiles > 100 ? 100 : count;
            break;
        }
        default: {
            const uint size = m_draws->oneOf(sizes);
            tell("log.setMaxLogFileSize(#)", size);
            m_log.setMaxLogFileSize(size);
            if (size < 2048)
                plain.maxSize = 2048;
        }
        }
    }

    void changePath()
    {
        static char const* const paths[] = {"logs/", "logs/", "logs", "new/", "new", "a/b/"};
        const QString path = Root() + m_draws->oneOf(paths);
        tell("log.setOutputPath(#)", path);
        m_log.setOutputPath(path);
        m_plain.settings.path = path;
    }

    // A settings file with some of the keys, perhaps broken after them.
    void load()
    {
        static char const* const prefixes[] = {"app",   "app", "app",     ".app", "my app",
                                               "a[p]p", "a/b", "app.log", "b"};
        static char const* const counts[] = {"1", "0", "2", "3", "10", "-1", "none", "4294967295"};
        static char const* const sizes[] = {"100", "1", "20", "60", "500", "2048", "99999", "1e3"};
        static char const* const formats[] = {"hh:mm:ss.zzz", "z", "yyyy-MM-dd hh:mm:ss.z",
                                              "'day' d", "h ap"};
        static char const* const elapsed[] = {"dT:", "+", "dT: ", "%1"};
        static char const* const switches[] = {"yes", "no", "YES", "on"};
        QMap<QString, QString> stored;
        const auto add = [&](char const* key, QString const& value, int times) {
            if (!m_draws->once(times))
                stored[key] = value;
        };
        add("filePrefix", m_draws->oneOf(prefixes), 8);
        add("maxLogFiles", m_draws->oneOf(counts), 4);
        add("maxLogFileSize",
            m_draws->once(3) ? nearSize(stored.value("filePrefix")) : m_draws->oneOf(sizes), 4);
        add("dateTimeFormat", m_draws->oneOf(formats), 2);
        add("elapsedTimePrefix", m_draws->oneOf(elapsed), 2);
        add("loggingEnabled", m_draws->once(4) ? m_draws->oneOf(switches) : "yes", 2);
        add("logElapsedTime", m_draws->oneOf(switches), 2);
        add("logPipeToConsole", m_draws->once(4) ? "yes" : "no", 2);
        const bool isWhole = !m_draws->once(6);
        const QString name = m_plain.settings.fileName;
        const bool isThere =
            !m_draws->once(8) && m_plain.disk.folders.contains(PlainDisk::folderOf(name));

        QByteArray bytes = "<LogSettings><config>";
        for (auto item = stored.begin(); item != stored.end(); ++item)
            bytes += QString("<%1>%2</%1>").arg(item.key()).replace("%2", *item).toLatin1();
        bytes += isWhole ? "</config></LogSettings>" : "</config><";
        m_plain.disk.files.remove(name);
        QFile::remove(name);
        if (isThere) {
            m_plain.disk.write(name, bytes);
            TestFiles::write(name, bytes);
            m_plain.load(stored);
        }
        tell(isThere ? "file # = #, log.loadPreferences()" : "no file #, log.loadPreferences()",
             name, bytes);
        same("havePreferencesFile()", m_log.havePreferencesFile(), isThere);
        same("loadPreferences()", m_log.loadPreferences(), isThere && isWhole);
    }

    // With room for a short line, or just not.
    QString nearSize(QString const& prefix)
    {
        const PlainDisk::File file =
            m_plain.disk.files.value(m_plain.settings.path + prefix + ".log");
        return QString::number((file ? file->size() : 10) + 1 + m_draws->below(8));
    }

    void save()
    {
        tell("log.savePreferences()");
        same("savePreferences()", m_log.savePreferences(), true);
        m_plain.save();
    }

    void nameSettings()
    {
        static char const* const names[] = {"app.cfg", "", "other.cfg", "/logs/full.cfg"};
        QString name = m_draws->oneOf(names);
        QString plain = name.isEmpty() ? "logsettings.cfg" : name;
        if (name.contains('/'))
            plain = name = Root() + name.mid(1);
        else
            plain =
                m_plain.settings.path + (m_plain.settings.path.endsWith('/') ? "" : "/") + plain;
        tell("log.setPreferencesFileName(#)", name);
        m_log.setPreferencesFileName(name);
        m_plain.settings.fileName = plain;
        same("preferencesFileName()", m_log.preferencesFileName(), plain);
    }

    void advance()
    {
        static qint64 const steps[] = {1, 0, 10, 999, 60000, 3600000, 86400000, -5000};
        const qint64 step = m_draws->oneOf(steps);
        tell("the clock advances # ms", step);
        TestClock::advance(step);
    }

    void open()
    {
        static char const* const names[] = {"logs/app.log", "logs/other.txt", "none/app.log",
                                            "logs/app.log.1"};
        const QString name = Root() + m_draws->oneOf(names);
        tell("log.open(#)", name);
        same("open()", m_log.open(name), m_plain.open(name));
    }

    void clear()
    {
        if (!m_draws->once(4))
            return;
        tell("log.clear(), in the same directory and enabled");
        m_log.clear();
        m_plain.settings = PlainSettings();
        m_plain.errorString = "";
        compareGetters();
        m_log.setOutputPath(Root() + "logs/");
        m_plain.settings.path = Root() + "logs/";
        m_log.setEnable(true);
        m_plain.settings.enabled = true;
        m_log.setPreferencesFileName("app.cfg");
        m_plain.settings.fileName = Root() + "logs/app.cfg";
    }

    void compareGetters()
    {
        PlainSettings const& plain = m_plain.settings;
        same("path()", m_log.path(), plain.path.isNull() ? QString("") : plain.path);
        same("logElapsedTime()", m_log.logElapsedTime(), plain.elapsed);
        same("logPipeToConsole()", m_log.logPipeToConsole(), plain.echo);
        same("errorString()", m_log.errorString(), m_plain.errorString);
        same("fileSpec(false)", m_log.fileSpec(false), m_plain.name());
        same("fileSpec(true)", m_log.fileSpec(true), m_plain.name() + ".*");
        same("newLogFileName()", m_log.newLogFileName(), m_plain.fullName());
        same("currentLogFile()", m_log.currentLogFile(),
             m_plain.openName.isNull() ? m_plain.fullName() : m_plain.openName);
        same("dateTimeFormat()", m_log.dateTimeFormat(), plain.format);
        same("elapsedTimePrefix()", m_log.elapsedTimePrefix(), plain.elapsedPrefix);
        same("filePrefix()", m_log.filePrefix(), plain.prefix);
        same("preferencesFileName()", m_log.preferencesFileName(), plain.fileName);
    }

    // The log is constructed last, at the time that the model has, too.
    const int m_clock = [] {
        TestClock::set(QDateTime(QDate(2025, 3, 3), QTime(23, 50, 1, 120)));
        return 0;
    }();
    PlainLog m_plain;
    TorkLog m_log;
};

} // namespace

void tst_PlainLog::initTestCase()
{
    QVERIFY(g_folder->isValid());
}

void tst_PlainLog::programs()
{
    const QtMessageHandler handler = qInstallMessageHandler(DropMessage);
    Program::compare<Logs>("log", Rounds::count(40000, 1000000, 10000000), 50);
    qInstallMessageHandler(handler);
}

int main(int argc, char** argv)
{
    Program::useMemoryForFiles();
    QCoreApplication application(argc, argv);
    QTemporaryDir folder;
    g_folder = &folder;
    tst_PlainLog test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_PlainLog.moc"
