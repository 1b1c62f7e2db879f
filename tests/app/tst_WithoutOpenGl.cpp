// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/WithoutOpenGl_p.h"

#include <QApplication>
#include <QFile>
#include <QtTest>

using namespace Velocor;

namespace {

constexpr char const* Variable = "QT_XCB_GL_INTEGRATION";

// The libraries are loaded when a window is created, not before.
QByteArray LibrariesOfAShownWindow()
{
    QWidget window;
    window.show();
    if (!QTest::qWaitForWindowExposed(&window))
        return QByteArray();
    QFile maps("/proc/self/maps");
    return maps.open(QIODevice::ReadOnly) ? maps.readAll() : QByteArray();
}

} // namespace

class tst_WithoutOpenGl : public QObject
{
    Q_OBJECT

private slots:
    void init() { qunsetenv(Variable); }

    void thePluginIsToldBeforeTheApplicationStands()
    {
        const WithoutOpenGl withoutOpenGl;
        QCOMPARE(qgetenv(Variable), QByteArray("none"));
    }

    void theEnvironmentIsPutBackAtTheEndOfTheObject()
    {
        {
            const WithoutOpenGl withoutOpenGl;
        }
        QVERIFY(!qEnvironmentVariableIsSet(Variable));
    }

    void aWindowShowsWithoutAGraphicsDriverAndNoChildInheritsTheSetting()
    {
        WithoutOpenGl withoutOpenGl;
        QApplication application(m_count, m_arguments);
        withoutOpenGl.End();
        QVERIFY(!qEnvironmentVariableIsSet(Variable));
        if (QGuiApplication::platformName() != "xcb")
            QSKIP("needs an X11 display");

        const QByteArray libraries = LibrariesOfAShownWindow();
        QVERIFY(libraries.contains("libqxcb"));
        QVERIFY(!libraries.contains("libqxcb-glx"));
        QVERIFY(!libraries.contains("_dri.so"));
    }

    void aUsersOwnSettingWinsAndIsLeft()
    {
        qputenv(Variable, "xcb_glx");
        WithoutOpenGl withoutOpenGl;
        QApplication application(m_count, m_arguments);
        withoutOpenGl.End();
        QCOMPARE(qgetenv(Variable), QByteArray("xcb_glx"));
    }

    void anEmptySettingIsAUsersOwnToo()
    {
        qputenv(Variable, "");
        {
            const WithoutOpenGl withoutOpenGl;
        }
        QVERIFY(qEnvironmentVariableIsSet(Variable));
    }

private:
    int m_count = 1;
    char m_name[24] = "tst_WithoutOpenGl";
    char* m_arguments[2] = {m_name, nullptr};
};

QTEST_APPLESS_MAIN(tst_WithoutOpenGl)
#include "tst_WithoutOpenGl.moc"
