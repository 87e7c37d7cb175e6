#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# The Debian packages are installed in a bare Debian 12, where their own tests run: packages_test.sh PACKAGES, a folder
# that "make package" has filled. Works as root, or with sudo.
set -euo pipefail
[ "$(id -u)" -eq 0 ] || exec sudo "$0" "$@"
packages=$(realpath "$1")
root=$(mktemp -d)
trap 'rm -rf --one-file-system "$root"' EXIT
echo "Installing the packages in a bare Debian 12 (log in $packages/autopkgtest)"
{
    debootstrap --variant=minbase bookworm "$root"
    autopkgtest "$packages"/*.deb "$packages"/quarzel-*/ -- chroot "$root"
} >"$packages/autopkgtest" 2>&1 || {
    tail -n 50 "$packages/autopkgtest" >&2
    exit 1
}
sed '1,/@@@@.* summary/d' "$packages/autopkgtest" | grep -E '^[a-z-]+ +(PASS|FAIL|SKIP|FLAKY)'
