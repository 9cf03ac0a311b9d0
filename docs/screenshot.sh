#!/usr/bin/env bash
# Takes docs/screenshot.png: builds findinfiles, runs it on a virtual X
# display (Xvfb), searches the project's engine sources the way a user would
# (Ctrl+Shift+F, a word, Enter, Ctrl+F8) and photographs the main window.
# Runs with a throw-away settings folder, so the user's settings stay as
# they are. Usage: docs/screenshot.sh [OUTPUT.png]
set -euo pipefail
root="$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)"
source "$root/scripts/deps.sh"
fif_install_packages "${FIF_BUILD_PACKAGES[@]}" "${FIF_SCREENSHOT_PACKAGES[@]}"

output="$(realpath -m "${1:-$root/docs/screenshot.png}")"
build="$root/build/release"
cmake -S "$root" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DFIF_BUILD_TESTS=OFF >/dev/null
cmake --build "$build" --target findinfiles

config="$(mktemp -d)"
trap 'rm -rf "$config"' EXIT

# Runs inside the virtual display: xvfb-run starts it through sh, so it is a
# script file of its own rather than a shell function.
cat >"$config/session.sh" <<'SESSION'
set -euo pipefail
app="$1" folder="$2" output="$3"
"$app" "$folder" &
pid=$!
trap 'kill "$pid" 2>/dev/null || true' EXIT

window="$(xdotool search --sync --onlyvisible --name '^Find in Files - ' | head -1)"
xdotool windowfocus --sync "$window"
sleep 1
xdotool key --clearmodifiers ctrl+shift+f
dialog="$(xdotool search --sync --onlyvisible --name '^Find in Files Dialog$' | head -1)"
xdotool windowfocus --sync "$dialog"
sleep 0.5
xdotool type --delay 40 'getJob'
xdotool key Return          # "Find" is the default button
sleep 3                     # the search of a few files ends well within this
xdotool windowfocus --sync "$window"
xdotool key --clearmodifiers ctrl+F8 ctrl+F8 ctrl+F8
sleep 1
import -window "$window" "$output"
SESSION

XDG_CONFIG_HOME="$config" xvfb-run --auto-servernum --server-args="-screen 0 1280x900x24" \
    bash "$config/session.sh" "$build/app/findinfiles" "$root/engine" "$output"
echo "Wrote $output"
