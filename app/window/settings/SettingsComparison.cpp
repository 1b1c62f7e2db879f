// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/window/settings/SettingsComparison.h"

#include "app/settingsfile/SettingsFileReader.h"
#include "app/settingsfile/SettingsFileWriter.h"
#include "app/window/settings/DifferenceDialog.h"
#include "app/window/settings/SettingsCommands.h"
#include "app/window/widgets/PlainText.h"

#include <QFile>
#include <QFileInfo>

namespace Velocor {

namespace {

// Only the start, which is shown.
QByteArray BytesOf(QString const& path)
{
    QFile file(path);
    const bool isOpen = QFileInfo(path).isFile() && file.open(QIODevice::ReadOnly);
    return isOpen ? file.read(DifferenceDialog::ShownLimit) : QByteArray();
}

} // namespace

void SettingsComparison::tellNotCompared(QString const& path, SettingsDocument const& document)
{
    PlainMessageBox(
        QMessageBox::Critical, m_parent,
        QObject::tr("Cannot compare with %1.\n%2").arg(LeftToRight(path), document.error))
        .exec();
}

void SettingsComparison::ShowSaving(QString const& path)
{
    SettingsDocument before = SettingsFileReader::ReadShown(path);
    if (before.isTooLarge) {
        tellNotCompared(path, before);
        return;
    }
    QVector<SettingsDocument::Loss> losses =
        before.losses + SettingsFileWriter::Losses(m_model->document());
    const int unlisted = before.lossCount - before.losses.size();
    if (unlisted > 0)
        losses.append({QString(), QString(), QObject::tr("and %1 more").arg(unlisted)});
    if (!before.isParsed)
        before = SettingsDocument();
    const QByteArray bytes = SettingsFileWriter::ToBytes(m_model->document());
    DifferenceDialog dialog(
        QObject::tr("What Will Be Written to %1").arg(QFileInfo(path).fileName()), m_parent);
    dialog.SetSides({QObject::tr("The file now"), before, BytesOf(path)},
                    {QObject::tr("After saving"), SettingsFileReader::ReadBytes(bytes), bytes},
                    losses);
    dialog.exec();
}

void SettingsComparison::CompareWith(QString const& path, QString const& title)
{
    const SettingsDocument other = SettingsFileReader::ReadShown(path);
    if (!other.isParsed) {
        tellNotCompared(path, other);
        return;
    }
    DifferenceDialog dialog(QObject::tr("Compare With %1").arg(QFileInfo(path).fileName()),
                            m_parent);
    const QByteArray bytes = BytesOf(path);
    const auto show = [&] {
        dialog.SetSides({QObject::tr("In the editor"), m_model->document(),
                         SettingsFileWriter::ToBytes(m_model->document())},
                        {title, other, bytes});
        dialog.SetCanUndo(m_commands->undoStack()->canUndo());
    };
    dialog.AllowTakeOver();
    QObject::connect(&dialog, &DifferenceDialog::takeOverRequested, &dialog,
                     [&](SettingsDocument const& document) {
                         m_commands->Replace(document, QObject::tr("Take Over"));
                         show();
                     });
    QObject::connect(&dialog, &DifferenceDialog::undoRequested, &dialog, [&] {
        m_commands->undoStack()->undo();
        show();
    });
    show();
    dialog.exec();
}

} // namespace Velocor
