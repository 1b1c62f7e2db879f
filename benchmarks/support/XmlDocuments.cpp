// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "support/XmlDocuments.h"

#include "support/ScratchFolder.h"

int WriteGeneratedDocument(QString const& fileName, qint64 bytes, int elements)
{
    QFile file(fileName);
    Require(file.open(QIODevice::WriteOnly), file.errorString());
    file.write("<?xml version=\"1.0\" encoding=\"UTF-8\"?>\n<bookmarks>\n");
    int written = 1;
    for (int i = 0; (bytes == 0 || file.pos() < bytes) && (elements == 0 || written < elements);
         ++i) {
        const QByteArray number = QByteArray::number(i);
        file.write("  <bookmark id=\"b" + number + "\" href=\"http://example.org/" + number +
                   "/index.html\">\n"
                   "    <title>Bookmark number " +
                   number +
                   "</title>\n"
                   "    <info visits=\"" +
                   number +
                   "\" kept=\"yes\">\n"
                   "      <description>What is to be found there, in a few words</description>\n"
                   "      <icon name=\"text-html\"/>\n"
                   "    </info>\n"
                   "  </bookmark>\n");
        written += 5;
    }
    file.write("</bookmarks>\n");
    return written;
}

bool ReadDocument(QString const& fileName, QXmlDefaultHandler& handler)
{
    QFile file(fileName);
    QXmlInputSource source(&file);
    QXmlSimpleReader reader;
    reader.setContentHandler(&handler);
    reader.setErrorHandler(&handler);
    return reader.parse(source);
}
