// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Parsing a large generated document and a real one through states.

#include "support/BenchmarkMain.h"
#include "support/ScratchFolder.h"
#include "support/XmlDocuments.h"

#include <benchmark/benchmark.h>

#include <memory>

namespace {

template <class Handler>
void Parse(benchmark::State& state, QString const& fileName)
{
    for (auto _ : state) {
        Handler handler;
        Require(ReadDocument(fileName, handler), fileName + QStringLiteral(" was not parsed"));
    }
}

void RegisterDocument(std::string const& group, QString const& fileName, int times)
{
    benchmark::RegisterBenchmark((group + "|floor: SAX reader, empty handler").c_str(),
                                 Parse<QXmlDefaultHandler>, fileName)
        ->Iterations(times)
        ->UseRealTime();
    benchmark::RegisterBenchmark((group + "|parse manager, flush states").c_str(),
                                 Parse<SkippingManager>, fileName)
        ->Iterations(times)
        ->UseRealTime();
}

} // namespace

void RegisterBenchmarks(bool quick)
{
    static const ScratchFolder folder;
    const QString generated = folder.file("generated.xml");
    WriteGeneratedDocument(generated, quick ? 10000000 : 50000000, 0);
    RegisterDocument("parse generated document", generated, 1);

    // Copied, so that its disk is not measured.
    const QString mime = folder.file("mime.xml");
    const QString installed = QStringLiteral("/usr/share/mime/packages/freedesktop.org.xml");
    Require(QFile::copy(installed, mime), installed + QStringLiteral(" cannot be copied"));
    RegisterDocument("parse shared MIME database", mime, 1);
}
