#!/usr/bin/env bash
# Times a Release build of fif against GNU grep and ripgrep on one tree.
#
# Usage: bench/run.sh [TREE] [RUNS]
#   TREE  the folder to search (default /usr/include)
#   RUNS  timed runs per command after the warm-up (default 10)
#
# For each pattern the three tools must report the same set of (file, line)
# hits, or no times are printed for it. Wall times are medians (hyperfine);
# the output of every tool goes through a pipe, as grep would otherwise take
# a shortcut for /dev/null.
set -euo pipefail
root="$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)"
source "$root/scripts/deps.sh"
fif_install_packages "${FIF_BUILD_PACKAGES[@]}" grep ripgrep hyperfine perl-base

tree="${1:-/usr/include}"
runs="${2:-10}"
[ -d "$tree" ] || { echo "error: $tree is no folder" >&2; exit 2; }

build="$root/build/bench"
cmake -S "$root" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release \
      -DFIF_BUILD_TESTS=OFF -DFIF_BUILD_APP=OFF >/dev/null
cmake --build "$build" --target fif >/dev/null
fif="$build/cli/fif"

work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT

# Each case: a label, then the arguments of fif, grep and rg (same hits).
# grep and rg search what fif does: hidden files too, links not followed,
# no ignore files; C locale for grep, so that bytes are bytes.
run_case() { # label, fif-args, grep-args, rg-args (each one string)
  local label="$1" fif_args="$2" grep_args="$3" rg_args="$4"
  local fif_cmd="'$fif' $fif_args '$tree'"
  local grep_cmd="LC_ALL=C grep -r -n $grep_args '$tree'"
  local rg_cmd="rg -n --no-heading -H -uu --no-config $rg_args '$tree'"

  # Same hits first: (file, line) pairs from the three outputs.
  eval "$fif_cmd" 2>/dev/null | perl -ne 'print "$1:$2\n" if /^(.*?) \((\d+)\): /' \
    | sort -u >"$work/fif"
  eval "$grep_cmd -Z" | perl -ne 'print "$1:$2\n" if /^(.*?)\0(\d+):/' | sort -u >"$work/grep"
  eval "$rg_cmd --null" | perl -ne 'print "$1:$2\n" if /^(.*?)\0(\d+):/' | sort -u >"$work/rg"
  local hits
  hits=$(wc -l <"$work/fif")
  if ! cmp -s "$work/fif" "$work/grep" || ! cmp -s "$work/fif" "$work/rg"; then
    echo "== $label: hit sets differ (fif $hits, grep $(wc -l <"$work/grep"), rg $(wc -l <"$work/rg")); no times" >&2
    diff "$work/fif" "$work/grep" | head -5 >&2 || true
    diff "$work/fif" "$work/rg" | head -5 >&2 || true
    return 1
  fi

  hyperfine --style none --output pipe --ignore-failure --warmup 2 --runs "$runs" \
    --export-json "$work/times.json" \
    -n fif "$fif_cmd" -n grep "$grep_cmd" -n rg "$rg_cmd" >/dev/null 2>&1
  perl -e '
    local $/; my $json = <STDIN>;
    my @m = $json =~ /"median":\s*([0-9.eE+-]+)/g;
    printf "%-34s %7d hits   fif %7.3f s   grep %7.3f s   rg %7.3f s   fif/grep %5.2f   fif/rg %5.2f\n",
      $ARGV[0], $ARGV[1], @m[0..2], $m[0] / $m[1], $m[0] / $m[2];
  ' "$label" "$hits" <"$work/times.json"
}

echo "tree $tree ($(find "$tree" -type f | wc -l) files, $(du -sh "$tree" | cut -f1)); median of $runs runs after 2 warm-ups"
echo "fif $("$fif" --version | cut -d' ' -f2) (Release), $(grep --version | head -1), $(rg --version | head -1)"
status=0
run_case "literal, case-sensitive" "--match-case -- QString" "-F -e QString" "-F -e QString" || status=1
run_case "literal, case ignored" "-- nullptr" "-F -i -e nullptr" "-F -i -e nullptr" || status=1
run_case "regexp, case-sensitive" "--match-case --regexp -- 'Q_[A-Z]+_EXPORT'" \
  "-E -e 'Q_[A-Z]+_EXPORT'" "-e 'Q_[A-Z]+_EXPORT'" || status=1
run_case "literal, rare" "--match-case -- qt_zzz_no_such_name" "-F -e qt_zzz_no_such_name" \
  "-F -e qt_zzz_no_such_name" || status=1
exit $status
