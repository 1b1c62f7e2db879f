// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// A generic Qt plug-in, named in QT_QPA_GENERIC_PLUGINS, that watches the unchanged program from
// inside. It is created in the QApplication constructor, records what happens to the application
// object, and once the event loop runs writes a report and ends the program.
//
//     SPY_REPORT  the file to write, JSON
//     SPY_AWAIT   a text; the report is written when a widget shows it
//     SPY_END     "close" closes the windows as the user would; a number is the exit code

#include <QApplication>
#include <QDynamicPropertyChangeEvent>
#include <QFile>
#include <QGenericPlugin>
#include <QJsonArray>
#include <QJsonDocument>
#include <QJsonObject>
#include <QStandardPaths>
#include <QThread>
#include <QTimer>
#include <QWidget>

namespace {

// Whether the log service has been started: its first start creates this file.
bool LogIsStarted()
{
    return QFile::exists(QStandardPaths::writableLocation(QStandardPaths::AppLocalDataLocation) +
                         "/logs/logsettings.cfg");
}

QJsonArray WindowTitles()
{
    QJsonArray titles;
    for (QWidget const* window : QApplication::topLevelWidgets()) {
        if (window->isVisible())
            titles.append(window->windowTitle());
    }
    return titles;
}

QJsonArray ShownTexts()
{
    QJsonArray texts;
    for (QWidget const* widget : QApplication::allWidgets()) {
        const QString text = widget->property("text").toString();
        if (widget->isVisible() && !text.isEmpty())
            texts.append(text);
    }
    return texts;
}

QJsonObject Properties()
{
    QJsonObject properties;
    for (QByteArray const& name : qApp->dynamicPropertyNames()) {
        if (name.startsWith('_')) // Qt's own
            continue;
        const QVariant value = qApp->property(name);
        const bool isText = value.userType() == QMetaType::QString;
        properties.insert(name, isText ? value.toString() : "not a text");
    }
    return properties;
}

} // namespace

class StartupSpy : public QObject
{
    Q_OBJECT

public:
    StartupSpy()
    {
        qApp->installEventFilter(this);
        connect(qApp, &QCoreApplication::organizationNameChanged, this,
                [this] { Note("organization"); });
        connect(qApp, &QCoreApplication::applicationNameChanged, this, [this] { Note("product"); });
        QTimer::singleShot(0, this, &StartupSpy::AwaitEventLoop);
    }

    bool eventFilter(QObject* object, QEvent* event) override
    {
        if (object == qApp && event->type() == QEvent::DynamicPropertyChange) {
            const QByteArray name =
                static_cast<QDynamicPropertyChangeEvent*>(event)->propertyName();
            if (!name.startsWith('_'))
                Note(name);
        } else if (event->type() == QEvent::Show) {
            auto* widget = qobject_cast<QWidget*>(object);
            if (widget && widget->isWindow())
                Note("show");
        }
        return false;
    }

private:
    void Note(QString const& step)
    {
        m_steps.append(step);
        m_logStarted.append(LogIsStarted());
    }

    void AwaitEventLoop()
    {
        if (QThread::currentThread()->loopLevel() == 0) {
            QTimer::singleShot(0, this, &StartupSpy::AwaitEventLoop);
            return;
        }
        Note("exec");
        AwaitText();
    }

    void AwaitText()
    {
        const QString text = QString::fromLocal8Bit(qgetenv("SPY_AWAIT"));
        if (!text.isEmpty() && !ShownTexts().contains(text)) {
            QTimer::singleShot(10, this, &StartupSpy::AwaitText);
            return;
        }
        WriteReport();
        End();
    }

    void WriteReport() const
    {
        const QJsonObject report{{"steps", m_steps},
                                 {"logStarted", m_logStarted},
                                 {"titles", WindowTitles()},
                                 {"texts", ShownTexts()},
                                 {"properties", Properties()},
                                 {"organization", QCoreApplication::organizationName()},
                                 {"product", QCoreApplication::applicationName()}};
        QFile file(QFile::decodeName(qgetenv("SPY_REPORT")));
        if (file.open(QIODevice::WriteOnly))
            file.write(QJsonDocument(report).toJson());
    }

    static void End()
    {
        const QByteArray end = qgetenv("SPY_END");
        if (end == "close")
            QApplication::closeAllWindows();
        else
            QCoreApplication::exit(end.toInt());
    }

    QJsonArray m_steps;
    QJsonArray m_logStarted;
};

class StartupSpyPlugin : public QGenericPlugin
{
    Q_OBJECT
    Q_PLUGIN_METADATA(IID QGenericPluginFactoryInterface_iid FILE "startupspy.json")

public:
    QObject* create(QString const&, QString const&) override { return new StartupSpy; }
};

#include "StartupSpy.moc"
