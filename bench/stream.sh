#!/usr/bin/env bash
# Streams a search of 1,000,000 hits (the wildcard "*" on a generated tree of
# 1000 files) into a visible results view on the offscreen platform, and
# compares its time with fif writing the same hits to a file.
#
# Usage: bench/stream.sh [RUNS]   (default 3; the two are run in turn)
#
# Prints per run the view's total time, the longest gap between two ticks of
# a 5 ms timer in the GUI thread (wall clock, and the GUI thread's own CPU
# time in that gap, which waiting for a shared core does not inflate), the
# peak resident memory per hit beyond the lines' own text, and fif's time.
set -euo pipefail
root="$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)"
source "$root/scripts/deps.sh"
fif_install_packages "${FIF_BUILD_PACKAGES[@]}" perl-base

runs="${1:-3}"
build="$root/build/bench"
cmake -S "$root" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release \
      -DFIF_BUILD_TESTS=OFF -DFIF_BUILD_APP=OFF >/dev/null
cmake --build "$build" --target fif fif_stream_bench >/dev/null

tree="$(mktemp -d)/tree"
trap 'rm -rf "$(dirname "$tree")"' EXIT
out="$(dirname "$tree")/hits.txt"
# The first run writes the tree (and warms the cache).
QT_QPA_PLATFORM=offscreen "$build/bench/fif_stream_bench" --tree "$tree" --no-view >/dev/null 2>&1

echo "$(lscpu | grep 'Model name' | tr -s ' '), $(nproc) cores; load average now: $(cut -d' ' -f1-3 /proc/loadavg)"
for run in $(seq "$runs"); do
  view="$(QT_QPA_PLATFORM=offscreen "$build/bench/fif_stream_bench" --tree "$tree" 2>/dev/null)"
  start=$(date +%s.%N)
  "$build/cli/fif" --wildcard '*' "$tree" >"$out" 2>/dev/null
  end=$(date +%s.%N)
  total=$(sed -n 's/^total: \([0-9.]*\) s/\1/p' <<<"$view")
  perl -e 'printf "run %d: fif to a file %.3f s (%d lines); view/fif %.2f\n", @ARGV[0..1], $ARGV[2], $ARGV[3] / $ARGV[1]' \
    "$run" "$(perl -e "print $end - $start")" "$(wc -l <"$out")" "$total"
  sed 's/^/    /' <<<"$view"
done
