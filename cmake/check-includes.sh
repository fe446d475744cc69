#!/bin/sh
# SPDX-License-Identifier: GPL-3.0-or-later
# check-includes.sh [TREE]: holds every include of src, standin, app and desktop that names a file of the tree against the table
# "Rooms" in the tree's CONTRIBUTING.md. Prints what is refused, and fails then. Without TREE it is this one.
set -eu
cd "${1:-$(dirname "$0")/..}"

files() {
    for folder in "$@"; do
        [ ! -d "$folder" ] || find "$folder" -type f \( -name '*.h' -o -name '*.cpp' \)
    done
}

# The names have no spaces, so each line of `files` is one argument.
# shellcheck disable=SC2046
files src standin app desktop tests bench fuzz examples | awk '
function roomOf(file) {
    sub(/\/[^\/]*$/, "", file)
    return file
}

function refuse(what) {
    print what
    refused++
}

# Whether the folder is `within` or lies in it.
function liesIn(folder, within) {
    return folder == within || index(folder, within "/") == 1
}

# Whether the row of `from` names `to`, or a folder that holds it, and `to` stands above it in the table.
function isAllowed(from, to,    names, count, i) {
    if (from == to)
        return 1
    if (!(to in row) || row[to] > row[from])
        return 0
    count = split(mayInclude[from], names, " ")
    for (i = 1; i <= count; i++)
        if (liesIn(to, names[i]))
            return 1
    return 0
}

# All files of the tree come first, then the table, then the files that are checked.
FILENAME == "-" {
    exists[$0] = 1
    next
}

FILENAME == "CONTRIBUTING.md" {
    if (/^## /)
        isInTable = ($0 == "## Rooms")
    if (!isInTable || !/^\| *`/)
        next
    gsub(/`/, "")
    split($0, cells, /\|/)
    room = cells[2]
    gsub(/ /, "", room)
    if (room in row)
        refuse("CONTRIBUTING.md: " room " has two rows")
    gsub(/,/, " ", cells[4])
    mayInclude[room] = cells[4]
    row[room] = ++rows
    next
}

FNR == 1 {
    room = roomOf(FILENAME)
    isUsed[room] = 1
    checked++
    if (!(room in row))
        refuse(FILENAME ": its folder has no row in CONTRIBUTING.md")
}

(room in row) && /^[ \t]*#[ \t]*include[ \t]*["<]/ {
    split($0, quoted, /["<>]/)
    file = quoted[2]
    target = ("src/" file) in exists ? "src/" file : file
    if (target in exists) {
        if (!isAllowed(room, roomOf(target)))
            refuse(FILENAME ":" FNR ": " room " may not include " target)
    } else if (/"/)
        refuse(FILENAME ":" FNR ": there is no " file)
}

END {
    for (room in row)
        if (!(room in isUsed))
            refuse("CONTRIBUTING.md: there is nothing in " room)
    if (checked == 0)
        refuse("There is nothing to check")
    exit refused > 0
}
' - CONTRIBUTING.md $(files src standin app desktop)
