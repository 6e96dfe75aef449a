#!/usr/bin/env bash
# The package as a user meets it: installs qorui into a temporary prefix, checks that every
# installed header compiles on its own, builds the examples against the install as outside
# projects (CMake, and the engine loop once more with pkg-config), runs the example game library
# in the installed qorhost and compares its frame with the golden image, and runs the engine loop.
# QOR_BUILD_DIR chooses the build folder (default: build); QOR_UPDATE_GOLDEN=1 writes the golden.
set -euo pipefail
cd "$(dirname "$0")/.."
build="${QOR_BUILD_DIR:-build}"
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
prefix="$work/prefix"
cmake --install "$build" --prefix "$prefix" >/dev/null
export PKG_CONFIG_PATH="$prefix/lib/pkgconfig"

# Every installed header on its own (exit 255 stops xargs at the first that fails).
cflags="$(pkg-config --cflags qorui)"
ls "$prefix"/include/qorui/*.h "$prefix"/include/qorui/detail/*.h | xargs -P "$(nproc)" -I{} sh -c \
  'echo "#include \"{}\"" | c++ -std=c++17 -fsyntax-only -Wall -Wextra '"$cflags"' -x c++ - \
   || { echo "examples: {} does not compile on its own"; exit 255; }'

for example in gameui_hello engine_loop; do
  cmake -S "examples/$example" -B "$work/$example" -G Ninja -DCMAKE_PREFIX_PATH="$prefix" >/dev/null
  cmake --build "$work/$example" >/dev/null
done
c++ -std=c++17 -Wall -Wextra examples/engine_loop/engine_loop.cpp $(pkg-config --cflags --libs qorui) -ldl \
  -o "$work/engine_loop_pkg_config"

# qorhost finds its installed data by itself; the example's data folder names the game library.
"$prefix/bin/qorhost" --frames 1 --out "$work/default_out" --quiet
test -f "$work/default_out/frame_0000.png"
"$prefix/bin/qorhost" --data "$work/gameui_hello/data" --out "$work/out" --quiet \
  --script examples/gameui_hello/click_twice.script
golden=tests/golden/example_hello_clicked_1024x768.png
if [ -n "${QOR_UPDATE_GOLDEN:-}" ]; then cp "$work/out/hello_clicked.png" "$golden"; fi
python3 scripts/compare_png.py "$work/out/hello_clicked.png" "$golden" \
  || { echo "examples: the hello frame differs from $golden"; exit 1; }

for engine in "$work/engine_loop/engine_loop" "$work/engine_loop_pkg_config"; do
  "$engine" "$work/gameui_hello/data" | tee "$work/engine.txt"
  grep -q 'the counter shows "Clicks: 2"' "$work/engine.txt" || { echo "examples: $engine didn't count two clicks"; exit 1; }
done
echo "examples: all passed"
