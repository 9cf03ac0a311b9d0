#!/usr/bin/env bash
# Times a Release build of fif, with its default threads (one per core) and
# with one (-j1), against GNU grep and ripgrep (one thread and two) on real
# trees, for literal text and for regular expressions and wildcards,
# case-sensitive and not, rare and frequent words.
#
# Usage: bench/run.sh [TREE...]          (default: /usr/include /usr/share)
#   RUNS=n    timed runs per command after one warm-up (default 5)
#   CASES=re  run only the cases whose label matches the regular expression
#   FIF=path  time this fif rather than building one
#
# Before a case is timed, fif -j1 must print exactly what fif does, and the
# hit sets of fif and each peer must agree: every (file, line) hit that only
# one side reports must be explained by how the tools tell binary files
# (bench/compare-hits.pl), or no times are printed.
# Wall times are hyperfine medians, every tool's output going through a pipe
# (grep would take a shortcut for /dev/null); CPU is the mean user + system
# time. The machine may be shared: peers are timed in the same run, so read
# the ratios rather than the seconds.
set -euo pipefail
root="$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)"
source "$root/scripts/deps.sh"
fif_install_packages "${FIF_BUILD_PACKAGES[@]}" grep ripgrep hyperfine perl-base time

runs="${RUNS:-5}"
only="${CASES:-.}"
trees=("$@")
[ ${#trees[@]} -gt 0 ] || trees=(/usr/include /usr/share)

fif="${FIF:-}"
if [ -z "$fif" ]; then
  build="$root/build/bench"
  cmake -S "$root" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release \
        -DFIF_BUILD_TESTS=OFF -DFIF_BUILD_APP=OFF >/dev/null
  cmake --build "$build" --target fif >/dev/null
  fif="$build/cli/fif"
fi

work="$(mktemp -d)"
trap 'rm -rf "$work"' EXIT

hits_of() { # name, command: (file:line) pairs, sorted; fif's from its output kept in $work/out
  case "$1" in
    fif) perl -ne 'print "$1:$2\n" if /^(.*?) \((\d+)\): /' <"$work/out" ;;
    *) eval "$2 --null" 2>/dev/null | perl -ne 'print "$1:$2\n" if /^(.*?)\0(\d+):/' ;;
  esac | LC_ALL=C sort -u >"$work/$1"
}

# Each case: a label, then the arguments of fif, grep and rg (same hits).
# grep and rg search what fif does: hidden files too, links not followed, no
# ignore files; C locale for grep, so that bytes are bytes.
run_case() { # tree, label, fif-args, grep-args, rg-args
  local tree="$1" label="$2" fif_args="$3" grep_args="$4" rg_args="$5"
  [[ "$label" =~ $only ]] || return 0
  local fif_cmd="'$fif' $fif_args '$tree'"
  local fif1_cmd="'$fif' -j1 $fif_args '$tree'"
  local grep_cmd="LC_ALL=C grep -r -n $grep_args '$tree'"
  local rg_cmd="rg -n --no-heading -H -uu --no-config $rg_args '$tree'"

  local check=0
  eval "$fif_cmd" >"$work/out" 2>"$work/err" || true
  eval "$fif1_cmd" >"$work/out1" 2>"$work/err1" || true
  if ! cmp -s "$work/out" "$work/out1" || ! cmp -s "$work/err" "$work/err1"; then
    echo "== $label: fif -j1 prints otherwise than fif; no times" >&2
    diff "$work/out" "$work/out1" | head -5 >&2
    return 1
  fi
  hits_of fif
  hits_of grep "$grep_cmd"
  hits_of rg "$rg_cmd"
  perl "$root/bench/compare-hits.pl" "$work/fif" "$work/grep" grep >"$work/check" || check=1
  perl "$root/bench/compare-hits.pl" "$work/fif" "$work/rg" rg >>"$work/check" || check=1
  if [ $check -ne 0 ]; then
    echo "== $label: hit sets differ beyond what file kinds explain; no times" >&2
    cat "$work/check" >&2
    return 1
  fi

  hyperfine --style none --output pipe --ignore-failure --warmup 1 --runs "$runs" \
    --export-json "$work/times.json" \
    -n fif "$fif_cmd" -n "fif -j1" "$fif1_cmd" -n grep "$grep_cmd" \
    -n "rg -j1" "$rg_cmd -j1" -n "rg -j2" "$rg_cmd -j2" >/dev/null 2>&1
  perl -e '
    local $/; my $json = <STDIN>;
    my @m = $json =~ /"median":\s*([0-9.eE+-]+)/g;
    my @u = $json =~ /"user":\s*([0-9.eE+-]+)/g;
    my @s = $json =~ /"system":\s*([0-9.eE+-]+)/g;
    printf "%-28s %8d hits | wall fif %6.3f fif1 %6.3f grep %6.3f rg1 %6.3f rg2 %6.3f | fif/rg2 %5.2f fif1/rg1 %5.2f fif/grep %5.2f | cpu fif %6.3f fif1 %6.3f rg2 %6.3f\n",
      $ARGV[0], $ARGV[1], @m[0..4], $m[0] / $m[4], $m[1] / $m[3], $m[0] / $m[2],
      $u[0] + $s[0], $u[1] + $s[1], $u[4] + $s[4];
  ' "$label" "$(wc -l <"$work/fif")" <"$work/times.json"
  sed 's/^/    /' "$work/check"
}

