#!/usr/bin/env bash
# How ulk-render's throughput scales: the frei0r bridge's brightness effect at
# 640x360, 1280x720 and 1920x1080, then the benchmark module's pass-through
# effect with 32 parameters of which 0, 8 or 32 are animated (keys from a
# --keys file), at 640x360 where the cost per frame outside the pixels shows
# most. One thread, raw RGBA frames read from a file, the output discarded.
#
#   bench/scaling.sh BUILD_DIR
#
# Every run reads as many bytes as FRAMES full HD frames (FRAMES frames at
# 1920x1080, 2.25 x FRAMES at 1280x720, 9 x FRAMES at 640x360). Each figure is
# the best of REPEAT runs. "fps" counts the whole run, start-up included;
# "frames only" and MB/s leave start-up out (the time of a SHORT-frame run is
# subtracted); MB/s counts the input frames' bytes.
set -euo pipefail
. "$(dirname "$0")/bench_lib.sh"
bench_init "${1:-}"

row() {
    printf '%-34s %9s %18s %8s\n' "$@"
}

# frames_for W H: frames of W x H holding as many bytes as FRAMES full HD frames.
frames_for() {
    echo $((FRAMES * 1920 * 1080 / ($1 * $2)))
}

# mb_per_second W H FPS
mb_per_second() {
    awk -v w="$1" -v h="$2" -v f="$3" 'BEGIN { printf "%.0f", w * h * 4 * f / 1e6 }'
}

# measure W H COMMAND...: "FPS STEADY_FPS" of COMMAND over raw W x H frames.
measure() {
    local w=$1 h=$2 n
    n=$(frames_for "$w" "$h")
    rates "$n" "$(raw_frames "$w" "$h" "$n")" "$(raw_frames "$w" "$h" "$SHORT")" "${@:3}"
}

run_ulk() {
    "$ULK_RENDER" "$@" -q -o - -
}

echo "ulk-render scaling: one thread, best of $REPEAT runs, load $(load)"
row "run" fps "fps (frames only)" "MB/s"

brightness=$(model_index "$BRIDGE" frei0r.brightness)
for size in 640x360 1280x720 1920x1080; do
    w=${size%x*} h=${size#*x}
    read -r fps steady < <(measure "$w" "$h" \
        run_ulk "$BRIDGE:$brightness" --raw "$size" --set brightness=0.7)
    row "brightness $size" "$fps" "$steady" "$(mb_per_second "$w" "$h" "$steady")"
done

# key_file N: keys at 0, 1/4, 1/2, 3/4 and 1 for parameters p0 to pN-1, values
# alternating, so that every frame interpolates.
key_file() {
    local file=$DATA/keys-$1.txt p k
    for ((p = 0; p < $1; p++)); do
        for k in 0 1 2 3 4; do
            echo "p$p $(awk -v k=$k 'BEGIN { print k / 4 }') $((k % 2 ? 10 + p : -10))"
        done
    done >"$file"
    echo "$file"
}

pass32=$(model_index "$BENCH_MODULE" bench.pass32)
w=640 h=360
for animated in 0 8 32; do
    read -r fps steady < <(measure $w $h run_ulk "$BENCH_MODULE:$pass32" --raw ${w}x$h \
        --total-frames "$(frames_for $w $h)" --keys "$(key_file $animated)")
    row "pass-through ${w}x$h, $animated animated" "$fps" "$steady" \
        "$(mb_per_second $w $h "$steady")"
    if [ "$animated" = 0 ]; then none=$steady; fi
done
echo "ratio  pass-through frames only, 32 animated / none: $(ratio "$steady" "$none")"
echo "load after the run: $(load)"
