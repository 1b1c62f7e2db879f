// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/config/TorkConfigFile.h"

#include <QMetaType>
#include <QString>

#include <functional>

/// What several tests of the store have in common.
namespace StoreTest {

const QString NotFoundText = QStringLiteral("ConfigFile - File not found.");
const QString NotParsedText = QStringLiteral("ConfigFile - Could not parse the input file.");

using Setup = std::function<void(TorkConfigFile&)>;

} // namespace StoreTest

Q_DECLARE_METATYPE(StoreTest::Setup)
