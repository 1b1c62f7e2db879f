// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The log beside a plain one, which does with Qt's files and lists just what a log file's life is
// made of, through the same random life of a log directory, with links, pipes, forks, other writers
// and holders of the file: both leave the same. tst_PlainLog compares more calls, without files.

#include "common/TorkQt_p.h"
#include "common/log/TorkLog.h"
#include "plain/Program.h"
#include "support/TestFiles.h"

#include <QTemporaryDir>
#include <QTextStream>
#include <QtTest>

#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

class tst_PlainLogFiles : public QObject
{
    Q_OBJECT

private slots:
    void initTestCase();
    void cleanupTestCase();
    void lives();

private:
    QtMessageHandler m_handler = nullptr;
};

namespace {

class PlainLog
{
public:
    QString path;
    QString prefix = "app";
    int maxFiles = 10;
    quint32 maxSize = 1000000;
    QString errorString = QLatin1String("");

    QString name() const { return prefix + ".log"; }
    QString fullName() const
    {
        const bool isComplete = path.isEmpty() || path.endsWith('/');
        return path + (isComplete ? "" : "/") + name();
    }

    bool open(QString const& fileName)
    {
        close();
        m_file.setFileName(fileName);
        struct stat status = {};
        if (stat(QFile::encodeName(fileName).constData(), &status) == 0 &&
            S_ISFIFO(status.st_mode)) {
            errorString = "Not a regular file";
            return false;
        }
        const bool opened = m_file.open(QIODevice::ReadWrite | QIODevice::Text);
        if (!opened)
            errorString = m_file.errorString();
        m_file.seek(0); // else the first write seeks, if there was a file before
        return opened;
    }

    bool close()
    {
        if (!m_file.isOpen())
            return false;
        m_file.flush();
        m_file.close();
        return true;
    }

    void write(QString const& line)
    {
        if (m_file.isOpen() && !m_isHandedOut)
            m_file.seek(qMin(position(), m_file.size())); // cut down by somebody else
        if (!locate(line))
            return;
        m_file.write(line.toLatin1());
        m_file.flush();
    }

    QFile* locateLogFile(QString const& text)
    {
        if (m_file.isOpen() && !m_isHandedOut)
            m_file.seek(position());
        m_isHandedOut = true;
        return locate(text);
    }

    void deleteOldFiles()
    {
        QString directory = path;
        if (directory.endsWith('/'))
            directory.chop(1);
        QMap<int, QString> numbered;
        int highest = -1;
        const QStringList files = QDir(directory).entryList(QDir::Files, QDir::Name);
        for (QString const& file : files) {
            bool isNumber = false;
            const int number = file.mid(file.lastIndexOf('.') + 1).toInt(&isNumber);
            if (!file.startsWith(name() + '.') || !isNumber || number == -1)
                continue;
            numbered[number] = file;
            highest = qMax(highest, number);
        }
        if (highest != -1 && !numbered.isEmpty()) {
            for (int i = highest; i >= 1; --i) {
                if (!numbered.contains(i))
                    continue;
                const QString cut = numbered[i].left(numbered[i].lastIndexOf('.'));
                const QString to = path + cut + '.' + QString::number(i + 1);
                removeDeadLink(to);
                QFile::rename(path + numbered[i], to);
            }
            for (int i = highest + 1; highest >= maxFiles && i >= maxFiles + 1; --i)
                QFile::remove(fullName() + '.' + QString::number(i));
        }
        if (QFileInfo(fullName()).isFile()) { // a pipe would be waited for
            removeDeadLink(fullName() + ".1");
            QFile::copy(fullName(), fullName() + ".1");
        }
        QFile::remove(fullName());
    }

private:
    static void removeDeadLink(QString const& path)
    {
        if (QFileInfo(path).isSymLink() && !QFileInfo::exists(path))
            QFile::remove(path);
    }

    // The file object does not know where another process has moved it after fork().
    qint64 position() const { return lseek(m_file.handle(), 0, SEEK_CUR); }

    QFile* locate(QString const& text)
    {
        if (m_file.isOpen()) {
            const qint64 size = m_file.size();
            if (size >= 1 && size + text.length() > qint64(maxSize))
                trim(text.length());
            return &m_file;
        }
        if (list().isEmpty())
            QDir().mkpath(path.length() == 1 ? path : path.left(path.length() - 1));
        const QFileInfoList current = list();
        if (current.isEmpty()) {
            open(fullName());
        } else if (current.last().size() == 0 ||
                   current.last().size() + text.length() <= qint64(maxSize)) {
            open(current.last().filePath());
        } else {
            deleteOldFiles();
            open(fullName());
        }
        return m_file.isOpen() ? &m_file : nullptr;
    }

    QFileInfoList list() const
    {
        QFileInfoList current;
        const QFileInfoList all = QDir(path).entryInfoList(QDir::Files, QDir::Name);
        for (QFileInfo const& file : all) {
            if (file.fileName() == name())
                current.append(file);
        }
        return current;
    }

