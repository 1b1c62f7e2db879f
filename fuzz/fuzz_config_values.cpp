// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Typed values: every reader accepts every text, sets what it promises and nothing else; its result
// can be written and is read back unchanged.

#include "FuzzInput.h"

#include "common/config/TorkConfigFile.h"

#include <QApplication>
#include <QColor>
#include <QFont>
#include <QPoint>
#include <QSize>

namespace {

void ReadTexts(TorkConfigFile& settings, QString const& text)
{
    QString none, value;
    Require(settings.ReadItem("s", "k", none, value) && value == text);
}

void ReadNumbers(TorkConfigFile& settings, QString const& text)
{
    bool isNumber = false;
    const int expected = text.toInt(&isNumber);

    int number = 1;
    Require(settings.ReadInt("s", "k", 7, number) == isNumber);
    Require(number == (isNumber ? expected : 7));

    unsigned int natural = 1;
    Require(settings.ReadUint("s", "k", 7, natural) == isNumber);
    Require(natural == (isNumber ? static_cast<unsigned int>(expected) : 1));

    settings.WriteItem("s", "again", number);
    int again = 0;
    Require(settings.ReadInt("s", "again", 0, again) && again == number);
}

void ReadTruth(TorkConfigFile& settings, QString const& text)
{
    const QStringList truths = {"1", "y", "yes", "t", "true"};
    for (bool byDefault : {false, true}) {
        bool truth = byDefault;
        Require(settings.ReadBool("s", "k", byDefault, truth));
        Require(truth == truths.contains(text.toLower()));
    }
}

void ReadColour(TorkConfigFile& settings)
{
    QColor colour(1, 2, 3);
    if (!settings.ReadColor("s", "k", colour)) {
        Require(colour == QColor(1, 2, 3));
        return;
    }
    if (!colour.isValid())
        return;
    QColor again;
    settings.WriteColor("s", "again", colour);
    Require(settings.ReadColor("s", "again", again) && again == colour);
}

void ReadExtent(TorkConfigFile& settings)
{
    QSize extent(1, 2);
    if (!settings.ReadSize("s", "k", extent)) {
        Require(extent == QSize(1, 2));
        return;
    }
    if (extent.width() < 0 || extent.height() < 0)
        return; // cannot be written in this form: a minus sign is a separator
    QSize again;
    settings.WriteSize("s", "again", extent);
    Require(settings.ReadSize("s", "again", again) && again == extent);
}

void ReadMetrics(TorkConfigFile& settings, QString const& text)
{
    QPoint position(3, 4);
    QSize extent(5, 6);
    const bool found = settings.ReadScreenMetrics("k", position, extent);
    if (text.count(',') != 3)
        Require(found && position == QPoint(0, 0) && extent == QSize(0, 0));
    else if (!found)
        Require(position == QPoint(3, 4) && extent == QSize(5, 6));
    else
        Require(position.x() >= 0 && position.y() >= 0);
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv)
{
    SilenceMessages();
    qputenv("QT_QPA_PLATFORM", "offscreen");
    static QApplication application(*argc, *argv); // fonts and the desktop's size need one
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    const QString text = QString::fromUtf8(reinterpret_cast<char const*>(data), int(size)) + "";
    TorkConfigFile settings{QString()};
    Require(settings.WriteItem("s", "k", text));
    Require(settings.WriteItem("ApplicationScreens", "k", text));

    ReadTexts(settings, text);
    ReadNumbers(settings, text);
    ReadTruth(settings, text);
    ReadColour(settings);
    ReadExtent(settings);
    ReadMetrics(settings, text);

    QFont font;
    Require(settings.ReadFont("s", "k", font));
    return 0;
}
