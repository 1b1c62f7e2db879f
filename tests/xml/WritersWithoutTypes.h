// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

#include "common/xml/TorkXmlFile.h"
#include "common/xml/TorkXmlStream.h"

#include <QStringList>

#include <functional>

/// Subclasses of the writers in an object file that is compiled without run-time type information,
/// as some applications of the family are: what the writers do must not depend on it.
namespace WritersWithoutTypes {

/// What a subclass overrides.
enum class Overrides { Nothing, Write, ElementValue };

/// Calls `use` with a subclass of TorkXmlStream that writes to `text`.
///
/// @return the calls that reached the subclass, each as the operation and its text
QStringList withStream(Overrides overrides, QString& text,
                       std::function<void(TorkXmlStream&)> const& use);

/// The same with a subclass of TorkXmlFile and a file of this name, which is opened.
QStringList withFile(Overrides overrides, QString const& path,
                     std::function<void(TorkXmlFile&)> const& use);

} // namespace WritersWithoutTypes
