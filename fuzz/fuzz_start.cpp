// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The whole start, in main()'s order, with any launch data, log settings and window settings: every
// damaged file leads to its defaults, no file is changed but the ones that a start writes, and the
// settings that the window saves can be loaded again.

#include "FuzzInput.h"
#include "XmlMutator.h"

#include "app/AppPaths.h"
#include "app/LaunchOptionParser.h"
#include "app/window/MainWindow.h"
#include "app/window/RecentFiles.h"
#include "app/window/WindowSettings.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QDebug>
#include <QDir>
#include <QFile>
#include <QFileInfo>
#include <QMenu>
#include <QMessageLogger>
#include <QTemporaryDir>

using namespace Velocor;

namespace {

// The folders that stand for the user's are this deep: a name with fewer ".." stays inside them.
constexpr int Depth = 8;

QString const& Top()
{
    static const QTemporaryDir folder;
    static const QString top = folder.path() + "/top/";
    return top;
}

// Where XDG_DATA_HOME points to.
QString const& Home()
{
    static const QString home = Top() + QString("d/").repeated(Depth);
    return home;
}

bool IsInside(QString const& name)
{
    return name.count("..") < Depth - 2; // the log is in two more folders of its own
}

// Whether a name has left files above the folder that the data belongs to.
bool s_isScattered = true;

void CleanUp()
{
    QDir(s_isScattered ? Top() : Home()).removeRecursively();
    Require(QDir().mkpath(Home()));
    QFile::remove(Top() + "appdata.cfg");
    s_isScattered = false;
}

void Write(QString const& path, QByteArray const& bytes)
{
    QFile file(path);
    Require(file.open(QIODevice::WriteOnly) && file.write(bytes) == bytes.size());
}

QByteArray Read(QString const& path)
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll() : QByteArray();
}

QString StartEntry()
{
    return QStringLiteral("app.exec() starting\n");
}

// The input: three files, with a zero byte between them. A file that is empty is missing.
struct Files
{
    explicit Files(QByteArray const& input)
    {
        const int first = input.indexOf('\0');
        const int second = first < 0 ? -1 : input.indexOf('\0', first + 1);
        launchData = input.left(first < 0 ? input.size() : first);
        logSettings = first < 0 ? QByteArray() : input.mid(first + 1, second - first - 1);
        windowSettings = second < 0 ? QByteArray() : input.mid(second + 1);
    }

    QByteArray launchData;
    QByteArray logSettings;
    QByteArray windowSettings;
};

// Both names come from the file, or none.
void CheckNames(QString const& launchData)
{
    LaunchOptionParser parser;
    auto* organization = new LaunchOption("organization", "organization", "o", 1, "");
    auto* product = new LaunchOption("product", "product", "p", 1, "");
    parser.AddOption(organization);
    parser.AddOption(product);
    const bool isUsed = parser.ReadDataFile(launchData);
    Require(QCoreApplication::organizationName() ==
            (isUsed && organization->isSet ? organization->value : "yourorganization"));
    Require(AppPaths::ProductName() == (isUsed && product->isSet ? product->value : "yourproduct"));
}

// A window that stays, because making one takes far longer than anything else here.
class Window
{
public:
    void start(QString const& dataPath)
    {
        WindowSettings settings(dataPath);
        const QByteArray before = Read(settings.fileName());
        const bool hadFile = QFile::exists(settings.fileName());
        const QString message = settings.Load();
        if (message.isEmpty())
            Require(Read(settings.fileName()) == before);
        else
            Require(hadFile && Read(settings.fileName() + ".damaged-1") == before);

        settings.RestoreGeometry(&m_widget);
        m_recent.SetList(settings.Text("recentFiles"));
        Require(m_recent.list().count('|') < RecentFiles::MaximumFiles);
        const QList<int> columns = settings.Numbers("columns");
        for (int width : columns)
            Require(width >= 0 && width <= 100000);

        settings.NoteGeometry(&m_widget);
        settings.SetNumbers("columns", columns);
        settings.SetFlag("placesShown", settings.Flag("placesShown", true));
        settings.SetText("recentFiles", m_recent.list());
        if (!settings.Save().isEmpty())
            return; // a name that no file can have
        startAgain(dataPath, settings);
    }

private:
    void startAgain(QString const& dataPath, WindowSettings& saved)
    {
        WindowSettings settings(dataPath);
        Require(settings.Load().isEmpty());
        Require(settings.Numbers("columns") == saved.Numbers("columns"));
        Require(settings.Flag("placesShown", true) == saved.Flag("placesShown", true));
        Require(settings.Text("recentFiles") == m_recent.list());
    }

