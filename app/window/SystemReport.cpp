// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/SystemReport.h"

#include "app/logfile/LogFileList.h"
#include "app/runninglog/LogPreferences.h"
#include "app/runninglog/RunningLog.h"
#include "app/window/ApplicationProperty.h"
#include "app/window/widgets/FileSizeText.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QFileInfo>
#include <QFont>
#include <QLocale>
#include <QScreen>
#include <QStorageInfo>
#include <QStyle>
#include <QSysInfo>

namespace Velocor {

namespace {

QString Line(QString const& caption, QString const& text)
{
    return caption + QLatin1String(": ") + text + QLatin1Char('\n');
}

QString Compiler()
{
#if defined(Q_CC_CLANG)
    return QStringLiteral("Clang %1.%2").arg(__clang_major__).arg(__clang_minor__);
#elif defined(Q_CC_GNU)
    return QStringLiteral("GCC %1.%2").arg(__GNUC__).arg(__GNUC_MINOR__);
#else
    return QObject::tr("unknown");
#endif
}

QString ScreenText(QScreen const* screen)
{
    const QRect place = screen->geometry();
    return QStringLiteral("%1, %2 x %3 at (%4, %5), scale %6, %7 dpi")
        .arg(screen->name())
        .arg(place.width())
        .arg(place.height())
        .arg(place.x())
        .arg(place.y())
        .arg(screen->devicePixelRatio())
        .arg(qRound(screen->logicalDotsPerInch()));
}

QString Screens()
{
    QString text;
    int number = 0;
    const QList<QScreen*> screens = QGuiApplication::screens();
    for (QScreen const* screen : screens)
        text += Line(QObject::tr("Screen %1").arg(++number), ScreenText(screen));
    return text;
}

QString Directory(QString const& caption, QString const& path)
{
    const QFileInfo info(path);
    QString state = QObject::tr("does not exist");
    if (info.isDir())
        state = info.isWritable() ? QObject::tr("writable") : QObject::tr("not writable");
    return Line(caption, QStringLiteral("%1 (%2)").arg(path, state));
}

QString File(QString const& caption, QString const& path)
{
    const QFileInfo info(path);
    QString state = QObject::tr("does not exist");
    if (info.exists())
        state = info.isFile() ? FileSizeText(info.size()) : QObject::tr("not a regular file");
    return Line(caption, QStringLiteral("%1 (%2)").arg(path, state));
}

QString LogState()
{
    TorkLog const* log = TorkLog::logger();
    if (!log)
        return QObject::tr("none");
    QString text = log->enabled() ? QObject::tr("on") : QObject::tr("off");
    text += QObject::tr(", limit %1 per file, ").arg(FileSizeText(log->maxLogFileSize()));
    text += QObject::tr("%Ln older file(s)", nullptr, static_cast<int>(log->maxLogFiles()));
    if (!log->errorString().isEmpty())
        text += QObject::tr(", last error: %1").arg(log->errorString());
    return text;
}

QString LogFiles()
{
    qint64 size = 0;
    const QStringList files = LogFileList::FilesOf(RunningLog::FileName());
    for (QString const& file : files)
        size += QFileInfo(file).size();
    const QString count = QObject::tr("%Ln file(s)", nullptr, files.size());
    return QObject::tr("%1, %2 in total").arg(count, FileSizeText(size));
}

QString AvailableSpace()
{
    const QStorageInfo storage(ApplicationProperty("DataPath"));
    return storage.isValid() ? FileSizeText(storage.bytesAvailable()) : QObject::tr("unknown");
}

} // namespace

QString SystemReport::Versions()
{
    QString text;
    text += Line(QObject::tr("Program"),
                 QStringLiteral("Velocor %1").arg(QLatin1String(VELOCOR_VERSION)));
    text += Line(QObject::tr("Built with Qt"), QLatin1String(QT_VERSION_STR));
    text += Line(QObject::tr("Running with Qt"), QLatin1String(qVersion()));
    text += Line(QObject::tr("Compiler"), Compiler());
    text += Line(QObject::tr("Build ABI"), QSysInfo::buildAbi());
    text += Line(QObject::tr("System"), QSysInfo::prettyProductName());
    text += Line(QObject::tr("Kernel"),
                 QSysInfo::kernelType() + QLatin1Char(' ') + QSysInfo::kernelVersion());
    text += Line(QObject::tr("Processor"), QSysInfo::currentCpuArchitecture());
    text += Line(QObject::tr("Locale"), QLocale::system().name());
    text += Line(QObject::tr("Platform"), QGuiApplication::platformName());
    text += Line(QObject::tr("Style"), QApplication::style()->objectName());
    text += Line(QObject::tr("Font"), QApplication::font().toString());
    text += Screens();
    return text;
}

QString SystemReport::Places(QString const& settingsFile)
{
    QString text;
    text += Line(QObject::tr("Organization"), QCoreApplication::organizationName());
    text += Line(QObject::tr("Product"), QCoreApplication::applicationName());
    text += Directory(QObject::tr("Installation"), ApplicationProperty("RootPath"));
    text += Directory(QObject::tr("Data"), ApplicationProperty("DataPath"));
    text += Directory(QObject::tr("Documents"), ApplicationProperty("DocPath"));
    text += File(QObject::tr("Settings file"), settingsFile);
    text += File(QObject::tr("Log settings"), LogPreferences::FileName());
    text += File(QObject::tr("Log file"), RunningLog::FileName());
    text += Line(QObject::tr("Log files"), LogFiles());
    text += Line(QObject::tr("Log"), LogState());
    text += Line(QObject::tr("Free space for data"), AvailableSpace());
    return text;
}

QString SystemReport::Facts(QString const& settingsFile)
{
    return Versions() + Places(settingsFile);
}

QString SystemReport::Licenses()
{
    return Line(QStringLiteral("License"), QStringLiteral("MIT")) +
           Line(QStringLiteral("Qt %1").arg(QLatin1String(qVersion())),
                QStringLiteral("LGPL 3 or GPL 2")) +
           Line(QStringLiteral("rapidxml"), QStringLiteral("Boost Software License 1.0 or MIT")) +
           QLatin1Char('\n');
}

} // namespace Velocor
