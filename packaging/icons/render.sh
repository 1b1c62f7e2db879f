#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Renders the icons from velocor.svg: the PNG files here and the icon set of the macOS bundle.
# Needs rsvg-convert (librsvg2-bin) and png2icns (icnsutils).
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"

for size in 16 22 24 32 48 64 128 256 512; do
    rsvg-convert --width "$size" --height "$size" --output "velocor-$size.png" velocor.svg
done

set_of_icons=../macos/Velocor.icns
png2icns "$set_of_icons" velocor-{16,32,48,128,256,512}.png >/dev/null
icons=(velocor-*.png)
echo "icons: ${#icons[@]} PNG files and $(basename "$set_of_icons")"
