#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# A bare Debian 12 in which a new user follows the pages, word for word: pages_test.sh SOURCE. Works as root, or with sudo.
# The shell lines of the chapters "Install" are run, then what each page shows for its language.
set -euo pipefail
[ "$(id -u)" -eq 0 ] || exec sudo "$0" "$@"
source=$(realpath "$1")
root=$(mktemp -d)
trap 'rm -rf --one-file-system "$root"' EXIT
debootstrap --variant=minbase bookworm "$root" >"$root.log" 2>&1 || {
    cat "$root.log" >&2
    exit 1
}
rm "$root.log"
mkdir "$root/quarzel"
(cd "$source" && git ls-files -z --cached --others --exclude-standard | xargs -0 cp --parents -t "$root/quarzel")
# The packages of the compilers are not the project's: its first command installs them.
inside() {
    unshare --fork --pid --mount-proc="$root/proc" chroot "$root" env -i HOME=/root PATH="$PATH" LC_ALL=C.UTF-8 "$@"
}
inside sh -c 'apt-get update && apt-get install -y --no-install-recommends git make sudo' >/dev/null
inside /quarzel/tests/install/follow_pages.sh