    void trim(int length)
    {
        QTextStream stream(&m_file);
        TorkQt::UseLatin1(stream);
        stream.setAutoDetectUnicode(false);
        QString kept;
        int count = 0;
        bool keep = false;
        while (!stream.atEnd()) {
            const QString line = stream.readLine();
            if (line.isNull()) // the other one of two processes was here and wrote to the end
                break;
            count += line.length();
            keep = keep || count >= length;
            if (keep)
                kept += line;
            m_file.resize(0);
            stream << kept;
        }
    }

    QFile m_file;
    bool m_isHandedOut = false;
};

// Everything below a folder: contents, targets of links, pipes and folders.
QStringList listing(QString const& folder)
{
    QStringList entries;
    QDirIterator walk(folder, QDir::AllEntries | QDir::Hidden | QDir::System | QDir::NoDotAndDotDot,
                      QDirIterator::Subdirectories);
    while (walk.hasNext()) {
        const QString path = walk.next();
        const QFileInfo info = walk.fileInfo();
        QByteArray entry = path.mid(folder.length()).toUtf8();
        if (info.isSymLink()) {
            char target[100] = "";
            if (readlink(QFile::encodeName(path).constData(), target, sizeof target - 1) > 0)
                entry += " -> " + QByteArray(target);
        } else if (info.isDir()) {
            entry += '/';
        } else if (info.isFile()) {
            entry += ": " + TestFiles::read(path);
        } else {
            entry += " |";
        }
        entries.append(QString::fromLatin1(entry));
    }
    entries.sort();
    return entries;
}

// Both logs in folders of their own, which are treated alike.
class Life : public Program::Pair
{
public:
    Life()
    {
        for (QString const& root : m_roots)
            QDir().mkpath(root + "logs");
        m_log.setEnable(true);
        m_log.setOutputPath(m_roots[0] + "logs/");
        m_plain.path = m_roots[1] + "logs/";
        loadSettings();
    }
    ~Life()
    {
        m_log.close();
        m_plain.close();
    }

    Q_DISABLE_COPY(Life)

    void perform(Program::Draws& draws)
    {
        m_draws = &draws;
        switch (upTo(20)) {
        case 0:
            note("close");
            same("close()", m_log.close(), m_plain.close());
            break;
        case 1:
            interfere();
            break;
        case 2:
        case 19:
            makeOdd();
            break;
        case 3:
            changeSettings();
            break;
        case 4:
            fork();
            break;
        case 5:
            if (upTo(3) == 0)
                handOut();
            break;
        case 6:
        case 7:
            useHandedOut();
            break;
        case 8:
            if (upTo(2) == 0)
                rotate();
            break;
        case 9:
            if (upTo(3) == 0)
                changePath(pick({"logs/", "logs", "new/", "new", "a/b/c/", "logs//"}));
            break;
        case 10:
            if (upTo(8) == 0)
                removeFolders();
            break;
        default:
            write();
        }
    }

    void finish()
    {
        same("files", listing(m_roots[0]), listing(m_roots[1]));
        same("errorString()", m_log.errorString(), m_plain.errorString);
    }

private:
    int upTo(int limit) { return m_draws->below(limit); }
    QString pick(QStringList const& texts) { return texts.at(upTo(texts.size())); }
    void note(QString const& step)
    {
        m_draws->tell([&] { return Program::quoted(step); });
    }

    QString line()
    {
        static const QString letters = QString::fromUtf8("aab c\näÿ日\t%");
        const int length = upTo(8) == 0 ? upTo(3000) : upTo(upTo(2) ? 12 : 120);
        QString text;
        for (int i = 0; i < length; ++i)
            text.append(letters.at(upTo(letters.size())));
        return upTo(5) ? text + '\n' : text;
    }

    void write()
    {
        const QString text = line();
        note("write " + text);
        m_log.write(text);
        m_plain.write(text);
    }

    void interfere()
    {
        const QString name = "logs/" + m_plain.prefix + pick({".log", ".log", ".log.1", ".log.2"});
        const QByteArray text = line().toLatin1();
        const int kind = upTo(4);
        const int size = upTo(300);
        note(QString("other writer %1 %2 %3").arg(kind).arg(size).arg(name));
        for (QString const& root : m_roots) {
            QFile file(root + name);
            if (!QFileInfo(file).isFile())
                continue;
            if (kind == 0 && file.open(QIODevice::Append))
                file.write(text);
            else if (kind == 1)
                file.resize(size);
            else if (kind == 2 && file.remove())
                TestFiles::write(root + name, text);
            else if (kind == 3)
                file.remove();
        }
    }

