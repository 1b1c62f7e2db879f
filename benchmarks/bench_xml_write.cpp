// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Writing XML of many elements to a file and to memory.

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"
#include "support/BenchmarkMain.h"
#include "support/ScratchFolder.h"

#include <QBuffer>
#include <QFile>
#include <QTextStream>
#include <QVector>
#include <QXmlStreamWriter>

#include <benchmark/benchmark.h>
#include <libxml/xmlwriter.h>
#include <pugixml.hpp>

#include <array>
#include <memory>
#include <string>
#include <vector>

namespace {

// The contents repeat, so that loading them from memory is not measured.
constexpr int Variants = 1024;
constexpr int AttributesOfElement = 6;

const char* const RootName = "folder";
const char* const LeafName = "title";
const char* const ElementName = "item";
const std::array<const char*, AttributesOfElement> AttributeNames = {"id", "kind", "x",
                                                                     "y",  "w",    "h"};

std::string LeafText(int variant)
{
    return "Bookmark number " + std::to_string(1000 + variant);
}

std::string AttributeText(int variant, int attribute)
{
    return std::to_string(1000 + variant + attribute * 7);
}

// The same texts in each library's own string type.
template <class Text>
struct Texts
{
    Text root;
    Text leaf;
    Text element;
    std::vector<Text> attributeNames;
    std::vector<Text> leafTexts;
    std::vector<std::vector<Text>> attributeTexts;

    explicit Texts(Text (*convert)(std::string const&))
        : root(convert(RootName)), leaf(convert(LeafName)), element(convert(ElementName))
    {
        for (const char* name : AttributeNames)
            attributeNames.push_back(convert(name));
        for (int variant = 0; variant < Variants; ++variant) {
            leafTexts.push_back(convert(LeafText(variant)));
            attributeTexts.emplace_back();
            for (int attribute = 0; attribute < AttributesOfElement; ++attribute)
                attributeTexts.back().push_back(convert(AttributeText(variant, attribute)));
        }
    }
};

Texts<QString> const& WideTexts()
{
    static const Texts<QString> texts(QString::fromStdString);
    return texts;
}

Texts<std::string> const& NarrowTexts()
{
    static const Texts<std::string> texts([](std::string const& text) { return text; });
    return texts;
}

// In a mixed document every eleventh element has attributes, the others are leaves.
enum class Shape { Mixed, Leaves, Attributes };

struct Work
{
    Shape shape;
    int elements;
    bool toFile;

    bool isLeaf(int element) const
    {
        return shape == Shape::Leaves || (shape == Shape::Mixed && element % 11 != 0);
    }
};

// Each writes the whole document of `work` to the file, or to its own byte array if the work does
// not use a file, and returns the number of bytes.

template <class Writer>
void WriteWithTork(Writer& writer, Work const& work)
{
    Texts<QString> const& texts = WideTexts();
    writer.WriteElementStart(texts.root, 1);
    for (int i = 0; i < work.elements; ++i) {
        const size_t variant = size_t(i % Variants);
        if (work.isLeaf(i)) {
            writer.WriteElement(texts.leaf, texts.leafTexts[variant]);
            continue;
        }
        writer.WriteElementOpen(texts.element, 1);
        for (size_t attribute = 0; attribute < AttributesOfElement; ++attribute)
            writer.WriteAttribute(texts.attributeNames[attribute],
                                  texts.attributeTexts[variant][attribute]);
        writer.WriteElementCloseAndEnd(texts.element, 1);
    }
    writer.WriteElementEnd(texts.root, 1);
}

qint64 WriteTork(Work const& work, QString const& fileName)
{
    if (work.toFile) {
        TorkXmlFile writer(fileName);
        Require(writer.open(QIODevice::WriteOnly), writer.errorString());
        WriteWithTork(writer, work);
        writer.flush();
        writer.close();
        return 0;
    }
    QByteArray bytes;
    TorkXmlStream writer(&bytes, QIODevice::WriteOnly);
    WriteWithTork(writer, work);
    writer.flush();
    return bytes.size();
}

// The lines of the variants, and the root's tags around them.
struct ReadyLines
{
    QString start;
    QVector<QString> elements;
    QString end;

