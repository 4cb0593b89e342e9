# Shared by vs-ffmpeg.sh and scaling.sh (sourced, not run): where the tools
# are, the raw input frames, and wall-clock timing of a command.
#
# Settings from the environment:
#   REPEAT   runs of each command; the fastest counts (default 3)
#   FRAMES   frames of the long run (default 100)
#   SHORT    frames of the short run that measures start-up (default 10)

REPEAT=${REPEAT:-3}
FRAMES=${FRAMES:-100}
SHORT=${SHORT:-10}

die() {
    echo "$(basename "$0"): $*" >&2
    exit 1
}

# bench_init BUILD_DIR: sets ULK_RENDER, ULK_INFO, BRIDGE, BENCH_MODULE, DATA.
bench_init() {
    local build
    build=$(cd "${1:?usage: $(basename "$0") BUILD_DIR}" && pwd) || die "no build folder $1"
    ULK_RENDER=$build/tools/ulk-render/ulk-render
    ULK_INFO=$build/tools/ulk-info/ulk-info
    BRIDGE=$build/plugins/frei0r-bridge.so
    BENCH_MODULE=$build/bench-plugins/bench_effect.so
    DATA=$build/bench-data
    local need
    for need in "$ULK_RENDER" "$ULK_INFO" "$BRIDGE" "$BENCH_MODULE"; do
        [ -e "$need" ] || die "$need is missing: build with -DULK_BUILD_BENCH=ON first"
    done
    command -v ffmpeg >/dev/null || die "ffmpeg is missing (make deps installs it)"
    mkdir -p "$DATA"
}

# raw_frames W H N: prints the path of N frames of ffmpeg's testsrc2 pattern as
# raw RGBA, made on first use and kept in the build folder.
raw_frames() {
    local file=$DATA/testsrc2-$1x$2-$3.rgba
    if [ ! -s "$file" ]; then
        ffmpeg -nostdin -hide_banner -loglevel error -y -f lavfi \
            -i "testsrc2=size=$1x$2:rate=25" -frames:v "$3" -pix_fmt rgba -f rawvideo "$file.tmp" &&
            mv "$file.tmp" "$file" || die "ffmpeg could not make $file"
    fi
    echo "$file"
}

# model_index MODULE IDENTIFIER: the number of the model with that identifier,
# as ulk-info lists it (ulk-render finds a model by number at once).
model_index() {
    local index
    index=$("$ULK_INFO" "$1" 2>/dev/null | awk -v id="$2" '
        /^  model [0-9]+:/ { n = $2; sub(":", "", n) }
        $1 == "identifier:" && $2 == id { print n; exit }')
    [ -n "$index" ] || die "no model $2 in $1"
    echo "$index"
}

# best_seconds INPUT COMMAND...: runs COMMAND REPEAT times with INPUT on standard
# input and the output discarded; prints the fastest wall time in seconds.
best_seconds() {
    local input=$1 best="" start end i
    shift
    for ((i = 0; i < REPEAT; i++)); do
        start=$(date +%s%N)
        "$@" <"$input" >/dev/null 2>"$DATA/last-error" ||
            die "failed: $* ($(head -c 300 "$DATA/last-error"))"
        end=$(date +%s%N)
        if [ -z "$best" ] || [ $((end - start)) -lt "$best" ]; then best=$((end - start)); fi
    done
    awk -v ns="$best" 'BEGIN { printf "%.4f", ns / 1e9 }'
}

# rates LONG_FRAMES LONG_INPUT SHORT_INPUT COMMAND...: times COMMAND over the long
# input (LONG_FRAMES frames) and the short one (SHORT frames); prints "FPS
# STEADY_FPS": frames per second of the whole long run, start-up included, and of
# the frames beyond the short run's, start-up excluded.
rates() {
    local frames=$1 long short
    long=$(best_seconds "$2" "${@:4}")
    short=$(best_seconds "$3" "${@:4}")
    awk -v l="$long" -v s="$short" -v n="$frames" -v m="$SHORT" 'BEGIN {
        steady = l > s ? (n - m) / (l - s) : 0
        printf "%.2f %.2f\n", n / l, steady }'
}

# ratio A B: A / B with two decimals ("n/a" when B is 0).
ratio() {
    awk -v a="$1" -v b="$2" 'BEGIN { if (b > 0) printf "%.2f", a / b; else printf "n/a" }'
}

# load: the one-minute load average now.
load() {
    cut -d' ' -f1 /proc/loadavg
}
