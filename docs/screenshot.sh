#!/usr/bin/env bash
# Takes docs/screenshot.png: builds findinfiles, runs it on a virtual X
# display (Xvfb) in a small sample project that it writes, searches it the
# way a user would (Ctrl+Shift+F, a word, Enter, Ctrl+F8) and photographs the
# main window: the results with their matches highlighted, and the viewer
# with its line numbers and the matches on the lines in view. The sample lies
# in a fixed folder, so that the picture names no folder of the machine it
# was taken on; the settings folder is a throw-away one, so the user's
# settings stay as they are. Usage: docs/screenshot.sh [OUTPUT.png]
set -euo pipefail
root="$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)"
source "$root/scripts/deps.sh"
fif_install_packages "${FIF_BUILD_PACKAGES[@]}" "${FIF_SCREENSHOT_PACKAGES[@]}"

output="$(realpath -m "${1:-$root/docs/screenshot.png}")"
build="$root/build/release"
cmake -S "$root" -B "$build" -G Ninja -DCMAKE_BUILD_TYPE=Release -DFIF_BUILD_TESTS=OFF >/dev/null
cmake --build "$build" --target findinfiles

sample=/tmp/findinfiles-sample
config="$(mktemp -d)"
trap 'rm -rf "$config" "$sample"' EXIT
rm -rf "$sample"
mkdir -p "$sample/src" "$config/findinfiles"
# The search looks in the sample's folder as "." so that the results show
# paths relative to it.
cat >"$config/findinfiles/settings.ini" <<'EOF'
[Find-In-Files]
WhereKey=.
EOF
cat >"$sample/README.md" <<'EOF'
# Tokens

A small tokenizer: it reads lines and prints each token with its kind.
EOF
cat >"$sample/src/lexer.h" <<'EOF'
#pragma once

#include <string>
#include <vector>

// One token of the input: its kind and its text.
struct Token {
    enum Kind { Word, Number, Symbol } kind;
    std::string text;
};

std::vector<Token> tokenize(const std::string& input);
EOF
cat >"$sample/src/lexer.cpp" <<'EOF'
#include "lexer.h"

#include <cctype>

// Splits the input into tokens: words, numbers and single symbols.
std::vector<Token> tokenize(const std::string& input)
{
    std::vector<Token> tokens;
    size_t at = 0;
    while (at < input.size()) {
        const unsigned char c = input[at];
        if (std::isspace(c)) {
            ++at;
            continue;
        }
        Token token{Token::Symbol, std::string(1, input[at])};
        size_t end = at + 1;
        if (std::isalpha(c)) {
            while (end < input.size() && std::isalnum((unsigned char)input[end]))
                ++end;
            token = {Token::Word, input.substr(at, end - at)};
        } else if (std::isdigit(c)) {
            while (end < input.size() && std::isdigit((unsigned char)input[end]))
                ++end;
            token = {Token::Number, input.substr(at, end - at)};
        }
        tokens.push_back(token);
        at = end;
    }
    return tokens;
}
EOF
cat >"$sample/src/main.cpp" <<'EOF'
#include "lexer.h"

#include <iostream>

int main()
{
    std::string line;
    while (std::getline(std::cin, line)) {
        for (const Token& token : tokenize(line))
            std::cout << token.kind << ' ' << token.text << '\n';
    }
}
EOF

# Runs inside the virtual display: xvfb-run starts it through sh, so it is a
# script file of its own rather than a shell function.
cat >"$config/session.sh" <<'SESSION'
set -euo pipefail
app="$1" folder="$2" output="$3"
cd "$folder"
"$app" &
pid=$!
trap 'kill "$pid" 2>/dev/null || true' EXIT

window="$(xdotool search --sync --onlyvisible --name '^Find in Files - ' | head -1)"
xdotool windowfocus --sync "$window"
sleep 1
xdotool key --clearmodifiers ctrl+shift+f
dialog="$(xdotool search --sync --onlyvisible --name '^Find in Files Dialog$' | head -1)"
xdotool windowfocus --sync "$dialog"
sleep 0.5
xdotool type --delay 40 'token'
xdotool key Return          # "Find" is the default button
sleep 3                     # the search of a few files ends well within this
xdotool windowfocus --sync "$window"
for step in 1 2 3 4 5 6 7; do
  xdotool key --clearmodifiers ctrl+F8
done
sleep 1
import -window "$window" "$output"
SESSION

XDG_CONFIG_HOME="$config" xvfb-run --auto-servernum --server-args="-screen 0 1280x900x24" \
    bash "$config/session.sh" "$build/app/findinfiles" "$sample" "$output"
echo "Wrote $output"
