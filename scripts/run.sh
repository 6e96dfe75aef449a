#!/usr/bin/env bash
# Builds qorhost and runs it headless on the embedded default data/, writing its frames as PNG
# files into out/. Arguments go to qorhost (e.g. --frames 10, +set name value).
set -euo pipefail
cd "$(dirname "$0")/.."
bash scripts/deps.sh
cmake -S . -B build -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo >/dev/null
cmake --build build -j "$(nproc)" --target qorhost qorui gameui_demo
mkdir -p out
./build/bin/qorhost --data data --out out "$@"
