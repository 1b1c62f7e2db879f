// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Drives the window, and in one test the whole program.

#include "MainWindow.h"

#include <QAction>
#include <QApplication>
#include <QFile>
#include <QFileInfo>
#include <QMenu>
#include <QMenuBar>
#include <QMessageBox>
#include <QPlainTextEdit>
#include <QProcess>
#include <QTemporaryDir>
#include <QTimer>
#include <QtTest>

#include <csignal>

class tst_Starter : public QObject
{
    Q_OBJECT

private slots:
    void init();
    void firstStart();
    void placeAndRecentFiles();
    void missingFile_data();
    void missingFile();
    void damagedSettings();
    void program();

private:
    QString written(QString const& name, QByteArray const& content) const;
    QByteArray read(QString const& path) const;
    static QStringList recent(MainWindow& window);
    void closeNextBox();

    QScopedPointer<QTemporaryDir> m_folder;
    QString m_settings;
    QStringList m_boxes; // the texts of the boxes that were shown
};

void tst_Starter::init()
{
    m_folder.reset(new QTemporaryDir);
    QVERIFY2(m_folder->isValid(), qPrintable(m_folder->errorString()));
    m_settings = m_folder->filePath("starter.cfg");
    m_boxes.clear();
}

QString tst_Starter::written(QString const& name, QByteArray const& content) const
{
    QFile file(m_folder->filePath(name));
    if (!file.open(QIODevice::WriteOnly) || file.write(content) != content.size())
        qFatal("%s: %s", qPrintable(file.fileName()), qPrintable(file.errorString()));
    return file.fileName();
}

QByteArray tst_Starter::read(QString const& path) const
{
    QFile file(path);
    return file.open(QIODevice::ReadOnly) ? file.readAll()
                                          : "(" + file.errorString().toUtf8() + ")";
}

QStringList tst_Starter::recent(MainWindow& window)
{
    QMenu* file = window.menuBar()->actions().first()->menu();
    emit file->aboutToShow();
    QStringList entries;
    const QList<QAction*> actions = file->actions().at(1)->menu()->actions();
    for (QAction* action : actions) {
        if (action->isVisible())
            entries.append(action->text());
    }
    return entries;
}

// A box blocks until it is closed.
void tst_Starter::closeNextBox()
{
    auto* timer = new QTimer(this);
    connect(timer, &QTimer::timeout, this, [this, timer] {
        auto* box = qobject_cast<QMessageBox*>(QApplication::activeModalWidget());
        if (!box)
            return;
        timer->stop();
        timer->deleteLater();
        m_boxes.append(box->text());
        box->accept();
    });
    timer->start(10);
}

void tst_Starter::firstStart()
{
    MainWindow window(m_settings);
    QCOMPARE(window.size(), QSize(640, 480));
    QCOMPARE(recent(window), QStringList());
    QVERIFY(!QFile::exists(m_settings));
    window.close();
    QVERIFY(QFile::exists(m_settings));
}

void tst_Starter::placeAndRecentFiles()
{
    const QString first = written("first.txt", "one");
    const QString second = written(QString::fromUtf8("größe 90%1 ☃.txt"), "two ☃");
    {
        MainWindow window(m_settings);
        window.show();
        QVERIFY(window.Open(first));
        QVERIFY(window.Open(second));
        QCOMPARE(window.findChild<QPlainTextEdit*>()->toPlainText(), QString::fromUtf8("two ☃"));
        window.move(70, 50);
        window.resize(500, 400);
        window.close();
    }
    MainWindow window(m_settings);
    QCOMPARE(window.pos(), QPoint(70, 50));
    QCOMPARE(window.size(), QSize(500, 400));
    QCOMPARE(recent(window), QStringList({second, first}));
}

void tst_Starter::missingFile_data()
{
    QTest::addColumn<QString>("name");
    QTest::addColumn<QString>("text");

    QTest::newRow("plain name") << "missing.txt"
                                << "Cannot open %1:\nNo such file or directory";
    QTest::newRow("name with tags")
        << "<b>missing<b>"
        << "<p style='white-space:pre-wrap'>Cannot open %1:\nNo such file or directory</p>";
}

void tst_Starter::missingFile()
{
    QFETCH(QString, name);
    QFETCH(QString, text);

    const QString path = written(name, "text");
    MainWindow window(m_settings);
    QVERIFY(window.Open(path));
    QVERIFY(QFile::remove(path));

    closeNextBox();
    QVERIFY(!window.Open(path));
    const QString shown = name.startsWith('<') ? path.toHtmlEscaped() : path;
    QCOMPARE(m_boxes, QStringList(text.arg(shown)));
    QCOMPARE(recent(window), QStringList());
    QCOMPARE(window.findChild<QPlainTextEdit*>()->toPlainText(), QString("text"));
}

void tst_Starter::damagedSettings()
{
    written("starter.cfg", "<broken>");
    closeNextBox();
    MainWindow window(m_settings);
    QCOMPARE(m_boxes.size(), 1);
    QCOMPARE(window.size(), QSize(640, 480));
    window.close();
    QVERIFY(read(m_settings).endsWith("</VelocorSettings>\n"));
}

// As its user starts it: the names in its folders are those of appdata.cfg.
void tst_Starter::program()
{
    const QString path = written("text.txt", "text");
    QProcessEnvironment environment = QProcessEnvironment::systemEnvironment();
    environment.insert("HOME", m_folder->path());
    environment.insert("XDG_DATA_HOME", m_folder->filePath("data"));
    QProcess process;
    process.setProcessEnvironment(environment);
    process.start(PROGRAM, {path});

    const QString data = m_folder->filePath("data/Tork/Starter/");
    const QString log = data + "logs/starter.log";
    QTRY_VERIFY_WITH_TIMEOUT(read(log).endsWith(" Notification ready\n"), 60000);
    QVERIFY2(read(log).contains(" Trace opened \"" + path.toUtf8() + "\"\n"), read(log));

    kill(pid_t(process.processId()), SIGTERM);
    QVERIFY(process.waitForFinished(60000));
    QCOMPARE(process.exitStatus(), QProcess::NormalExit);
    QCOMPARE(process.exitCode(), 0);
    const QByteArray settings = read(data + "starter.cfg");
    QVERIFY2(settings.contains("<recent>" + path.toUtf8() + "|</recent>\n"), settings);
}

QTEST_MAIN(tst_Starter)

#include "tst_Starter.moc"
