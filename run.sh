#!/usr/bin/env bash
# Starts Tavrin from a source tree: installs what is missing, builds, makes a sample store when no
# account is signed in, and opens the window. Without a display it tours the main screens offscreen
# and leaves pictures of them.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")"
preset=${TAVRIN_PRESET:-release}
bin=build/$preset/bin

packaging/install-packages.sh
echo "Building (preset $preset) …"
cmake --preset "$preset" >build-configure.log 2>&1 || { cat build-configure.log; exit 1; }
rm -f build-configure.log
cmake --build --preset "$preset" --target tavrin pelmora tavrin-tour tavrin-open

if [[ -z ${DISPLAY:-} && -z ${WAYLAND_DISPLAY:-} ]]; then
    echo "There is no display: touring the main screens offscreen."
    QT_QPA_PLATFORM=offscreen "$bin/tavrin-tour" build/screens
    echo "The pictures are in $PWD/build/screens/"
    exit 0
fi

account=${XDG_CONFIG_HOME:-$HOME/.config}/pelmora/account.json
if [[ ! -e $account ]]; then
    sample=${XDG_DATA_HOME:-$HOME/.local/share}/pelmora/sample-remote
    echo "No account is signed in: making a sample store in $sample and signing in to it."
    [[ -d $sample ]] || "$bin/pelmora" sample "$sample"
    "$bin/pelmora" sign-in folder "$sample" --name "Sample"
fi
exec "$bin/tavrin" "$@"
