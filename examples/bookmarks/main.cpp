// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Prints the bookmarks of an XBEL 1.0 file as a tree, and optionally writes them to a new file.
// Remembers which files it has read.

#include "BookmarkErrors.h"
#include "BookmarkReader.h"
#include "BookmarkWriter.h"
#include "ReadFiles.h"

#include <QCoreApplication>
#include <QFileInfo>
#include <QStandardPaths>
#include <QStringList>
#include <QTextStream>

namespace {

void PrintTree(QTextStream& out, Bookmark const& folder, int depth)
{
    for (auto const& child : folder.children) {
        out << QString(2 * depth, ' ') << child->title;
        if (child->isFolder) {
            out << "/\n";
            PrintTree(out, *child, depth + 1);
        } else {
            out << " <" << child->address << ">\n";
        }
    }
}

int CannotRead(BookmarkReader const& reader)
{
    QString report;
    reader.FormatErrors(report);
    QTextStream(stderr) << report;
    return 1;
}

int CannotWrite(QString const& path, QString const& reason)
{
    QString text;
    BookmarkErrors().decode(BookmarkErrors::CannotWrite, text);
    QTextStream(stderr) << path << ": " << text << ' ' << reason << '\n';
    return 1;
}

QString SettingsFile()
{
    return QStandardPaths::writableLocation(QStandardPaths::AppDataLocation) + "/bookmarks.cfg";
}

} // namespace

int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    QCoreApplication::setOrganizationName("Tork");
    QCoreApplication::setApplicationName("Bookmarks");
    const QStringList arguments = application.arguments();
    QTextStream out(stdout);
    ReadFiles files(SettingsFile());
    if (arguments.size() == 2 && arguments[1] == "--files") {
        files.Print(out);
        return 0;
    }
    const bool writes = arguments.size() == 4 && arguments[2] == "--write";
    if (arguments.size() != 2 && !writes) {
        QTextStream(stderr) << "usage: bookmarks FILE [--write OUT]\n"
                               "       bookmarks --files\n";
        return 2;
    }

    BookmarkReader reader;
    if (!reader.Read(arguments[1]))
        return CannotRead(reader);

    const QString unkept =
        files.Note(QFileInfo(arguments[1]).absoluteFilePath(), reader.root().title);
    if (!unkept.isEmpty())
        QTextStream(stderr) << unkept << '\n';

    out << reader.root().title << "/\n";
    PrintTree(out, reader.root(), 1);

    QString error;
    if (writes && !WriteBookmarks(arguments[3], reader.root(), error))
        return CannotWrite(arguments[3], error);
    return 0;
}