    void makeOdd()
    {
        const QString name = "logs/" + pick({m_plain.prefix, m_plain.prefix, "other"}) + ".log" +
                             pick({"", ".0", ".1", ".1", ".2", ".3", ".5", ".10", ".11", ".old",
                                   ".03", ".+4", ".-1", ".old.2", ".60", ".2147483648", "."});
        const QByteArray text = line().toLatin1();
        const int kind = upTo(9);
        note(QString("make %1 %2").arg(kind).arg(name));
        for (QString const& root : m_roots) {
            const QByteArray path = QFile::encodeName(root + name);
            if (!QFileInfo(root + "logs").isDir() || QFileInfo(root + name).isSymLink() ||
                QFile::exists(root + name))
                continue;
            if (kind == 0)
                QDir().mkpath(root + name);
            else if (kind == 1)
                same("mkfifo()", mkfifo(path.constData(), 0600), 0);
            else if (kind == 2)
                QFile::link("nowhere", root + name);
            else if (kind == 3)
                QFile::link("other.log.1", root + name);
            else
                TestFiles::write(root + name, text);
        }
    }

    void changeSettings()
    {
        m_plain.prefix = pick({"app", "app", "app", ".app", ".app", "my app", "a[p]p", "logdata"});
        m_plain.maxFiles = pick({"0", "1", "2", "3", "10"}).toInt();
        m_plain.maxSize = pick({"1", "20", "100", "500", "100000"}).toUInt();
        note(QString("settings %1 %2 %3")
                 .arg(m_plain.prefix)
                 .arg(m_plain.maxFiles)
                 .arg(m_plain.maxSize));
        loadSettings();
    }

    void loadSettings()
    {
        const QString file = m_folder.path() + "/settings.cfg";
        TestFiles::write(file, QString("<LogSettings><config><filePrefix>%1</filePrefix>"
                                       "<maxLogFiles>%2</maxLogFiles>"
                                       "<maxLogFileSize>%3</maxLogFileSize></config></LogSettings>")
                                   .arg(m_plain.prefix)
                                   .arg(m_plain.maxFiles)
                                   .arg(m_plain.maxSize)
                                   .toUtf8());
        m_log.setPreferencesFileName(file);
        same("loadPreferences()", m_log.loadPreferences(), true);
    }

    // A child writes and ends, then the parent goes on.
    void fork()
    {
        QStringList lines;
        for (int i = upTo(4); i >= 0; --i)
            lines.append(line());
        note("fork " + lines.join('|'));
        const pid_t child = ::fork();
        if (child == 0) {
            for (QString const& text : lines) {
                m_log.write(text);
                m_plain.write(text);
            }
            _exit(0);
        }
        int status = 0;
        same("waitpid()", waitpid(child, &status, 0), child);
        same("status", status, 0);
    }

    void handOut()
    {
        const QString text = line();
        note("hand out for " + text);
        m_file = m_log.locateLogFile(text);
        m_plainFile = m_plain.locateLogFile(text);
        same("no file", !m_file, !m_plainFile);
    }

    void useHandedOut()
    {
        if (!m_file || !m_plainFile || !m_file->isOpen() || !m_plainFile->isOpen())
            return;
        const int kind = upTo(3);
        const int where = upTo(200);
        const QByteArray text = line().toLatin1();
        note(QString("holder %1 %2").arg(kind).arg(where));
        for (QFile* file : {m_file, m_plainFile}) {
            if (kind == 0)
                file->seek(where);
            else if (kind == 1)
                file->write(text);
            else
                file->read(where / 10);
        }
    }

    void rotate()
    {
        note("rotate");
        m_log.deleteOldFiles();
        m_plain.deleteOldFiles();
    }

    void changePath(QString const& path)
    {
        note("path " + path);
        m_log.setOutputPath(m_roots[0] + path);
        m_plain.path = m_roots[1] + path;
    }

    void removeFolders()
    {
        note("remove the folder");
        for (QString const& root : m_roots)
            QDir(root + "logs").removeRecursively();
    }

    QTemporaryDir m_folder;
    const QStringList m_roots{m_folder.path() + "/a/", m_folder.path() + "/b/"};
    TorkLog m_log;
    PlainLog m_plain;
    QFile* m_file = nullptr;
    QFile* m_plainFile = nullptr;
};

void dropMessage(QtMsgType, QMessageLogContext const&, QString const&) {}

} // namespace

// Qt complains of empty paths and of devices that are not open.
void tst_PlainLogFiles::initTestCase()
{
    m_handler = qInstallMessageHandler(dropMessage);
}

void tst_PlainLogFiles::cleanupTestCase()
{
    qInstallMessageHandler(m_handler);
}

void tst_PlainLogFiles::lives()
{
    Program::compare<Life>("log files", Rounds::count(1500, 250000), 50);
}

int main(int argc, char** argv)
{
    Program::useMemoryForFiles();
    QCoreApplication application(argc, argv);
    tst_PlainLogFiles test;
    return QTest::qExec(&test, argc, argv);
}

#include "tst_PlainLogFiles.moc"
