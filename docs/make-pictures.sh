#!/bin/sh
# make-pictures.sh PROGRAMS: takes the notes of the example, of a real reel and of a film of 20 reels with the programs of a build,
# and writes pictures of them to docs/pictures.
set -eu
cd "$(dirname "$0")/.."
programs=$1
pictures=docs/pictures
work=build/pictures
rm -rf "$work"
mkdir -p "$work" "$pictures"

# notes NAME HEIGHT NOTES-OPTION...: the page in light and dark, and the first page of the PDF.
notes() {
    name=$1
    height=$2
    shift 2
    "$programs/cadrel" notes "$@" -o "$work/$name.html"
    "$programs/cadrel" notes "$@" -o "$work/$name.pdf"
    # The number is that of the colour scheme which the user prefers.
    for scheme in light:1 dark:0; do
        chromium --headless --no-sandbox --disable-gpu --hide-scrollbars --user-data-dir="$work/chromium" \
            --blink-settings=preferredColorScheme="${scheme#*:}" --window-size="1240,$height" \
            --screenshot="$work/notes-$name-${scheme%:*}.png" "file://$PWD/$work/$name.html" >"$work/chromium.log" 2>&1
    done
    pdftoppm -r 100 -png -f 1 -l 1 -singlefile "$work/$name.pdf" "$work/notes-$name-pdf"
}

"$programs/make_cuts" tests/data/edl/speed_effects.edl "$work"
notes example 1300 --old examples/reel3/reel3_v07.edl --new examples/reel3/reel3_v12.edl --vfx 'VFX_****_v,_comp'
notes reel 1300 --old tests/data/edl/speed_effects.edl --new "$work/speed_effects_v2.edl" \
    --match clip --vfx 'Z68*_*****LAY,*'
notes film 1640 --old "$work"/film_v03_*.edl --new "$work"/film_v04_*.edl
for picture in "$work"/notes-*.png; do
    pngquant --force --strip --output "$pictures/$(basename "$picture")" 192 "$picture"
done
