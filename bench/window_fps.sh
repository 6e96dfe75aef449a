#!/usr/bin/env bash
# Frames a second of the window host on the demo scene under a virtual X server (Xvfb, Debian
# package xvfb), drawn by whatever renderer SDL picks there (Mesa's software OpenGL as a rule).
# Usage: bench/window_fps.sh [BUILD_DIR]   (default: build)
set -euo pipefail
cd "$(dirname "$0")/.."
build="${1:-build}"
bench="$build/bin/window_host_bench"
[ -x "$bench" ] || { echo "no $bench: build the target window_host_bench first" >&2; exit 1; }
display=:$((90 + RANDOM % 100))
Xvfb "$display" -screen 0 1280x1024x24 -nolisten tcp >/dev/null 2>&1 &
xvfb=$!
trap 'kill $xvfb' EXIT
sleep 2
DISPLAY="$display" SDL_AUDIODRIVER=dummy "$bench" "${@:2}"
