#!/bin/sh
# make-pictures.sh PROGRAMS: takes the notes of the example, of a real reel and of a film of 20 reels with the programs of a build,
# and lets a test on the example reel take the window. Writes the pictures of them to docs/pictures.
set -eu
cd "$(dirname "$0")/.."
programs=$1
pictures=docs/pictures
work=build/pictures
rm -rf "$work"
mkdir -p "$work" "$pictures"

# page NAME HEIGHT SCHEME:NUMBER...: the page in colour schemes. The number is that of the scheme which the user prefers.
page() {
    name=$1
    height=$2
    shift 2
    for scheme in "$@"; do
        chromium --headless --no-sandbox --disable-gpu --hide-scrollbars --user-data-dir="$work/chromium" \
            --blink-settings=preferredColorScheme="${scheme#*:}" --window-size="1240,$height" \
            --screenshot="$work/notes-$name-${scheme%:*}.png" "file://$PWD/$work/$name.html" >"$work/chromium.log" 2>&1
    done
}

# notes NAME HEIGHT NOTES-OPTION...: the page in light and dark, and the first page of the PDF.
notes() {
    name=$1
    height=$2
    shift 2
    "$programs/cadrel" notes "$@" -o "$work/$name.html"
    "$programs/cadrel" notes "$@" -o "$work/$name.pdf"
    page "$name" "$height" light:1 dark:0
    pdftoppm -r 100 -png -f 1 -l 1 -singlefile "$work/$name.pdf" "$work/notes-$name-pdf"
}

"$programs/make_cuts" tests/data/edl/speed_effects.edl "$work"
notes example 1300 --old examples/reel3/reel3_v07.edl --new examples/reel3/reel3_v12.edl --vfx 'VFX_****_v,_comp'
notes reel 1300 --old tests/data/edl/speed_effects.edl --new "$work/speed_effects_v2.edl" \
    --match clip --vfx 'Z68*_*****LAY,*'
notes film 1640 --old "$work"/film_v03_*.edl --new "$work"/film_v04_*.edl
# The steps of a run, with what became of the sound at each of them unfolded.
"$programs/cadrel" apply examples/reel3/reel3.stage --old examples/reel3/reel3_v07.edl --new examples/reel3/reel3_v12.edl \
    --vfx 'VFX_****_v,_comp' --notes "$work/folded.html" --summary >"$work/apply.log"
sed -e 's/<details class="sound">/<details class="sound" open>/' \
    -e 's/<\/style>/main > :not(#r1, #r1 ~ *) { display: none; } #r1 { margin-top: 0; }<\/style>/' \
    "$work/folded.html" >"$work/sound.html"
page sound 1000 light:1
# The program with the window, in which the example is conformed.
"$programs/cadrel_desktop_tests" --gtest_filter='*ConformsAReel*WithoutAWindowManager' >"$work/desktop.log"
for name in desktop-open desktop-generated desktop-question desktop-conformed \
    window-add window-menu window-preview window-settings window-videos; do
    cp "$programs/../window/$name.png" "$work/"
done
for picture in "$work"/notes-*.png "$work"/window-*.png "$work"/desktop-*.png; do
    pngquant --force --strip --output "$pictures/$(basename "$picture")" 192 "$picture"
done
