// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// How long the program's window takes to its first paint, beside a bare window that only tells the
// identity and places in a form.
//
//     window_first_paint        starts itself 40 times in each way, in turn, and tells the medians
//     window_first_paint full   one start; tells the milliseconds from main() to the paint
//     window_first_paint bare
//
// The build target "first_paint" runs it on a virtual display.

#include "app/AppPaths.h"
#include "app/window/MainWindow.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QElapsedTimer>
#include <QFormLayout>
#include <QLabel>
#include <QProcess>
#include <QTemporaryDir>
#include <QTextStream>

#include <algorithm>
#include <memory>

namespace {

constexpr int Starts = 40;

QString Property(char const* name)
{
    return qApp->property(name).toString();
}

std::unique_ptr<QMainWindow> BareWindow()
{
    auto window = std::make_unique<QMainWindow>();
    auto* content = new QWidget;
    auto* layout = new QFormLayout(content);
    layout->addRow("Organization:", new QLabel(QCoreApplication::organizationName()));
    layout->addRow("Product:", new QLabel(QCoreApplication::applicationName()));
    layout->addRow("Installation:", new QLabel(Property("RootPath")));
    layout->addRow("Data:", new QLabel(Property("DataPath")));
    layout->addRow("Documents:", new QLabel(Property("DocPath")));
    layout->addRow("Log file:", new QLabel(TorkLog::logger()->newLogFileName()));
    window->setCentralWidget(content);
    return window;
}

// Ends the program when the window has been painted.
class PaintWatch : public QObject
{
public:
    explicit PaintWatch(QElapsedTimer const& time) : m_time(time) {}

    bool eventFilter(QObject* object, QEvent* event) override
    {
        if (event->type() != QEvent::Paint || m_painted)
            return false;
        m_painted = true;
        object->event(event);
        QTextStream(stdout) << static_cast<double>(m_time.nsecsElapsed()) / 1e6 << '\n' << flush;
        QTimer::singleShot(0, qApp, &QCoreApplication::quit);
        return true;
    }

private:
    QElapsedTimer m_time;
    bool m_painted = false;
};

int StartOnce(int argc, char** argv, bool bare)
{
    QElapsedTimer time;
    time.start();
    QApplication application(argc, argv);
    AppPaths::SetOrganizationAndProduct();
    TorkLog::initialize("velocor");
    application.setProperty("caption", "Velocor");
    std::unique_ptr<QMainWindow> window =
        bare ? BareWindow() : std::unique_ptr<QMainWindow>(new MainWindow);
    PaintWatch watch(time);
    window->installEventFilter(&watch);
    window->show();
    return QApplication::exec();
}

double Measure(QString const& way)
{
    QProcess process;
    process.start(QCoreApplication::applicationFilePath(), {way});
    process.waitForFinished();
    return process.readAllStandardOutput().trimmed().toDouble();
}

double Median(std::vector<double>& times)
{
    std::sort(times.begin(), times.end());
    return times[times.size() / 2];
}

int Compare(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QTemporaryDir home;
    qputenv("XDG_DATA_HOME", home.path().toLocal8Bit());
    std::vector<double> bare;
    std::vector<double> full;
    for (int i = 0; i < Starts; ++i) {
        bare.push_back(Measure("bare"));
        full.push_back(Measure("full"));
    }
    const double bareTime = Median(bare);
    const double fullTime = Median(full);
    QTextStream(stdout) << QString("first paint: bare window %1 ms, this window %2 ms, ratio %3\n")
                               .arg(bareTime, 0, 'f', 1)
                               .arg(fullTime, 0, 'f', 1)
                               .arg(fullTime / bareTime, 0, 'f', 2);
    return 0;
}

} // namespace

int main(int argc, char** argv)
{
    const QByteArray way = argc > 1 ? argv[1] : "";
    return way.isEmpty() ? Compare(argc, argv) : StartOnce(argc, argv, way == "bare");
}
