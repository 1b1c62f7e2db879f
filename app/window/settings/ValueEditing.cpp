// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/ValueEditing.h"

#include "app/window/settings/FileListDialog.h"
#include "app/window/settings/SizeDialog.h"
#include "app/window/settings/ValueDialog.h"
#include "app/window/settings/WindowPlaceDialog.h"

#include <QColorDialog>
#include <QFontDialog>
#include <QPoint>

namespace Velocor {

namespace {

// Null if a value is still what it was, even where its text is not the one that the store writes.
QString Changed(QString const& before, QString const& after)
{
    return before == after ? QString() : after;
}

QString EditedColor(QString const& name, QString const& text, QWidget* parent)
{
    QColor color(Qt::black);
    const QString before =
        TypedText::ToColor(text, color) ? TypedText::FromColor(color) : QString();
    QColorDialog dialog(color, parent);
    dialog.setOption(QColorDialog::DontUseNativeDialog);
    dialog.setWindowTitle(QObject::tr("Color of %1").arg(name));
    if (dialog.exec() != QDialog::Accepted)
        return QString();
    return Changed(before, TypedText::FromColor(dialog.selectedColor()));
}

QString EditedSize(QString const& name, QString const& text, QWidget* parent)
{
    QSize size(0, 0);
    const QString before = TypedText::ToSize(text, size) ? TypedText::FromSize(size) : QString();
    SizeDialog dialog(name, size, parent);
    if (dialog.exec() != QDialog::Accepted)
        return QString();
    return Changed(before, TypedText::FromSize(dialog.size()));
}

QString EditedFont(QString const& name, QString const& text, QWidget* parent)
{
    QFont font;
    const QString before = TypedText::ToFont(text, font) ? TypedText::FromFont(font) : QString();
    QFontDialog dialog(font, parent);
    dialog.setOption(QFontDialog::DontUseNativeDialog);
    dialog.setWindowTitle(QObject::tr("Font of %1").arg(name));
    if (dialog.exec() != QDialog::Accepted)
        return QString();
    return Changed(before, TypedText::FromFont(dialog.selectedFont()));
}

QString EditedPlace(QString const& name, QString const& text, QWidget* parent)
{
    QPoint position;
    QSize size(0, 0);
    const QString before = TypedText::ToWindowPlace(text, position, size)
                               ? TypedText::FromWindowPlace(position, size)
                               : QString();
    WindowPlaceDialog dialog(name, position, size, parent);
    if (dialog.exec() != QDialog::Accepted)
        return QString();
    return Changed(before, TypedText::FromWindowPlace(dialog.position(), dialog.size()));
}

QString EditedFiles(QString const& name, QString const& text, QWidget* parent)
{
    FileListDialog dialog(name, TypedText::ToFileList(text), parent);
    if (dialog.exec() != QDialog::Accepted)
        return QString();
    return Changed(text, TypedText::FromFileList(dialog.entries()));
}

QString EditedText(QString const& name, QString const& text, QWidget* parent)
{
    ValueDialog dialog(name, text, parent);
    return dialog.exec() == QDialog::Accepted && dialog.isModified()
               ? QLatin1String("") + dialog.value()
               : QString();
}

} // namespace

bool HasValueDialog(ValueKind kind)
{
    return kind >= ValueKind::Color;
}

QString EditedValue(ValueKind kind, QString const& name, QString const& text, QWidget* parent)
{
    switch (kind) {
    case ValueKind::Color:
        return EditedColor(name, text, parent);
    case ValueKind::Size:
        return EditedSize(name, text, parent);
    case ValueKind::Font:
        return EditedFont(name, text, parent);
    case ValueKind::WindowPlace:
        return EditedPlace(name, text, parent);
    case ValueKind::FileList:
        return EditedFiles(name, text, parent);
    default:
        return EditedText(name, text, parent);
    }
}

} // namespace Velocor
