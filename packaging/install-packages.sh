#!/usr/bin/env bash
# Installs the Debian packages of packaging/debian-packages.txt that are missing, and nothing when
# none is. Arguments name further lists beside it. Needs the network only when something is missing.
set -euo pipefail
here=$(cd "$(dirname "${BASH_SOURCE[0]}")" && pwd)

wanted=()
for list in debian-packages.txt "$@"; do
    while read -r name _; do
        [[ -z $name || $name == \#* ]] || wanted+=("$name")
    done <"$here/$list"
done

missing=()
for name in "${wanted[@]}"; do
    status=$(dpkg-query -W -f '${db:Status-Status}' "$name" 2>/dev/null || true)
    [[ $status == installed ]] || missing+=("$name")
done
if ((${#missing[@]} == 0)); then
    echo "All ${#wanted[@]} packages are there."
    exit 0
fi

as_root=()
if ((EUID != 0)); then
    if ! command -v sudo >/dev/null; then
        echo "These packages are missing and only root can install them: ${missing[*]}" >&2
        exit 1
    fi
    as_root=(sudo)
fi
echo "Installing ${#missing[@]} missing packages: ${missing[*]}"
"${as_root[@]}" apt-get update -qq
# RUNLEVEL=1: servers that tests start by hand must not be started by their packages.
"${as_root[@]}" env DEBIAN_FRONTEND=noninteractive RUNLEVEL=1 \
    apt-get install -y -qq --no-install-recommends "${missing[@]}" >/dev/null
echo "Installed."
