// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "BookmarkWriter.h"

#include "common/xml/TorkXmlFile.h"

namespace {

void WriteTitle(TorkXmlFile& writer, QString title)
{
    // The writer puts markup into a CDATA section, but a section end inside is up to its caller.
    title.replace("]]>", "]]]]><![CDATA[>");
    writer.WriteElement("title", title);
}

void WriteBookmark(TorkXmlFile& writer, Bookmark const& bookmark)
{
    writer.WriteElementOpen("bookmark", 1);
    writer.WriteAttribute("href", bookmark.address.toHtmlEscaped()); // values are written as given
    if (bookmark.title.isEmpty()) {
        writer.WriteElementCloseAndEnd("bookmark", 1);
        return;
    }
    writer.WriteElementClose("bookmark", 0); // 0: what follows is indented
    WriteTitle(writer, bookmark.title);
    writer.WriteElementEnd("bookmark", 1);
}

void WriteChildren(TorkXmlFile& writer, Bookmark const& folder)
{
    for (auto const& child : folder.children) {
        if (!child->isFolder) {
            WriteBookmark(writer, *child);
            continue;
        }
        writer.WriteElementStart("folder", 1);
        WriteTitle(writer, child->title);
        WriteChildren(writer, *child);
        writer.WriteElementEnd("folder", 1);
    }
}

} // namespace

bool WriteBookmarks(QString const& path, Bookmark const& root, QString& error)
{
    TorkXmlFile writer(path);
    if (!writer.open(QIODevice::WriteOnly)) {
        error = writer.errorString();
        return false;
    }

#if QT_VERSION < QT_VERSION_CHECK(6, 0, 0) // Qt 6 writes UTF-8 anyway
    writer.setCodec("UTF-8");
#endif
    writer.Write("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n");
    writer.Write("<!DOCTYPE xbel>\n");
    writer.WriteElementOpen("xbel", 1);
    writer.WriteAttribute("version", "1.0");
    writer.WriteElementClose("xbel", 0);
    WriteTitle(writer, root.title);
    WriteChildren(writer, root);
    writer.WriteElementEnd("xbel", 1);

    // The operations above do not report a failed write; the stream's status does.
    writer.flush();
    if (writer.status() != QTextStream::Ok) {
        error = writer.errorString();
        return false;
    }
    writer.close();
    return true;
}
