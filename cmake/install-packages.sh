#!/bin/sh
# SPDX-License-Identifier: GPL-3.0-or-later
# install-packages.sh WHAT: installs the Debian packages that a preset ("release", "debug", "asan", "fuzz"), a run of the
# tests ("tests"), the pictures of the pages in docs ("pictures"), the videos of the example ("videos") or "format" needs. Does
# nothing where they are all there, and on systems other than Debian, where CMake says what it misses.
set -eu

needed="build-essential cmake libcli11-dev nlohmann-json3-dev libpugixml-dev juce-modules-source libgtest-dev librapidcheck-dev
libvalijson-dev libcairo2-dev libpango1.0-dev libavformat-dev libavcodec-dev libswscale-dev pkg-config
libx11-dev libxext-dev libxinerama-dev libxrandr-dev libxcursor-dev libxtst-dev xvfb"
helpful="ninja-build ccache"
case $1 in
release) needed="$needed libbenchmark-dev" ;;
asan | fuzz) needed="$needed clang libclang-rt-14-dev" ;;
tests)
    needed="chromium poppler-utils ffmpeg fonts-dejavu-core fonts-droid-fallback ardour openbox"
    helpful=""
    ;;
pictures)
    needed="chromium poppler-utils pngquant fonts-dejavu-core fonts-droid-fallback"
    helpful=""
    ;;
videos)
    needed="ffmpeg"
    helpful=""
    ;;
format)
    needed="clang-format"
    helpful=""
    ;;
esac

command -v dpkg-query >/dev/null || exit 0

missing=""
for package in $needed; do
    dpkg-query -W -f '${db:Status-Status}' "$package" 2>/dev/null | grep -qx installed || missing="$missing $package"
done
[ -n "$missing" ] || exit 0

as_root="env DEBIAN_FRONTEND=noninteractive"
[ "$(id -u)" -eq 0 ] || as_root="sudo $as_root"
echo "Installing$missing"
# The words of these lists are package names, one argument each.
# shellcheck disable=SC2086
{
    $as_root apt-get update -qq
    $as_root apt-get install -y -qq --no-install-recommends $missing $helpful
}
