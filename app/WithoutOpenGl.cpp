// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/WithoutOpenGl_p.h"

#include <QGuiApplication>
#include <QOpenGLContext>

#include <cstdlib>

namespace Velocor {

namespace {

constexpr char const* Variable = "QT_XCB_GL_INTEGRATION";

} // namespace

// NOLINTBEGIN(concurrency-mt-unsafe): no other threads are running yet.

// Runs before the application object exists, so it uses the C library only.
WithoutOpenGl::WithoutOpenGl() : m_isSet(!getenv(Variable))
{
    if (m_isSet)
        setenv(Variable, "none", 1);
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
    // The plugin reads the variable when OpenGL is first queried, normally by the first window.
    if (QGuiApplication::platformName() == QLatin1String("xcb"))
        QOpenGLContext::supportsThreadedOpenGL();
#endif
    unsetenv(Variable);
    m_isSet = false;
}

// NOLINTEND(concurrency-mt-unsafe)

} // namespace Velocor
