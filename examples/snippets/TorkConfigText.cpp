// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "common/config/TorkConfigText.h"

#include "common/config/TorkConfigFile.h"

void KeepPath(TorkConfigFile& settings, QString const& user, QString& path)
{
    settings.WriteItem("Recent", TorkConfigText::EncodeName(user),
                       TorkConfigText::EncodeValue(path));
    settings.SaveAtomically();

    QString none, stored;
    if (settings.ReadItem("Recent", TorkConfigText::EncodeName(user), none, stored))
        path = TorkConfigText::DecodeValue(stored);
}
