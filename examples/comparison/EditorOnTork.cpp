// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// The editor on the framework: editor_on_tork [FILE]

#include "app/AppPaths.h"
#include "app/AppUtils.h"
#include "app/FailedWrites.h"
#include "app/QuitOnSignal.h"
#include "app/UserMessages.h"
#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"
#include "common/log/TorkLog.h"

#include <QApplication>
#include <QCloseEvent>
#include <QDebug>
#include <QFile>
#include <QFileDialog>
#include <QMainWindow>
#include <QMenu>
#include <QMenuBar>
#include <QPlainTextEdit>
#include <QSaveFile>

namespace {

class Editor : public QMainWindow
{
public:
    explicit Editor(QString const& settingsFile)
        : m_settings(settingsFile), m_text(new QPlainTextEdit)
    {
        setCentralWidget(m_text);
        QMenu* file = menuBar()->addMenu("&File");
        file->addAction("&Open...", this, [this] { Open(QFileDialog::getOpenFileName(this)); });
        m_menu = file->addMenu("&Recent");
        file->addAction("&Save", this, &Editor::Save);
        file->addAction("&Quit", this, &QWidget::close);
        connect(m_menu, &QMenu::aboutToShow, this,
                [this] { AppUtils::SetupMRUMenu(m_menu, m_recent); });
        connect(m_menu, &QMenu::triggered, this, [this](QAction* action) { Open(action->text()); });

        const bool firstStart = !QFile::exists(settingsFile);
        if (!m_settings.Load() && !firstStart)
            WarningMessage(nullptr, m_settings.m_lastError, true);
        QPoint position;
        QSize extent;
        if (m_settings.ReadScreenMetrics("Editor", position, extent)) {
            move(position);
            resize(extent);
        }
        QString none;
        m_settings.ReadItem("Files", "recent", none, m_recent);
        m_recent = TorkConfigText::DecodeValue(m_recent);
    }

    void Open(QString const& path)
    {
        if (path.isEmpty())
            return;
        QFile file(path);
        if (!file.open(QIODevice::ReadOnly)) {
            WarningMessage(this, "Cannot open " + path + ": " + file.errorString(), true);
            return;
        }
        m_text->setPlainText(QString::fromUtf8(file.readAll()));
        m_path = path;
        AppUtils::AddToMRUList(path, m_recent, 8);
        qDebug() << "opened" << path;
    }

protected:
    void closeEvent(QCloseEvent* event) override
    {
        QPoint position = pos();
        QSize extent = size();
        m_settings.WriteScreenMetrics("Editor", position, extent);
        m_settings.WriteItem("Files", "recent", TorkConfigText::EncodeValue(m_recent));
        if (!m_settings.SaveAtomically())
            CriticalMessage(this, m_settings.m_lastError, true);
        event->accept();
    }

private:
    void Save()
    {
        QSaveFile file(m_path);
        if (!file.open(QIODevice::WriteOnly) || file.write(m_text->toPlainText().toUtf8()) < 0 ||
            !file.commit())
            CriticalMessage(this, "Cannot save " + m_path + ": " + file.errorString(), true);
    }

    TorkConfigFile m_settings;
    QPlainTextEdit* m_text;
    QMenu* m_menu = nullptr;
    QString m_path;
    QString m_recent;
};

} // namespace

int main(int argc, char** argv)
{
    SurviveFailedWrites();
    QApplication application(argc, argv);
    AppPaths::SetOrganizationAndProduct("Tork", "Editor");
    TorkLog::initialize("editor");
    application.setProperty("caption", "Editor");
    const QuitOnSignal quitOnSignal;
    Editor editor(application.property("DataPath").toString() + "editor.cfg");
    editor.show();
    editor.Open(QApplication::arguments().value(1));
    qDebug() << "ready";
    return QApplication::exec();
}
