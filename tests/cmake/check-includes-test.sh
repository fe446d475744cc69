#!/bin/sh
# SPDX-License-Identifier: GPL-3.0-or-later
# check-includes-test.sh SCRIPT: makes small trees in a folder of its own and looks at what SCRIPT refuses in them.
# The backquotes are those of the table.
# shellcheck disable=SC2016
set -eu

check=$(realpath "$1")
tree=$(mktemp -d)
trap 'rm -rf "$tree"' EXIT
failures=0

# What each tree has: a room `low`, a room `high` that may include it, a room `side` that may include nothing, and a test.
make_tree() {
    rm -rf "${tree:?}"/*
    mkdir -p "$tree/src/low" "$tree/src/high" "$tree/standin/side" "$tree/tests"
    cat >"$tree/CONTRIBUTING.md" <<'TABLE'
# Contributing

| `src/elsewhere` | a row of another table | |

## Rooms

| folder | what it holds | may include |
|---|---|---|
| `src/low` | the ground | `src/high` |
| `src/high` | what stands on it | `src/low` |
| `standin/side` | what stands alone | |

## Tests

| `src/low` | a row of another table | |
TABLE
    echo '#include <vector>' >"$tree/src/low/Low.h"
    echo '#include "low/Low.h"' >"$tree/src/high/High.h"
    echo '#include "standin/side/Side.h"' >"$tree/standin/side/Side.cpp"
    echo '#pragma once' >"$tree/standin/side/Side.h"
    echo '#include "high/High.h"' >"$tree/tests/HighTest.cpp"
    echo '#pragma once' >"$tree/tests/Help.h"
}

fail() {
    echo "FAILED: $1: $2"
    failures=$((failures + 1))
}

accepts() {
    said=$("$check" "$tree") || fail "$1" "refused: $said"
}

# refuses WHAT MESSAGE
refuses() {
    if said=$("$check" "$tree"); then
        fail "$1" "accepted"
    elif [ "$said" != "$2" ]; then
        fail "$1" "said: $said"
    fi
}

make_tree
accepts "an include of a room above in the table that the row names"

make_tree
echo '#include "high/High.h"' >>"$tree/src/low/Low.h"
refuses "an include that goes up, whatever the row says" "src/low/Low.h:2: src/low may not include src/high/High.h"

make_tree
echo '  #  include <high/High.h>' >>"$tree/src/low/Low.h"
refuses "an include that goes up in angle brackets" "src/low/Low.h:2: src/low may not include src/high/High.h"

make_tree
echo '#include "low/Low.h"' >"$tree/standin/side/Side.h"
refuses "an include that the row doesn't name" "standin/side/Side.h:1: standin/side may not include src/low/Low.h"

make_tree
mkdir "$tree/src/low/inner"
echo '#pragma once' >"$tree/src/low/inner/Inner.h"
sed -i 's/^| `src\/high`/| `src\/low\/inner` | within | |\n&/' "$tree/CONTRIBUTING.md"
echo '#include "low/inner/Inner.h"' >>"$tree/src/high/High.h"
accepts "an include of a room within the one that the row names"

make_tree
mkdir "$tree/src/lower"
echo '#pragma once' >"$tree/src/lower/Lower.h"
sed -i 's/^| `src\/low`/| `src\/lower` | another | |\n&/' "$tree/CONTRIBUTING.md"
echo '#include "lower/Lower.h"' >>"$tree/src/high/High.h"
refuses "a room whose name only begins like the one that the row names" \
    "src/high/High.h:2: src/high may not include src/lower/Lower.h"

make_tree
echo '#include "tests/Help.h"' >>"$tree/src/high/High.h"
refuses "an include of the tests" "src/high/High.h:2: src/high may not include tests/Help.h"

make_tree
echo '#include "Low.h"' >>"$tree/src/low/Low.h"
refuses "an include that isn't written from the tree" "src/low/Low.h:2: there is no Low.h"

make_tree
mkdir "$tree/app"
echo '#pragma once' >"$tree/app/main.cpp"
refuses "a folder without a row" "app/main.cpp: its folder has no row in CONTRIBUTING.md"

make_tree
rm "$tree"/standin/side/*
refuses "a row without a folder" "CONTRIBUTING.md: there is nothing in standin/side"

make_tree
sed -i 's/^| `src\/high`/&| twice | |\n&/' "$tree/CONTRIBUTING.md"
refuses "a folder with two rows" "CONTRIBUTING.md: src/high has two rows"

make_tree
rm -r "$tree/src" "$tree/standin"
sed -i '/^| `/d' "$tree/CONTRIBUTING.md"
refuses "a tree without anything to check" "There is nothing to check"

[ "$failures" -eq 0 ]
