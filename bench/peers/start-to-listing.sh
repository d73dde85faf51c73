#!/usr/bin/env bash
# From the start of the program to the complete listing of a folder, beside a peer: time and memory.
#
#   bench/peers/start-to-listing.sh [ENTRIES] [ROUNDS]      10000 entries and 7 rounds without
#
# Wants a release build of tavrin and pelmora. Installs the peer (pcmanfm-qt), Xvfb, xdotool and
# D-Bus when they are missing: the peer ends at once where there is no session bus. Both programs show the same folder on the same virtual screen. A
# Tavrin starts with its libraries; the one that is the folder is opened at once by the keyboard. A
# listing counts as complete when the window is there and the process has used no processor time for
# half a second; that half second is not counted. Memory is the proportional set size at that moment.
# Prints the medians and the ratio.
set -euo pipefail
entries=${1:-10000}
rounds=${2:-7}
root=$(cd "$(dirname "${BASH_SOURCE[0]}")/../.." && pwd)
bin=$root/build/${TAVRIN_PRESET:-release}/bin
quiet=50 # hundredths of a second

missing=()
for package in pcmanfm-qt xvfb xdotool dbus; do
    dpkg -s "$package" >/dev/null 2>&1 || missing+=("$package")
done
if ((${#missing[@]})); then
    echo "Installing ${missing[*]}" >&2
    as_root=()
    ((EUID == 0)) || as_root=(sudo)
    "${as_root[@]}" apt-get install -y --no-install-recommends "${missing[@]}" >/dev/null
fi

home=$(mktemp -d)
export HOME=$home XDG_RUNTIME_DIR=$home/run
export XDG_CONFIG_HOME=$home/config XDG_DATA_HOME=$home/data XDG_CACHE_HOME=$home/cache XDG_STATE_HOME=$home/state
mkdir -m 700 "$XDG_RUNTIME_DIR"
unset DBUS_SESSION_BUS_ADDRESS WAYLAND_DISPLAY
export DISPLAY=:97
Xvfb "$DISPLAY" -screen 0 1280x900x24 >/dev/null 2>&1 &
screen=$!
exec 3< <(exec dbus-daemon --session --nofork --print-address)
bus=$!
trap 'kill "$screen" "$bus" 2>/dev/null; rm -rf "$home"' EXIT
read -r DBUS_SESSION_BUS_ADDRESS <&3
export DBUS_SESSION_BUS_ADDRESS
until xdotool getmouselocation >/dev/null 2>&1; do sleep 0.05; done

mkdir -p "$home/remote/Documents"
"$bin/pelmora" sign-in folder "$home/remote" --name Bench >/dev/null
"$bin/pelmora" ls >/dev/null
folder=$(echo "$XDG_DATA_HOME"/pelmora/*/Shelfroot/Documents)
for ((i = 0; i < entries; i++)); do : >"$folder/IMG $i.jpg"; done
"$bin/pelmora" sync >/dev/null # so that nothing is left to be sent while it is measured

now() { echo $((${EPOCHREALTIME/./} / 1000)); }
# Processor time of a process in hundredths of a second; nothing once it has ended.
ticks() { [[ -r /proc/$1/stat ]] && awk '{ print $14 + $15 }' "/proc/$1/stat"; }

# Opens the first library as soon as there is a window.
tavrin_there() {
    PELMORA_REDUCE_MOTION=1 exec "$bin/tavrin"
}
open_first() {
    xdotool windowfocus --sync "$1" key --window "$1" Down Return
}

# measure PROGRAM: waits for its window and its rest; prints milliseconds and kilobytes.
measure() {
    local start pid last used since window
    start=$(now)
    "$@" >/dev/null 2>&1 &
    pid=$!
    until window=$(xdotool search --onlyvisible --pid "$pid" 2>/dev/null | head -n 1) && [[ $window ]]; do
        kill -0 "$pid" || return 1
        sleep 0.01
    done
    [[ $1 != tavrin_there ]] || open_first "$window"
    last=-1
    since=$(now)
    while (($(now) - since < quiet * 10)); do
        used=$(ticks "$pid") || return 1
        if ((used != last)); then
            last=$used
            since=$(now)
        fi
        sleep 0.01
    done
    echo "$((since - start)) $(awk '/^Pss:/ { print $2 }' "/proc/$pid/smaps_rollup")"
    kill "$pid"
    wait "$pid" 2>/dev/null || true
}

median() { sort -n | sed -n "$(((rounds + 1) / 2))p"; }
report() {
    local name=$1
    shift
    local lines
    lines=$(for ((i = 0; i <= rounds; i++)); do measure "$@"; done | tail -n "$rounds") # the first warms
    printf '%s %s\n' "$(cut -d' ' -f1 <<<"$lines" | median)" "$(cut -d' ' -f2 <<<"$lines" | median)" |
        tee >(awk -v n="$name" '{ printf "%-12s %6d ms %8.1f MB\n", n, $1, $2 / 1024 }' >&2)
}

peer=$(report pcmanfm-qt pcmanfm-qt "$folder")
ours=$(report tavrin tavrin_there)
read -r peer_time peer_memory <<<"$peer"
read -r our_time our_memory <<<"$ours"
awk -v a="$our_time" -v b="$peer_time" -v c="$our_memory" -v d="$peer_memory" \
    'BEGIN { printf "ratio        %6.2f    %8.2f\n", a / b, c / d }'
