#!/usr/bin/env bash
# SPDX-FileCopyrightText: The Velocor authors
# SPDX-License-Identifier: MIT
#
# Installs the packages of the named groups, as root or through sudo (brew on macOS).
# Needs neither network nor password if all of them are already installed.
#
#     scripts/install-packages.sh build          to build the program
#     scripts/install-packages.sh qt6            and with Qt 6
#     scripts/install-packages.sh wayland        Qt's platform plug-in for Wayland
#     scripts/install-packages.sh build test     and to run its tests
#     scripts/install-packages.sh build bench    and what ./bench compares with
#     scripts/install-packages.sh build fuzz     and clang with its fuzzing runtime
#     scripts/install-packages.sh build lint     and to check format and lint
#     scripts/install-packages.sh build package  and to validate and build the package
#     scripts/install-packages.sh package-test   and to test the packages in a bare root
#     scripts/install-packages.sh build package reproducible   and to build twice and compare
#     scripts/install-packages.sh build abi      and to compare the binary interface
#     scripts/install-packages.sh consumers      the compilers of projects that use the package
#     scripts/install-packages.sh build check    and the other tools of ./check
set -euo pipefail

say() { echo "install-packages: $*" >&2; }

# The names of a group's packages in the system's package manager.
packages_of() {
    case "$(uname -s)/$1" in
    Darwin/build) echo cmake ninja qt@5 rapidxml ;;
    Darwin/qt6) echo qt ;;
    Darwin/lint) echo clang-format@14 llvm@14 shellcheck ;;
    Darwin/test | Darwin/wayland | Darwin/package | Darwin/package-test | Darwin/consumers) ;;
    */build) echo g++ cmake ninja-build qtbase5-dev qttools5-dev librapidxml-dev ;;
    */qt6) echo qt6-base-dev qt6-5compat-dev qt6-tools-dev qt6-l10n-tools qt6-translations-l10n ;;
    */wayland) echo qtwayland5 ;;
    */test)
        echo xvfb xauth shared-mime-info pkg-config valgrind doxygen locales-all dpkg-dev \
            at-spi2-core dbus dbus-daemon python3-gi openbox xdotool \
            desktop-file-utils libspdlog-dev qttranslations5-l10n
        ;;
    */bench)
        echo python3 xvfb xauth shared-mime-info libbenchmark-dev libspdlog-dev liblog4cplus-dev \
            liblog4cxx-dev libboost-dev libboost-log-dev libgoogle-glog-dev libkf5config-dev \
            libpugixml-dev libxml2-dev grep ripgrep ugrep lnav glogg
        ;;
    */orca) echo orca ;;
    */fuzz) echo clang-14 libclang-rt-14-dev ;;
    */package) echo dpkg-dev debhelper doxygen lintian devscripts blhc desktop-file-utils appstream man-db ;;
    */package-test) echo debootstrap piuparts autopkgtest ;;
    */reproducible) echo reprotest faketime disorderfs dpkg-dev ;;
    */consumers) echo g++-12 clang-14 clang-16 clang-19 pkg-config ;;
    */abi) echo abigail-tools binutils qt6-base-dev qt6-5compat-dev ;;
    */check) echo clazy cppcheck gcovr valgrind python3 python3-clang-14 ;;
    */lint) echo git clang-format-14 clang-tidy-14 reuse shellcheck ;;
    *)
        say "unknown group: $1"
        return 2
        ;;
    esac
}

missing_from_apt() {
    local installed
    # dpkg-query fails for an unknown name, which is just a missing package here.
    # shellcheck disable=SC2016
    installed=$(dpkg-query -W -f='${db:Status-Status} ${Package}\n' "$@" 2>/dev/null || true)
    for package in "$@"; do
        grep -qxF "installed $package" <<<"$installed" || echo "$package"
    done
}

missing_from_brew() {
    for package in "$@"; do
        brew list --formula "$package" >/dev/null 2>&1 || echo "$package"
    done
}

as_root() {
    if [ "$(id -u)" -eq 0 ]; then
        "$@"
    elif command -v sudo >/dev/null; then
        sudo "$@"
    else
        say "neither root nor sudo; as root, run: apt-get install ${missing[*]}"
        return 1
    fi
}

install_with_apt() {
    as_root apt-get update -q
    as_root env DEBIAN_FRONTEND=noninteractive \
        apt-get install -q -y --no-install-recommends "$@"
}

names=()
for group in "$@"; do
    packages=$(packages_of "$group")
    read -r -a group_names <<<"$packages"
    names+=(${group_names[@]+"${group_names[@]}"})
done
[ ${#names[@]} -gt 0 ] || exit 0

if command -v dpkg-query >/dev/null && command -v apt-get >/dev/null; then
    manager=apt
elif command -v brew >/dev/null; then
    manager=brew
else
    say "neither apt-get nor brew found; assuming that these are installed: ${names[*]}"
    exit 0
fi

missing=()
while read -r package; do
    missing+=("$package")
done < <("missing_from_$manager" "${names[@]}")
[ ${#missing[@]} -gt 0 ] || exit 0

say "installing ${missing[*]}"
if [ "$manager" = apt ]; then
    install_with_apt "${missing[@]}"
else
    brew install "${missing[@]}"
fi
