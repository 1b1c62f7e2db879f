// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#pragma once

namespace Velocor {

/// What a secret is. The order decides which of two is meant that are the same text.
enum class SecretKind {
    Word, ///< the user said so
    HomeFolder,
    UserName,
    FullName,
    HostName,
    MailAddress,
    NetworkAddress,
    HardwareAddress,
    PrivateKey,
    Token,
    Password
};

} // namespace Velocor
