#!/usr/bin/env bash
# Installs, with apt-get, whatever of the build and test tools is missing on a Debian 12 machine.
# Usage: setup.sh [native] [windows] [fuzz]   (nothing given: all of them)
set -euo pipefail

native=(build-essential cmake ninja-build pkg-config git python3 python3-olefile
        libgtest-dev libgmock-dev libbenchmark-dev libgpod-dev mpv
        libcairo2-dev libpango1.0-dev libgtk-3-dev libcurl4-openssl-dev libpng-dev zlib1g-dev)
windows=(mingw-w64 wine64 wine xvfb x11-utils x11-apps imagemagick xdotool)
fuzz=(clang libclang-rt-14-dev)

groups=("$@")
[ ${#groups[@]} -gt 0 ] || groups=(native windows fuzz)
wanted=()
for group in "${groups[@]}"; do
  declare -n list="$group"
  wanted+=("${list[@]}")
done

missing=()
for package in "${wanted[@]}"; do
  dpkg-query -W -f='${Status}' "$package" 2>/dev/null | grep -q 'install ok installed' || missing+=("$package")
done
[ ${#missing[@]} -eq 0 ] && exit 0

echo "setup: installing ${missing[*]}"
sudo=""
[ "$(id -u)" -eq 0 ] || sudo="sudo"
$sudo apt-get update -qq
DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq "${missing[@]}" >/dev/null
