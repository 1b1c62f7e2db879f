// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

// Any UTF-16 text survives both encodings, and a file that is saved and loaded; any text at all can
// be decoded.

#include "FuzzInput.h"

#include "common/config/TorkConfigFile.h"
#include "common/config/TorkConfigText.h"

#include <QCoreApplication>
#include <QTemporaryDir>

namespace {

// Two bytes per unit reach every text, and UTF-8 the readable ones.
QString Text(uint8_t const* data, size_t size)
{
    if (size % 2 != 0)
        return QString::fromUtf8(reinterpret_cast<char const*>(data), int(size));
    QString units;
    for (size_t i = 0; i < size; i += 2)
        units += QChar(static_cast<ushort>(data[i] << 8 | data[i + 1]));
    return units;
}

using Encoder = QString (*)(QString const&);
using Decoder = QString (*)(QString const&, bool*);

void ComeBack(QString const& text, Encoder encode, Decoder decode)
{
    bool ok = false;
    Require(decode(encode(text), &ok) == text && ok);

    const QString decoded = decode(text, &ok);
    Require(ok ? encode(decoded) == text : decoded == text);
}

// In all three places in a file.
void ComeBackFromFile(QString const& path, QString const& text)
{
    const QString value = TorkConfigText::EncodeValue(text);
    const QString name = TorkConfigText::EncodeName(text);
    TorkConfigFile saved(path);
    Require(saved.WriteItem(name, name, value));
    Require(saved.WriteItem("Later", "key", name));
    saved.Save();
    Require(saved.m_lastError.isEmpty());

    TorkConfigFile loaded(path);
    Require(loaded.Load());
    QString none, found;
    Require(loaded.ReadItem(name, name, none, found));
    Require(TorkConfigText::DecodeValue(found) == text);
    Require(loaded.keyList(name).contains(name));
    Require(loaded.ReadItem("Later", "key", none, found));
    Require(TorkConfigText::DecodeName(found) == text);
}

} // namespace

extern "C" int LLVMFuzzerInitialize(int* argc, char*** argv)
{
    SilenceMessages();
    static QCoreApplication application(*argc, *argv);
    return 0;
}

extern "C" int LLVMFuzzerTestOneInput(uint8_t const* data, size_t size)
{
    static const QTemporaryDir folder;

    const QString text = Text(data, size);
    ComeBack(text, TorkConfigText::EncodeValue, TorkConfigText::DecodeValue);
    ComeBack(text, TorkConfigText::EncodeName, TorkConfigText::DecodeName);
    ComeBackFromFile(folder.filePath("text.cfg"), text);
    return 0;
}
