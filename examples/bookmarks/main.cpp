// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Prints the bookmarks of an XBEL 1.0 file as a tree, and writes them back if asked to.

#include "BookmarkErrors.h"
#include "BookmarkReader.h"
#include "BookmarkWriter.h"

#include <QCoreApplication>
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

} // namespace

int main(int argc, char** argv)
{
    QCoreApplication application(argc, argv);
    const QStringList arguments = application.arguments();
    const bool writes = arguments.size() == 4 && arguments[2] == "--write";
    if (arguments.size() != 2 && !writes) {
        QTextStream(stderr) << "usage: bookmarks FILE [--write OUT]\n";
        return 2;
    }

    BookmarkReader reader;
    if (!reader.Read(arguments[1]))
        return CannotRead(reader);

    QTextStream out(stdout);
    out << reader.root().title << "/\n";
    PrintTree(out, reader.root(), 1);

    QString error;
    if (writes && !WriteBookmarks(arguments[3], reader.root(), error))
        return CannotWrite(arguments[3], error);
    return 0;
}