    QWidget m_widget;
    QMenu m_menu;
    RecentFiles m_recent{&m_menu, nullptr};
};

// The log's own file has the entry, unless there is none to write to.
void CheckEntry(TorkLog& log)
{
    const QString file = log.currentLogFile();
    QMessageLogger(nullptr, 0, nullptr).debug() << "app.exec() starting";
    if (log.enabled() && log.errorString().isEmpty())
        Require(Read(file).contains(StartEntry().toLatin1()));
}

// The window itself, as a user sees and closes it.
void ShowWindow()
{
    MainWindow window;
    window.show();
    for (int i = 0; i < 3; ++i)
        QApplication::processEvents();
    window.close();
}

void Start(Files const& files, bool withWindow)
{
    const QString launchData = Top() + "appdata.cfg";
    AppPaths::SetOrganizationAndProduct();
    CheckNames(launchData);
    Require(Read(launchData) == files.launchData);

    QString data;
    AppPaths::SetupDataRootPath(data);
    s_isScattered = data.contains("..");
    if (!IsInside(data) || data.contains(QChar(0)) || !QDir().mkpath(data + "logs"))
        return;
    const QString logSettings = data + "logs/logsettings.cfg";
    if (!files.logSettings.isEmpty())
        Write(logSettings, files.logSettings);
    if (!files.windowSettings.isEmpty())
        Write(data + "velocor.cfg", files.windowSettings);

    TorkLog* log = TorkLog::initialize("velocor");
    s_isScattered = s_isScattered || log->filePrefix().contains("..");
    if (!IsInside(log->filePrefix()))
        return;
    if (!files.logSettings.isEmpty())
        Require(Read(logSettings) == files.logSettings);
    log->setLogPipeToConsole(false);
    qApp->setProperty("caption", AppPaths::ProductName());

    static auto* const window = new Window;
    window->start(data);
    CheckEntry(*log);
    if (withWindow)
        ShowWindow();
}

} // namespace

// Where the program is installed; Qt itself does not need it here.
QString QCoreApplication::applicationDirPath()
{
    return Top() + "bin";
}

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv)
{
    SilenceMessages();
    qputenv("QT_QPA_PLATFORM", "offscreen");
    for (char const* variable : {"XDG_DATA_HOME", "XDG_CONFIG_HOME", "XDG_CACHE_HOME", "HOME"})
        qputenv(variable, QFile::encodeName(Home()));
    new QApplication(*argc, *argv); // never deleted: the window needs it to the end
    return 0;
}

extern "C" size_t LLVMFuzzerCustomMutator(uint8_t* data, size_t size, size_t maximum,
                                          unsigned int seed)
{
    const std::vector<std::string> words[] = {
        {"arg", "organization", "product", ".", "..", "../x", "a/b"},
        {"LogSettings", "config", "maxLogFiles", "maxLogFileSize", "loggingEnabled",
         "logElapsedTime", "dateTimeFormat", "elapsedTimePrefix", "filePrefix", "logPipeToConsole"},
        {"VelocorSettings", "ApplicationScreens", "MainWindow", "maximized", "placesShown", "panes",
         "columns", "linePane", "recentFiles", "10,20,800,600"}};
    auto* bytes = reinterpret_cast<char*>(data);
    std::string texts[3];
    size_t count = 0;
    for (size_t i = 0; i < size; ++i) {
        if (bytes[i] == '\0' && count < 2)
            ++count;
        else
            texts[count] += bytes[i];
    }
    std::mt19937 random(seed);
    const size_t chosen = random() % 3;
    const size_t others = size - texts[chosen].size() + 2;
    if (others < maximum)
        texts[chosen] = XmlMutator(random(), words[chosen]).Mutate(texts[chosen], maximum - others);
    const std::string mutated = texts[0] + '\0' + texts[1] + '\0' + texts[2];
    return mutated.copy(bytes, maximum);
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    CleanUp();
    const QByteArray input(reinterpret_cast<char const*>(data), int(size));
    const Files files(input);
    if (!files.launchData.isEmpty())
        Write(Top() + "appdata.cfg", files.launchData);

    // The window takes a thousand times longer than the rest.
    Start(files, qChecksum(input.constData(), uint(input.size())) % 1024 == 0);
    TorkLog::shutdown();
    qInstallMessageHandler([](QtMsgType, QMessageLogContext const&, QString const&) {});
    return 0;
}
