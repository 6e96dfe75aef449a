#!/usr/bin/env bash
# Builds the reference of the installed headers with doxygen (Debian package doxygen, installed
# when missing) into build/docs/html: the headers' part of the install goes into a temporary
# prefix and doxygen reads its include/qorui. Any doxygen warning fails the script.
# QOR_BUILD_DIR chooses the build folder (default: build).
set -euo pipefail
cd "$(dirname "$0")/.."
if ! command -v doxygen >/dev/null; then
  sudo=""; [ "$(id -u)" -eq 0 ] || sudo="sudo"
  $sudo apt-get update -qq
  DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq doxygen
fi
build="${QOR_BUILD_DIR:-build}"
[ -f "$build/build.ninja" ] || cmake -S . -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
prefix=$(mktemp -d)
trap 'rm -rf "$prefix"' EXIT
cmake --install "$build" --prefix "$prefix" --component headers >/dev/null
export QOR_DOCS_INPUT="$prefix/include/qorui" QOR_DOCS_OUTPUT="$build/docs"
rm -rf "$build/docs"
mkdir -p "$build/docs"
doxygen docs/Doxyfile
echo "Reference written: $build/docs/html/index.html"
