// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// Keeps the toolkit's X11 plugin from setting up OpenGL, which nothing here draws with.
///
/// The set-up loads a graphics driver before the first window can show: more than half of the
/// start's time and two thirds of its memory. The plugin asks the environment once, and is made to
/// do so as soon as the application object stands:
///
///     Velocor::WithoutOpenGl withoutOpenGl;
///     QApplication app(argc, argv);
///     withoutOpenGl.End();
///
/// A user's own QT_XCB_GL_INTEGRATION is left as it is and wins. On other platforms nothing reads
/// the variable. Main thread only, before there are others: the environment is the process's.
class WithoutOpenGl
{
public:
    WithoutOpenGl();
    ~WithoutOpenGl();

    WithoutOpenGl(WithoutOpenGl const&) = delete;
    WithoutOpenGl& operator=(WithoutOpenGl const&) = delete;

    /// Puts the environment back, so that programs started from here do not inherit the setting.
    void End();

private:
    bool m_isSet;
};

} // namespace Velocor
