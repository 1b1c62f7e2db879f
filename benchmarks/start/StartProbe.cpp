// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A plug-in that Qt loads into the unchanged programs: it reports when the first visible widget
// gets its first paint event and how much memory the process has needed until then, and ends the
// process.

#include <QCoreApplication>
#include <QEvent>
#include <QGenericPlugin>
#include <QWidget>

#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <ctime>
#include <unistd.h>

namespace {

long long NowInNanoseconds()
{
    timespec now = {};
    clock_gettime(CLOCK_MONOTONIC, &now);
    return now.tv_sec * 1000000000LL + now.tv_nsec;
}

// Not the value that wait4() gives the parent: it includes the parent's own memory before the exec.
long PeakMemoryInKiB()
{
    long peak = 0;
    if (std::FILE* status = std::fopen("/proc/self/status", "r")) {
        char line[256];
        while (std::fgets(line, sizeof line, status)) {
            if (std::strncmp(line, "VmHWM:", 6) == 0)
                peak = std::strtol(line + 6, nullptr, 10);
        }
        std::fclose(status);
    }
    return peak;
}

class StartProbe : public QObject
{
public:
    using QObject::QObject;

    bool eventFilter(QObject* watched, QEvent* event) override
    {
        if (event->type() != QEvent::Paint || !watched->isWidgetType())
            return false;

        const long long now = NowInNanoseconds();
        if (static_cast<QWidget*>(watched)->isVisible())
            report(now);
        return false;
    }

private:
    static void report(long long now)
    {
        std::printf("%lld %ld\n", now, PeakMemoryInKiB());
        std::fflush(stdout);
        _exit(0);
    }
};

} // namespace

class StartProbePlugin : public QGenericPlugin
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID QGenericPluginFactoryInterface_iid FILE "startprobe.json")

public:
    QObject* create(QString const&, QString const&) override
    {
        auto* probe = new StartProbe(QCoreApplication::instance());
        QCoreApplication::instance()->installEventFilter(probe);
        return probe;
    }
};

#include "StartProbe.moc"
