#!/usr/bin/env bash
# Runs qorhost under valgrind's memcheck (leak check full) on the default data, then on the input
# script tests/host/session.script on a copy of the data (the script exports a layout); any memory
# error or definite leak fails the run. The memory manager runs on its system-heap backend so
# that memcheck sees every block. Output in out-valgrind/.
set -euo pipefail
cd "$(dirname "$0")/.."
cmake --build build -j "$(nproc)" --target qorhost gameui_demo
export QOR_MM_BACKEND=system
memcheck=(valgrind --tool=memcheck --leak-check=full --errors-for-leak-kinds=definite --error-exitcode=3
          --quiet)
rm -rf out-valgrind
mkdir -p out-valgrind
cp -r data out-valgrind/data
"${memcheck[@]}" build/bin/qorhost --quiet --frames 4 --out out-valgrind/default
"${memcheck[@]}" build/bin/qorhost --quiet --data out-valgrind/data --out out-valgrind/session \
  --script tests/host/session.script
echo "valgrind: no errors, no definite leaks"
