#!/usr/bin/env bash
# Installs what is missing, builds MorvelGUI and opens the dialog on a fresh copy of the demo folder.
set -euo pipefail
root=$(cd "$(dirname "$0")/.." && pwd)
if [ -z "${DISPLAY:-}" ] && [ -z "${WAYLAND_DISPLAY:-}" ] && [ -z "${QT_QPA_PLATFORM:-}" ]; then
  echo "No display is available (neither DISPLAY nor WAYLAND_DISPLAY is set), so the dialog cannot open here."
  echo "Run it on a virtual display instead:  xvfb-run -a bash scripts/demo.sh   (xvfb-run comes with: apt-get install xvfb xauth)"
  exit 1
fi
bash "$root/scripts/deps.sh"
build=${MORVEL_BUILD_DIR:-$root/build}
cmake -S "$root" -B "$build" -DCMAKE_BUILD_TYPE=RelWithDebInfo
cmake --build "$build" -j"$(nproc 2>/dev/null || echo 2)" --target MorvelGUI cif_parser morvel

work=$(mktemp -d "${TMPDIR:-/tmp}/morvelgui-demo.XXXXXX")
cp -r "$root/demo/." "$work/"
# The demo's binaries.txt names ./morvel and ./cif_parser, found beside it in the working folder.
ln -s "$build/tools/morvel" "$work/morvel"
ln -s "$build/tools/cif_parser" "$work/cif_parser"
echo "Demo working folder: $work"

cd "$work"
exec "$build/MorvelGUI"
