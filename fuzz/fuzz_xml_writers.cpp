// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Both XML writers over any sequence of calls: the same results and the same bytes.

#include "FuzzInput.h"

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"

#include <QTemporaryDir>

namespace {

template <class Writer>
int Call(Writer& writer, uint8_t operation, QString const& name, QString const& value, int indent)
{
    switch (operation % 9) {
    case 0:
        return writer.WriteElementOpen(name, indent);
    case 1:
        return writer.WriteElementClose(name, indent);
    case 2:
        return writer.WriteElementCloseAndEnd(name, indent);
    case 3:
        return writer.WriteElementStart(name, indent);
    case 4:
        return writer.WriteElementEnd(name, indent);
    case 5:
        return writer.WriteElement(name, value);
    case 6:
        return writer.WriteAttribute(name, value);
    case 7:
        return writer.WriteElementValue(value);
    default:
        return writer.WriteCurrentIndent();
    }
}

} // namespace

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    static QTemporaryDir folder;
    const QString path = folder.path() + "/out.xml";
    QByteArray bytes;
    {
        TorkXmlStream stream(&bytes, QIODevice::WriteOnly);
        TorkXmlFile file(path);
        Require(file.open(QIODevice::WriteOnly));
        FuzzInput input(data, size);
        while (!input.atEnd()) {
            const uint8_t operation = input.byte();
            const QString name = input.text();
            const QString value = input.text();
            const int indent = static_cast<signed char>(input.byte()) % 8;
            const int result = Call(stream, operation, name, value, indent);
            Require(result == 0 || (result == 1005 && name.isEmpty()));
            Require(result == Call(file, operation, name, value, indent));
        }
    }

    QFile written(path);
    Require(written.open(QIODevice::ReadOnly));
    Require(written.readAll() == bytes);
    return 0;
}
