// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Typed values: every reader takes every text, and says the same of it twice.

#include "FuzzInput.h"

#include "common/config/TorkConfigFile.h"

#include <QColor>
#include <QFont>
#include <QGuiApplication>
#include <QPoint>
#include <QSize>

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv)
{
    SilenceMessages();
    qputenv("QT_QPA_PLATFORM", "offscreen");
    static QGuiApplication application(*argc, *argv); // fonts need one
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    const QString text = QString::fromUtf8(reinterpret_cast<char const*>(data), int(size)) + "";
    TorkConfigFile settings{QString()};
    settings.WriteItem("s", "k", text);
    settings.WriteItem("ApplicationScreens", "k", text);

    int number = 1;
    Require(settings.ReadInt("s", "k", 7, number) || number == 7);

    unsigned int natural = 1;
    Require(settings.ReadUint("s", "k", 7, natural) || natural == 1);

    bool yes = false;
    Require(settings.ReadBool("s", "k", true, yes));

    QColor colour(1, 2, 3);
    Require(settings.ReadColor("s", "k", colour) || colour == QColor(1, 2, 3));

    QSize extent(1, 2);
    Require(settings.ReadSize("s", "k", extent) || extent == QSize(1, 2));

    QFont font;
    Require(settings.ReadFont("s", "k", font));

    QPoint position(3, 4);
    settings.ReadScreenMetrics("k", position, extent);
    return 0;
}
