#!/usr/bin/env bash
# Makes the interface's two default fonts again from the DejaVu faces: the textures into
# data/textures, the character descriptions into data/fonts, and data/ui/fonts.lua naming both.
#   arial_white  proportional, DejaVu Sans at 15 pixels
#   courier      fixed width, DejaVu Sans Mono at 12 pixels (the console's font), on a texture of 300
#                pixels: the size the build-version page draws it at, so that it shows there at one
#                texel a pixel, its lines of 15 pixels keeping the version's line 47 on the screen
# Both hold ASCII 32-126 and the Russian alphabet (0x410-0x44F, with 0x401 and 0x451).
# QOR_BUILD_DIR chooses the build folder (default: build).
set -euo pipefail
cd "$(dirname "$0")/.."
bash scripts/deps.sh
build="${QOR_BUILD_DIR:-build}"
cmake -S . -B "$build" -G Ninja >/dev/null
cmake --build "$build" -j "$(nproc)" --target qorfontgen

faces=/usr/share/fonts/truetype/dejavu
chars="32-126,0x401,0x410-0x44F,0x451"

# make_font NAME FACE PIXELS [OPTIONS]: writes the font's files and prints its entries of fonts.lua.
make_font() {
  "$build/bin/qorfontgen" --font "$faces/$2" --size "$3" --chars "$chars" \
    --out "data/fonts/$1" --texture-dir data/textures "${@:4}"
}

mkdir -p data/fonts data/textures data/ui
{
  echo "-- The interface's fonts: charsets[name] names a character description (font folder),"
  echo "-- fonts[name] a charset, the material that shows its texture and the size in pixels per"
  echo "-- texture unit. Made by scripts/make_fonts.sh."
  make_font arial_white DejaVuSans.ttf 15
  make_font courier DejaVuSansMono.ttf 12 --texture 300
} > data/ui/fonts.lua.new
mv data/ui/fonts.lua.new data/ui/fonts.lua
echo "Fonts written: data/fonts/{arial_white,courier}.fnt, data/textures/{arial_white,courier}.tga, data/ui/fonts.lua"
