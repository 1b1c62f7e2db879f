// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QObject>

class QLabel;
class QLineEdit;

namespace Velocor {

/// Says what is wrong with what is being typed, below the field, and colors the field. Deleted with
/// the field. GUI thread only.
class FieldHint : public QObject
{
    Q_OBJECT

public:
    /// @param field  in a parent that has room for the hint; owns this object
    explicit FieldHint(QLineEdit* field);

    /// Shows a problem; an empty one removes hint and color.
    void Show(QString const& problem);

protected:
    bool eventFilter(QObject* object, QEvent* event) override;

private:
    void place();

    QLineEdit* m_field;
    QLabel* m_label;
};

} // namespace Velocor