# The largest resident size of fif and of grep on a search, output through a pipe.
peak_memory() { # label, fif-args, grep-args, tree
  [[ "$1" =~ $only ]] || return 0
  /usr/bin/time -o "$work/fif.mem" -f %M sh -c "'$fif' $2 '$4' 2>/dev/null | cat >/dev/null"
  /usr/bin/time -o "$work/grep.mem" -f %M sh -c "LC_ALL=C grep -r -n $3 '$4' 2>/dev/null | cat >/dev/null"
  printf "%-28s peak resident fif %d MB, grep %d MB\n" "$1" \
    $(( $(tail -1 "$work/fif.mem") / 1024 )) $(( $(tail -1 "$work/grep.mem") / 1024 ))
}

echo "$(lscpu | grep 'Model name' | tr -s ' '), $(nproc) cores"
echo "fif $("$fif" --version | cut -d' ' -f2) (Release), $(grep --version | head -1), $(rg --version 2>/dev/null | head -1), $(hyperfine --version)"
echo "median of $runs runs after a warm-up; load average now: $(cut -d' ' -f1-3 /proc/loadavg)"
status=0
for tree in "${trees[@]}"; do
  [ -d "$tree" ] || { echo "error: $tree is no folder" >&2; status=2; continue; }
  echo
  echo "tree $tree ($(find "$tree" -type f | wc -l) files, $(du -sh "$tree" 2>/dev/null | cut -f1))"
  case "$tree" in
    /usr/include) rare=QTextDocumentFragment frequent=return ;;
    *) rare=Copenhagen frequent=the ;;
  esac
  # Literal text (words without k or s: QRegExp, like rg, equates those with
  # the Kelvin sign and the long s when case is ignored; grep in C does not).
  run_case "$tree" "literal rare, case"     "--match-case -- $rare" "-F -e $rare" "-F -e $rare" || status=1
  run_case "$tree" "literal rare, no case"  "-- $rare" "-F -i -e $rare" "-F -i -e $rare" || status=1
  run_case "$tree" "literal frequent, case" "--match-case -- $frequent" "-F -e $frequent" "-F -e $frequent" || status=1
  run_case "$tree" "literal frequent, no case" "-- $frequent" "-F -i -e $frequent" "-F -i -e $frequent" || status=1
  # Regular expressions and wildcards both dialects read the same way.
  run_case "$tree" "regexp Q_[A-Z]+_EXPORT" "--match-case --regexp -- 'Q_[A-Z]+_EXPORT'" \
    "-E -e 'Q_[A-Z]+_EXPORT'" "-e 'Q_[A-Z]+_EXPORT'" || status=1
  run_case "$tree" "regexp version numbers" "--match-case --regexp -- '[0-9]+\\.[0-9]+\\.[0-9]+'" \
    "-E -e '[0-9]+\\.[0-9]+\\.[0-9]+'" "-e '[0-9]+\\.[0-9]+\\.[0-9]+'" || status=1
  run_case "$tree" "regexp colou?r, no case" "--regexp -- 'colou?r'" \
    "-E -i -e 'colou?r'" "-i -e 'colou?r'" || status=1
  run_case "$tree" "wildcard http*org"       "--match-case --wildcard -- 'http*org'" \
    "-E -e 'http.*org'" "-e 'http.*org'" || status=1
  # Millions of hits: the cost per hit, and memory that must not grow with them.
  run_case "$tree" "many hits, e" "--match-case -- e" "-F -e e" "-F -e e" || status=1
  peak_memory "many hits, e" "--match-case -- e" "-F -e e" "$tree"
done
exit $status
