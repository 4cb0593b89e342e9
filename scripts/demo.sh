#!/usr/bin/env bash
# make demo: with the SDK built and installed in PREFIX, render a short
# animated sequence with three sample plug-ins chained the way an editor
# would: a generated title card, blurred with an animated radius, then wiped
# in a growing circle over a checkerboard.
set -euo pipefail
cd "$(dirname "$0")/.."
prefix=$(cd "${1:-dist}" && pwd)
render="$prefix/bin/ulk-render"
plugins="$prefix/lib/ulk/plugins"
out=demo-out
frames=0-47
size=640x360

rm -rf "$out"
mkdir -p "$out/card" "$out/checks" "$out/blurred" "$out/final"
step() { printf '\n== %s\n' "$*"; }

start=$(date +%s%N)
step "1/4 generator: colour bars with a title"
"$render" "$plugins/generator.so" --size $size --frames $frames \
    --set pattern="Colour Bars" --set text="ULK DEMO" --set text_size=6 \
    -o "$out/card/card.####.png"

step "2/4 generator: a checkerboard"
"$render" "$plugins/generator.so" --size $size --frames $frames \
    --set pattern=Checkerboard --set cell_size=40 \
    --set colour_a=0.15,0.2,0.3 --set colour_b=0.9,0.85,0.7 \
    -o "$out/checks/checks.####.png"

step "3/4 blur: the card, radius animated from 0 to 12 and back"
"$render" "$plugins/blur.so" --frames $frames \
    --set radius@0=0 --set radius@24=12 --set radius@47=0 \
    -o "$out/blurred/blurred.####.png" "$out/card/card.####.png"

step "4/4 wipe: a soft circle opening from the blurred card onto the checkerboard"
"$render" "$plugins/wipe.so" --frames $frames --threads 2 \
    --set transition=Circle --set softness=0.1 --set progress@0=0 --set progress@47=1 \
    -o "$out/final/final.####.png" "$out/blurred/blurred.####.png" "$out/checks/checks.####.png"
end=$(date +%s%N)

ms=$(( (end - start) / 1000000 ))
printf '\n== Done in %d.%01d s: 4 x 48 frames at %s.\n' $((ms / 1000)) $((ms % 1000 / 100)) $size
echo "   The finished sequence is $out/final/final.0000.png ... final.0047.png"
echo "   (intermediate steps in $out/card, $out/checks, $out/blurred)."
