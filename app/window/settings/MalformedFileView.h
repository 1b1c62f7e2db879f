// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include <QPlainTextEdit>

namespace Velocor {

struct SettingsDocument;

/// Shows the text of a file that is not a settings file, with the line of the error marked.
/// Read-only. GUI thread only.
class MalformedFileView : public QPlainTextEdit
{
    Q_OBJECT

public:
    explicit MalformedFileView(QWidget* parent = nullptr);

    /// Shows the first MiB of a file.
    ///
    /// @param document  what reading it resulted in
    void ShowFile(QString const& path, SettingsDocument const& document);

private:
    void markLine(int line);
};

} // namespace Velocor
