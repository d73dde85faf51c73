#!/usr/bin/env bash
# Installs Tavrin for this user, or below a prefix: the programs, the desktop entry that opens
# tavrinapp: addresses, and the icon. What was built is taken; nothing is built here.
#
#   packaging/install.sh [--prefix DIR] [--programs DIR] [--uninstall]
#
#   --prefix DIR    DIR/bin and DIR/share, in place of ~/.local/bin and the user's data folder
#   --programs DIR  where the built programs lie, in place of build/<TAVRIN_PRESET, else release>/bin
#   --uninstall     removes what this script installs; documents and settings stay
set -euo pipefail
here=$(cd "$(dirname "${BASH_SOURCE[0]}")/.." && pwd)
id=com.pelmora.Tavrin
programs=$here/build/${TAVRIN_PRESET:-release}/bin
names=(tavrin tavrin-open tavrin-draw-picture tavrin-list-archive tavrin-play-media pelmora)
prefix=
uninstall=false

fail() {
    echo "install.sh: $1" >&2
    exit "${2:-1}"
}

while (($# > 0)); do
    case $1 in
    --prefix | --programs)
        [[ -n ${2:-} ]] || fail "$1 wants a folder." 2
        printf -v "${1#--}" '%s' "$(realpath -m -- "$2")"
        shift
        ;;
    --uninstall) uninstall=true ;;
    -h | --help)
        sed -n '2,/^set /{/^set /d;s/^# \{0,1\}//;p}' "$0"
        exit 0
        ;;
    *) fail "'$1' is nothing that this script knows; see --help." 2 ;;
    esac
    shift
done

if [[ -n $prefix ]]; then
    bin=$prefix/bin
    share=$prefix/share
else
    bin=$HOME/.local/bin
    share=$HOME/.local/share
    [[ ${XDG_DATA_HOME:-} != /* ]] || share=$XDG_DATA_HOME
fi
entry=$share/applications/$id.desktop
icon=$share/icons/hicolor/scalable/apps/$id.svg

# A whole file or none, also over a program that runs.
put() { # mode source destination
    install -D -m "$1" -- "$2" "$3.new"
    mv -f -- "$3.new" "$3"
}

# A path as a word of the key Exec; plain where it can be, since not every opener reads quotes.
exec_word() {
    local word=${1//%/%%}
    if [[ ! $word =~ ^[A-Za-z0-9/._+,:@%-]+$ ]]; then
        word=$(sed 's/[\\"`$]/\\&/g' <<<"$word")
        word="\"${word//\\/\\\\}\""
    fi
    printf '%s' "$word"
}

# The desk looks up openers, and icons, in caches of its own.
refresh() {
    if command -v update-desktop-database >/dev/null; then
        update-desktop-database -q "$share/applications" || true
    elif [[ $uninstall == false ]] && command -v xdg-mime >/dev/null; then
        xdg-mime default "$id.desktop" x-scheme-handler/tavrinapp
    else
        echo "Install desktop-file-utils and run this again, so that the desk finds the change."
    fi
    touch -c "$share/icons/hicolor"
    if [[ -e $share/icons/hicolor/icon-theme.cache ]] && command -v gtk-update-icon-cache >/dev/null; then
        gtk-update-icon-cache -q -f "$share/icons/hicolor" || true
    fi
}

if $uninstall; then
    rm -f -- "$entry" "$icon" "${names[@]/#/$bin/}"
    refresh
    echo "Removed Tavrin from $bin and $share. Documents and settings are where they were."
    exit 0
fi

for name in "${names[@]}"; do
    [[ -x $programs/$name ]] ||
        fail "$programs/$name is not there. Build first: cmake --preset release && cmake --build --preset release"
done
for name in "${names[@]}"; do
    put 755 "$programs/$name" "$bin/$name"
done
put 644 "$here/resources/icons/Tavrin.svg" "$icon"
made=$(mktemp)
trap 'rm -f -- "$made"' EXIT
opener=$bin/tavrin-open
while IFS= read -r line; do
    case $line in
    Exec=*) line="Exec=$(exec_word "$opener") %U" ;;
    TryExec=*) line="TryExec=${opener//\\/\\\\}" ;;
    esac
    printf '%s\n' "$line"
done <"$here/packaging/$id.desktop" >"$made"
put 644 "$made" "$entry"
refresh
echo "Installed Tavrin in $bin, with its desktop entry in $share/applications."
[[ :$PATH: == *:$bin:* ]] || echo "$bin is not in \$PATH: the desk starts Tavrin, a shell needs the whole path."
if command -v xdg-mime >/dev/null; then
    opener_now=$(xdg-mime query default x-scheme-handler/tavrinapp 2>/dev/null || true)
    [[ $opener_now == "$id.desktop" ]] ||
        echo "tavrinapp: addresses go to ${opener_now:-nobody yet}; to change that: xdg-mime default $id.desktop x-scheme-handler/tavrinapp"
fi
