#!/usr/bin/env bash
# Installs the Debian packages that qorui needs to build, test and run, if any is missing.
set -euo pipefail
packages=(g++ cmake ninja-build pkg-config libloki-dev libluajit-5.1-dev libmimalloc-dev libstb-dev
          libfreetype-dev fonts-dejavu-core libsdl2-dev libgtest-dev libgmock-dev libbenchmark-dev
          clang valgrind)
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
done
if [ ${#missing[@]} -gt 0 ]; then
  echo "Installing: ${missing[*]}"
  sudo=""; [ "$(id -u)" -eq 0 ] || sudo="sudo"
  $sudo apt-get update -qq
  DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq "${missing[@]}"
fi
