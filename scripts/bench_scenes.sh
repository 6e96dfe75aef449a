#!/usr/bin/env bash
# Runs the side-by-side scene benchmarks of bench/scenes and writes bench/scenes/RESULTS.md.
# Installs the peer libraries' Debian packages if they are missing (libcegui-mk2-dev,
# libimgui-dev), builds a RelWithDebInfo tree (as the test build) in build-scenes/ with QOR_BENCH_PEERS on, then runs every
# program pinned to one core, three repeats interleaved (qorui, cegui, imgui, qorui, ...). The
# table holds the median of each program's three medians and qorui's ratio to each peer.
#   scripts/bench_scenes.sh [core]     (core defaults to the last one)
set -euo pipefail
cd "$(dirname "$0")/.."
core="${1:-$(( $(nproc) - 1 ))}"
packages=(libcegui-mk2-dev libimgui-dev)
missing=()
for p in "${packages[@]}"; do
  dpkg-query -W -f='${Status}' "$p" 2>/dev/null | grep -q "install ok installed" || missing+=("$p")
done
if [ ${#missing[@]} -gt 0 ]; then
  sudo=""; [ "$(id -u)" -eq 0 ] || sudo="sudo"
  $sudo apt-get update -qq
  DEBIAN_FRONTEND=noninteractive $sudo apt-get install -y -qq --no-install-recommends "${missing[@]}"
fi
cmake -S . -B build-scenes -G Ninja -DCMAKE_BUILD_TYPE=RelWithDebInfo -DQOR_BENCH_PEERS=ON -DQOR_BUILD_TESTS=OFF \
  ${CMAKE_CXX_COMPILER_LAUNCHER:+-DCMAKE_CXX_COMPILER_LAUNCHER=$CMAKE_CXX_COMPILER_LAUNCHER} > /dev/null
cmake --build build-scenes -j "$(nproc)" --target qorui_scenes cegui_scenes imgui_scenes
out=build-scenes/scenes-out
rm -rf "$out"
mkdir -p "$out"
for repeat in 1 2 3; do
  for program in qorui cegui imgui; do
    echo "run $repeat: $program"
    # From the output folder: CEGUI writes its log into the working folder.
    (cd "$out" && taskset -c "$core" "../bin/${program}_scenes" > "$program.$repeat.txt")
  done
done
python3 scripts/scenes_table.py "$out" \
  --machine "$(lscpu | sed -n 's/^Model name: *//p' | head -1), $(nproc) cores, $(uname -sr), pinned to core $core" \
  --versions "qorui $(git describe --always --dirty); CEGUI $(pkg-config --modversion CEGUI-0) (null renderer); Dear ImGui $(pkg-config --modversion imgui); $(c++ --version | head -1)" \
  --keep bench/scenes/RESULTS.md > bench/scenes/RESULTS.md.new
mv bench/scenes/RESULTS.md.new bench/scenes/RESULTS.md
echo "wrote bench/scenes/RESULTS.md"
