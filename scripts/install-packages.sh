#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Install the packages of a purpose that are missing: install-packages.sh demo|test|docs|package|long. Works as root, or as a user
# with sudo; says what it installs.
set -euo pipefail
list=$(dirname "$0")/../packages.txt
case "${1:-}" in
demo) purposes=demo ;;
test) purposes='demo|test' ;;
docs) purposes=docs ;;
package) purposes='demo|test|package' ;;
long) purposes='demo|test|docs|package|long' ;;
*)
    echo "usage: install-packages.sh demo|test|docs|package|long" >&2
    exit 2
    ;;
esac

# A package is the machine's own unless its name ends in ":" and another architecture; both may be installed.
own_architecture=$(dpkg --print-architecture)
is_installed() {
    local architecture=$own_architecture
    [[ $1 != *:* ]] || architecture=${1#*:}
    dpkg-query -W -f '${Architecture} ${db:Status-Status}\n' "${1%:*}" 2>/dev/null |
        grep -qxE "($architecture|all) installed"
}

missing=()
foreign=()
for package in $(awk -v purposes="^($purposes)\$" '$1 ~ purposes { print $2 }' "$list"); do
    if ! is_installed "$package"; then
        missing+=("$package")
        [[ $package != *:* ]] || foreign+=("${package#*:}")
    fi
done
if [ ${#missing[@]} -eq 0 ]; then
    exit 0
fi

echo "Installing from Debian: ${missing[*]}"
as_root=()
if [ "$(id -u)" -ne 0 ]; then
    if ! command -v sudo >/dev/null; then
        echo "Please run as root: $0 $1" >&2
        exit 1
    fi
    as_root=(sudo)
fi
log=$(mktemp)
trap 'rm -f "$log"' EXIT
install() {
    local architecture
    for architecture in "${foreign[@]}"; do
        "${as_root[@]}" dpkg --add-architecture "$architecture"
    done
    "${as_root[@]}" env DEBIAN_FRONTEND=noninteractive LC_ALL=C \
        sh -c 'apt-get update && apt-get install -y --no-install-recommends "$@"' sh "${missing[@]}"
}
if ! install >"$log" 2>&1; then
    cat "$log" >&2
    exit 1
fi
# Headers that were replaced keep the dates of their package, which can be older than what was precompiled from them.
build=$(dirname "$0")/../build
if [ -d "$build" ] && grep -q '^The following packages will be upgraded' "$log"; then
    find "$build" \( -name '*.pch' -o -name '*.gch' \) -delete
fi