    explicit ReadyLines(Shape shape)
    {
        QByteArray bytes;
        TorkXmlStream writer(&bytes, QIODevice::WriteOnly);
        WriteWithTork(writer, {shape, Variants, false});
        writer.flush();

        for (QByteArray const& line : bytes.split('\n'))
            elements.append(QString::fromLatin1(line) + '\n');
        Require(elements.size() == Variants + 3, QStringLiteral("an element is not one line"));
        elements.removeLast(); // what follows the last line end
        start = elements.takeFirst();
        end = elements.takeLast();
    }
};

struct KeptLines
{
    const ReadyLines leaves{Shape::Leaves};
    const ReadyLines attributes{Shape::Attributes};
};

KeptLines const& Lines()
{
    static const KeptLines lines;
    return lines;
}

void WriteReadyLines(QTextStream& stream, Work const& work)
{
    KeptLines const& lines = Lines();
    stream << lines.leaves.start;
    for (int i = 0; i < work.elements; ++i) {
        ReadyLines const& kind = work.isLeaf(i) ? lines.leaves : lines.attributes;
        stream << kind.elements.at(i % Variants);
    }
    stream << lines.leaves.end;
    stream.flush();
}

qint64 WriteFloor(Work const& work, QString const& fileName)
{
    if (work.toFile) {
        QFile file(fileName);
        Require(file.open(QIODevice::WriteOnly), file.errorString());
        QTextStream stream(&file);
        WriteReadyLines(stream, work);
        return 0;
    }
    QByteArray bytes;
    QTextStream stream(&bytes, QIODevice::WriteOnly);
    WriteReadyLines(stream, work);
    return bytes.size();
}

void WriteQt(QXmlStreamWriter& writer, Work const& work)
{
    Texts<QString> const& texts = WideTexts();
    writer.setAutoFormatting(true);
    writer.setAutoFormattingIndent(2);
    writer.writeStartElement(texts.root);
    for (int i = 0; i < work.elements; ++i) {
        const size_t variant = size_t(i % Variants);
        if (work.isLeaf(i)) {
            writer.writeTextElement(texts.leaf, texts.leafTexts[variant]);
            continue;
        }
        writer.writeEmptyElement(texts.element);
        for (size_t attribute = 0; attribute < AttributesOfElement; ++attribute)
            writer.writeAttribute(texts.attributeNames[attribute],
                                  texts.attributeTexts[variant][attribute]);
    }
    writer.writeEndElement();
    writer.writeEndDocument();
}

qint64 WriteQt(Work const& work, QString const& fileName)
{
    if (work.toFile) {
        QFile file(fileName);
        Require(file.open(QIODevice::WriteOnly), file.errorString());
        QXmlStreamWriter writer(&file);
        WriteQt(writer, work);
        return 0;
    }
    QByteArray bytes;
    QXmlStreamWriter writer(&bytes);
    WriteQt(writer, work);
    return bytes.size();
}

xmlChar const* Xml(std::string const& text)
{
    return reinterpret_cast<xmlChar const*>(text.c_str());
}

void WriteLibxml2(xmlTextWriterPtr writer, Work const& work)
{
    Texts<std::string> const& texts = NarrowTexts();
    xmlTextWriterSetIndent(writer, 1);
    xmlTextWriterSetIndentString(writer, Xml("  "));
    xmlTextWriterStartElement(writer, Xml(texts.root));
    for (int i = 0; i < work.elements; ++i) {
        const size_t variant = size_t(i % Variants);
        if (work.isLeaf(i)) {
            xmlTextWriterWriteElement(writer, Xml(texts.leaf), Xml(texts.leafTexts[variant]));
            continue;
        }
        xmlTextWriterStartElement(writer, Xml(texts.element));
        for (size_t attribute = 0; attribute < AttributesOfElement; ++attribute)
            xmlTextWriterWriteAttribute(writer, Xml(texts.attributeNames[attribute]),
                                        Xml(texts.attributeTexts[variant][attribute]));
        xmlTextWriterEndElement(writer);
    }
    xmlTextWriterEndElement(writer);
    xmlFreeTextWriter(writer);
}

qint64 WriteLibxml2(Work const& work, QString const& fileName)
{
    if (work.toFile) {
        WriteLibxml2(xmlNewTextWriterFilename(QFile::encodeName(fileName).constData(), 0), work);
        return 0;
    }
    xmlBufferPtr buffer = xmlBufferCreate();
    WriteLibxml2(xmlNewTextWriterMemory(buffer, 0), work);
    const qint64 length = xmlBufferLength(buffer);
    xmlBufferFree(buffer);
    return length;
}

void BuildPugi(pugi::xml_node root, Work const& work)
{
    Texts<std::string> const& texts = NarrowTexts();
    for (int i = 0; i < work.elements; ++i) {
        const size_t variant = size_t(i % Variants);
        if (work.isLeaf(i)) {
            root.append_child(LeafName).text().set(texts.leafTexts[variant].c_str());
            continue;
        }
        pugi::xml_node element = root.append_child(ElementName);
        for (size_t attribute = 0; attribute < AttributesOfElement; ++attribute)
            element.append_attribute(AttributeNames[attribute])
                .set_value(texts.attributeTexts[variant][attribute].c_str());
    }
}

class CollectBytes : public pugi::xml_writer
{
public:
    void write(void const* data, size_t size) override
    {
        m_bytes.append(static_cast<char const*>(data), size);
    }
    qint64 size() const { return qint64(m_bytes.size()); }

private:
    std::string m_bytes;
};

qint64 WritePugi(Work const& work, QString const& fileName)
{
    pugi::xml_document document;
    BuildPugi(document.append_child(RootName), work);
    const unsigned int flags = pugi::format_indent | pugi::format_no_declaration;
    if (work.toFile) {
        Require(document.save_file(QFile::encodeName(fileName).constData(), "  ", flags),
                QStringLiteral("pugixml did not save"));
        return 0;
    }
    CollectBytes bytes;
    document.save(bytes, "  ", flags);
    return bytes.size();
}

using Write = qint64 (*)(Work const& work, QString const& fileName);

// One document per iteration. All write about the same: the peers differ by a line end, and by a
// space in an empty element.
void WriteDocument(benchmark::State& state, Work work, Write write)
{
    const ScratchFolder folder;
    const QString fileName = folder.file("written.xml");
    NarrowTexts();
    WideTexts();
    Lines();

    qint64 bytes = 0;
    for (auto _ : state)
        bytes = write(work, fileName);
    if (work.toFile)
        bytes = QFile(fileName).size();

    const qint64 expected = WriteTork({work.shape, work.elements, false}, QString());
    Require(qAbs(bytes - expected) <= work.elements + 50,
            QStringLiteral("%1 bytes were written, not %2").arg(bytes).arg(expected));
    state.counters["units"] = work.elements;
}

void RegisterWork(std::string const& group, Work const& work)
{
    const std::vector<std::pair<char const*, Write>> contestants = {
        {"floor: text stream, ready lines", WriteFloor},
        {work.toFile ? "TorkXmlFile" : "TorkXmlStream", WriteTork},
        {"QXmlStreamWriter", WriteQt},
        {"libxml2", WriteLibxml2},
        {"pugixml, built and saved", WritePugi},
    };
    for (auto const& contestant : contestants) {
        benchmark::RegisterBenchmark((group + '|' + contestant.first).c_str(), WriteDocument, work,
                                     contestant.second)
            ->Iterations(1)
            ->UseRealTime();
    }
}

} // namespace

// A quick run writes as much: a smaller document would fit in memory that is already allocated, and
// allocation is a part of the cost of writing bytes.
void RegisterBenchmarks(bool)
{
    const int elements = 1100000;
    RegisterWork("document to file", {Shape::Mixed, elements, true});
    RegisterWork("document to bytes", {Shape::Mixed, elements, false});
    RegisterWork("leaves only, to bytes", {Shape::Leaves, elements / 2, false});
    RegisterWork("elements with six attributes only, to bytes",
                 {Shape::Attributes, elements / 10, false});
}
