#!/usr/bin/env bash
# ulk-render through the frei0r bridge against ffmpeg's frei0r filter: the same
# frames of 1920x1080 RGBA read from a raw file, the output discarded, for three
# frei0r effects. ffmpeg runs with its default threading and with one thread;
# ulk-render with one thread and with two.
#
#   bench/vs-ffmpeg.sh BUILD_DIR
#
# Each figure is the best of REPEAT runs. "fps" is FRAMES frames over the whole
# run, start-up included; "frames only" leaves start-up out (the time of a SHORT-frame
# run is subtracted). ffmpeg 5.1's frei0r filter has no slice threads and its
# command line filters on one thread, so its default differs little from one thread.
set -euo pipefail
. "$(dirname "$0")/bench_lib.sh"
bench_init "${1:-}"

W=1920 H=1080
long=$(raw_frames $W $H "$FRAMES")
short=$(raw_frames $W $H "$SHORT")

# effect name, ffmpeg filter_params, ULK parameter setting (empty: none)
effects=(
    "invert0r||"
    "brightness|0.7|brightness=0.7"
    "squareblur|0.01|kernel_size=0.01"
)

# run_ffmpeg THREADS FILTER: the filter over raw frames on standard input;
# THREADS empty keeps ffmpeg's default threading.
run_ffmpeg() {
    ffmpeg -nostdin -hide_banner -loglevel error ${1:+-filter_threads "$1" -threads "$1"} \
        -f rawvideo -pix_fmt rgba -s ${W}x$H -i - ${1:+-threads "$1"} -vf "$2" -f null -
}

# run_ulk THREADS MODEL [SETTING]: the bridge's model over the same frames.
run_ulk() {
    "$ULK_RENDER" "$BRIDGE:$2" --raw ${W}x$H --threads "$1" -q ${3:+--set "$3"} -o - -
}

row() {
    printf '%-11s %-22s %9s %18s\n' "$@"
}

echo "ulk-render against ffmpeg: ${W}x${H} RGBA, $FRAMES frames, best of $REPEAT runs, load $(load)"
row effect tool fps "fps (frames only)"
for entry in "${effects[@]}"; do
    IFS='|' read -r name fparams setting <<<"$entry"
    filter="frei0r=filter_name=$name${fparams:+:filter_params=$fparams}"
    index=$(model_index "$BRIDGE" "frei0r.$name")

    read -r ff_auto ff_auto_s < <(rates "$FRAMES" "$long" "$short" run_ffmpeg "" "$filter")
    read -r ff_one ff_one_s < <(rates "$FRAMES" "$long" "$short" run_ffmpeg 1 "$filter")
    read -r ulk_one ulk_one_s < <(rates "$FRAMES" "$long" "$short" run_ulk 1 "$index" "$setting")
    read -r ulk_two ulk_two_s < <(rates "$FRAMES" "$long" "$short" run_ulk 2 "$index" "$setting")

    row "$name" "ffmpeg (default)" "$ff_auto" "$ff_auto_s"
    row "$name" "ffmpeg (1 thread)" "$ff_one" "$ff_one_s"
    row "$name" "ulk-render (1 thread)" "$ulk_one" "$ulk_one_s"
    row "$name" "ulk-render (2 threads)" "$ulk_two" "$ulk_two_s"
    echo "ratio  $name: ULK 1 thread / ffmpeg 1 thread = $(ratio "$ulk_one" "$ff_one")" \
        "(frames only $(ratio "$ulk_one_s" "$ff_one_s")); ULK 2 threads / ffmpeg default =" \
        "$(ratio "$ulk_two" "$ff_auto") (frames only $(ratio "$ulk_two_s" "$ff_auto_s"))"
done
echo "load after the run: $(load)"
