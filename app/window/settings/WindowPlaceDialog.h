// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "app/window/widgets/FittingDialog.h"

#include <QSize>

class QLabel;
class QSpinBox;

namespace Velocor {

class WindowPicture;

/// Edits the place of a window, with a picture of the desktop that shows where the store would open
/// it. GUI thread only.
class WindowPlaceDialog : public FittingDialog
{
    Q_OBJECT

public:
    /// @param name  the name of the value
    /// @param position, size  at first
    WindowPlaceDialog(QString const& name, QPoint const& position, QSize const& size,
                      QWidget* parent = nullptr);

    /// What is in the fields; not fitted to the desktop.
    QPoint position() const;
    QSize size() const;

private:
    void showPlace();

    QSpinBox* m_x;
    QSpinBox* m_y;
    QSpinBox* m_width;
    QSpinBox* m_height;
    WindowPicture* m_picture;
    QLabel* m_place;
};

} // namespace Velocor
