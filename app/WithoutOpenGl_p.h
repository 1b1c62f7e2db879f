// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Keeps Qt's X11 plugin from initializing OpenGL, which this program does not use.
///
/// Initialization loads a graphics driver before the first window is shown, which costs time and
/// memory. The plugin reads an environment variable once; this class makes it do so as soon as the
/// application object exists:
///
///     Velocor::WithoutOpenGl withoutOpenGl;
///     QApplication app(argc, argv);
///     withoutOpenGl.End();
///
/// If the user has set QT_XCB_GL_INTEGRATION, that value is kept. Other platforms ignore the
/// variable. Main thread only, before other threads start: the environment belongs to the process.
class WithoutOpenGl
{
public:
    WithoutOpenGl();
    ~WithoutOpenGl();

    WithoutOpenGl(WithoutOpenGl const&) = delete;
    WithoutOpenGl& operator=(WithoutOpenGl const&) = delete;

    /// Restores the environment, so that child processes do not inherit the setting.
    void End();

private:
    bool m_isSet;
};

} // namespace Velocor
