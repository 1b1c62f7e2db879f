// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/WithoutOpenGl.h"

#include <QByteArray>
#include <QGuiApplication>
#include <QOpenGLContext>

namespace Velocor {

namespace {

constexpr char const* Variable = "QT_XCB_GL_INTEGRATION";

} // namespace

WithoutOpenGl::WithoutOpenGl() : m_isSet(!qEnvironmentVariableIsSet(Variable))
{
    if (m_isSet)
        qputenv(Variable, "none");
}

WithoutOpenGl::~WithoutOpenGl()
{
    End();
}

void WithoutOpenGl::End()
{
    if (!m_isSet)
        return;
#ifndef QT_NO_OPENGL
    // The plugin reads the variable when OpenGL is asked for, which the first window would do.
    if (QGuiApplication::platformName() == QLatin1String("xcb"))
        QOpenGLContext::supportsThreadedOpenGL();
#endif
    qunsetenv(Variable);
    m_isSet = false;
}

} // namespace Velocor
