// SPDX-FileCopyrightText: The Velocor authors
// SPDX-License-Identifier: MIT

#include "app/LaunchOption.h"

LaunchOption* ProductOption()
{
    auto* product = new LaunchOption("product", "product", "p", 1, "The product name");
    return product;
}
