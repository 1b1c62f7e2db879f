// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Writes a settings file with values of every type, or prints the values of one. Built with either
// version of Qt, it writes the same bytes, and prints the same values of the other's file:
// scripts/check-exchange.sh.
//
//     exchanged_values write FILE
//     exchanged_values print FILE

#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"

#include <QColor>
#include <QFont>
#include <QGuiApplication>
#include <QSize>

#include <cstdio>
#include <random>

namespace {

constexpr int Rounds = 500;
constexpr QFont::Weight Weights[] = {QFont::Thin,   QFont::ExtraLight, QFont::Light,
                                     QFont::Normal, QFont::Medium,     QFont::DemiBold,
                                     QFont::Bold,   QFont::ExtraBold,  QFont::Black};
constexpr QFont::StyleHint Hints[] = {QFont::AnyStyle, QFont::SansSerif, QFont::Serif,
                                      QFont::TypeWriter, QFont::Monospace};
constexpr QFont::Style Styles[] = {QFont::StyleNormal, QFont::StyleItalic, QFont::StyleOblique};

// The standard's distributions differ from library to library.
class Random
{
public:
    unsigned below(unsigned limit) { return m_engine() % limit; }
    bool coin() { return below(2) == 0; }
    template <typename T, std::size_t size>
    T oneOf(T const (&values)[size])
    {
        return values[below(size)];
    }

private:
    std::mt19937 m_engine{1};
};

QString Text(Random& random)
{
    static constexpr ushort Characters[] = {'a', 'Z', '0',  ' ',    '<',
                                            '&', '"', 0xe4, 0x20ac, 0x4e2d};
    QString text;
    for (unsigned length = random.below(12); length > 0; --length)
        text += QChar(random.oneOf(Characters));
    return text;
}

QFont Font(Random& random)
{
    static constexpr char const* Families[] = {"Helvetica", "Courier New", "M\xc3\xbcnchen"};
    QFont font(QString::fromUtf8(random.oneOf(Families)));
    if (random.coin())
        font.setPointSizeF(6 + random.below(40) / 2.0);
    else
        font.setPixelSize(6 + int(random.below(40)));
    font.setStyleHint(random.oneOf(Hints));
    font.setWeight(random.oneOf(Weights));
    font.setStyle(random.oneOf(Styles));
    font.setUnderline(random.coin());
    font.setStrikeOut(random.coin());
    font.setFixedPitch(random.coin());
    if (random.coin())
        font.setStyleName(QStringLiteral("Condensed"));
    return font;
}

int WeightNumber(QFont const& font)
{
    int number = 0;
    for (QFont::Weight weight : Weights) {
        if (int(font.weight()) == int(weight))
            return number;
        ++number;
    }
    return -1;
}

bool Write(QString const& path)
{
    TorkConfigFile file(path);
    Random random;
    for (int round = 0; round < Rounds; ++round) {
        const QString section = QStringLiteral("round%1").arg(round);
        QColor color(int(random.below(256)), int(random.below(256)), int(random.below(256)));
        QSize size(int(random.below(10000)), int(random.below(10000)));
        QFont font = Font(random);
        file.WriteItem(section, QStringLiteral("int"), int(random.below(1u << 31)) - (1 << 30));
        file.WriteItem(section, QStringLiteral("unsigned"), random.below(~0u));
        file.WriteItem(section, QStringLiteral("text"), TorkConfigText::EncodeValue(Text(random)));
        file.WriteBool(section, QStringLiteral("bool"), random.coin());
        file.WriteColor(section, QStringLiteral("color"), color);
        file.WriteSize(section, QStringLiteral("size"), size);
        file.WriteFont(section, QStringLiteral("font"), font);
    }
    return file.Save();
}

bool Print(QString const& path)
{
    TorkConfigFile file(path);
    if (!file.Load())
        return false;
    for (int round = 0; round < Rounds; ++round) {
        const QString section = QStringLiteral("round%1").arg(round);
        int number = 0;
        unsigned natural = 0;
        bool flag = false;
        QString none, text;
        QColor color;
        QSize size;
        QFont font;
        const bool all = file.ReadInt(section, QStringLiteral("int"), 0, number) &&
                         file.ReadItem(section, QStringLiteral("text"), none, text) &&
                         file.ReadBool(section, QStringLiteral("bool"), false, flag) &&
                         file.ReadColor(section, QStringLiteral("color"), color) &&
                         file.ReadSize(section, QStringLiteral("size"), size) &&
                         file.ReadFont(section, QStringLiteral("font"), font);
        const bool isNatural = file.ReadUint(section, QStringLiteral("unsigned"), 0, natural);
        std::printf("%d %d %d %u \"%s\" %d %06x %dx%d\n", all, number, isNatural, natural,
                    TorkConfigText::DecodeValue(text).toUtf8().constData(), flag,
                    color.rgb() & 0xffffff, size.width(), size.height());
        std::printf("%s %g %d hint %d weight %d style %d %d %d %d \"%s\"\n",
                    font.family().toUtf8().constData(), font.pointSizeF(), font.pixelSize(),
                    int(font.styleHint()), WeightNumber(font), int(font.style()), font.underline(),
                    font.strikeOut(), font.fixedPitch(), font.styleName().toUtf8().constData());
    }
    return true;
}

} // namespace

int main(int argc, char* argv[])
{
    const QGuiApplication application(argc, argv);
    const QStringList arguments = QGuiApplication::arguments();
    if (arguments.size() != 3)
        return 2;
    return (arguments.at(1) == QLatin1String("write") ? Write : Print)(arguments.at(2)) ? 0 : 1;
}
