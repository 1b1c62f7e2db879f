// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The editor on plain Qt and spdlog: editor_on_qt [FILE]

#include <QApplication>
#include <QCloseEvent>
#include <QDebug>
#include <QDir>
#include <QFile>
#include <QFileDialog>
#include <QMainWindow>
#include <QMenu>
#include <QMenuBar>
#include <QMessageBox>
#include <QPlainTextEdit>
#include <QSaveFile>
#include <QSettings>
#include <QSocketNotifier>
#include <QStandardPaths>
#include <QTimer>

#include <spdlog/sinks/rotating_file_sink.h>
#include <spdlog/spdlog.h>

#include <csignal>
#include <unistd.h>

namespace {

void Report(QWidget* parent, spdlog::level::level_enum level, QString const& text)
{
    spdlog::log(level, "{}", text.toStdString());
    QMessageBox box(level == spdlog::level::err ? QMessageBox::Critical : QMessageBox::Warning,
                    "Editor", text, QMessageBox::Ok, parent);
    box.setTextFormat(Qt::PlainText);
    box.exec();
}

void LogQtMessage(QtMsgType type, QMessageLogContext const&, QString const& text)
{
    auto level = spdlog::level::debug;
    if (type == QtInfoMsg)
        level = spdlog::level::info;
    else if (type == QtWarningMsg)
        level = spdlog::level::warn;
    else if (type == QtCriticalMsg)
        level = spdlog::level::err;
    else if (type == QtFatalMsg)
        level = spdlog::level::critical;
    spdlog::log(level, "{}", text.toStdString());
}

void StartLog(QString const& folder)
{
    try {
        auto logger = spdlog::rotating_logger_mt(
            "editor", QFile::encodeName(folder + "/editor.log").toStdString(), 1000000, 10);
        logger->set_level(spdlog::level::trace);
        logger->flush_on(spdlog::level::trace);
        spdlog::set_default_logger(logger);
    } catch (spdlog::spdlog_ex const& exception) {
        qWarning("%s", exception.what());
    }
    qInstallMessageHandler(LogQtMessage);
}

int s_pipe[2];

void TakeSignal(int)
{
    if (write(s_pipe[1], "", 1) < 0)
        _exit(1);
}

void CloseWindowsOnSignals(QObject* parent)
{
    if (pipe(s_pipe) != 0)
        return;
    auto* notifier = new QSocketNotifier(s_pipe[0], QSocketNotifier::Read, parent);
    QObject::connect(notifier, &QSocketNotifier::activated, parent, [notifier] {
        notifier->setEnabled(false);
        QApplication::closeAllWindows();
        QApplication::quit();
    });
    std::signal(SIGINT, TakeSignal);
    std::signal(SIGTERM, TakeSignal);
    std::signal(SIGHUP, TakeSignal);
    std::signal(SIGPIPE, SIG_IGN);
}

class Editor : public QMainWindow
{
public:
    explicit Editor(QString const& settingsFile)
        : m_settings(settingsFile, QSettings::IniFormat), m_text(new QPlainTextEdit)
    {
        setCentralWidget(m_text);
        QMenu* file = menuBar()->addMenu("&File");
        file->addAction("&Open...", this, [this] { Open(QFileDialog::getOpenFileName(this)); });
        m_menu = file->addMenu("&Recent");
        file->addAction("&Save", this, &Editor::Save);
        file->addAction("&Quit", this, &QWidget::close);
        connect(m_menu, &QMenu::aboutToShow, this, [this] {
            m_menu->clear();
            for (QString const& path : qAsConst(m_recent))
                m_menu->addAction(path);
        });
        connect(m_menu, &QMenu::triggered, this, [this](QAction* action) { Open(action->text()); });

        restoreGeometry(m_settings.value("geometry").toByteArray());
        m_recent = m_settings.value("recent").toStringList();
        // Only now: the file is parsed when the first value is read.
        if (m_settings.status() != QSettings::NoError)
            QTimer::singleShot(0, this, [this] {
                Report(this, spdlog::level::warn, "The settings cannot be read.");
            });
    }

    void Open(QString const& path)
    {
        if (path.isEmpty())
            return;
        QFile file(path);
        if (!file.open(QIODevice::ReadOnly)) {
            Report(this, spdlog::level::warn, "Cannot open " + path + ": " + file.errorString());
            return;
        }
        m_text->setPlainText(QString::fromUtf8(file.readAll()));
        m_path = path;
        m_recent.removeAll(path);
        m_recent.prepend(path);
        m_recent = m_recent.mid(0, 8);
        qDebug() << "opened" << path;
    }

protected:
    void closeEvent(QCloseEvent* event) override
    {
        m_settings.setValue("geometry", saveGeometry());
        m_settings.setValue("recent", m_recent);
        m_settings.sync();
        if (m_settings.status() == QSettings::AccessError)
            Report(this, spdlog::level::err, "The settings cannot be saved.");
        event->accept();
    }

private:
    void Save()
    {
        QSaveFile file(m_path);
        if (!file.open(QIODevice::WriteOnly) || file.write(m_text->toPlainText().toUtf8()) < 0 ||
            !file.commit())
            Report(this, spdlog::level::err, "Cannot save " + m_path + ": " + file.errorString());
    }

    QSettings m_settings;
    QPlainTextEdit* m_text;
    QMenu* m_menu = nullptr;
    QString m_path;
    QStringList m_recent;
};

} // namespace

int main(int argc, char** argv)
{
    QApplication application(argc, argv);
    QApplication::setOrganizationName("Tork");
    QApplication::setApplicationName("Editor");
    const QString folder = QStandardPaths::writableLocation(QStandardPaths::AppDataLocation);
    QDir().mkpath(folder + "/logs");
    StartLog(folder + "/logs");
    CloseWindowsOnSignals(&application);
    Editor editor(folder + "/editor.ini");
    editor.show();
    editor.Open(QApplication::arguments().value(1));
    qDebug() << "ready";
    return QApplication::exec();
}
