#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Build the Debian packages in build/package, from the files that git knows or would add, and ask lintian about them.
set -euo pipefail
cd "$(dirname "$0")/.."
version=$(sed -n 's/^#define VARDEL_IP_QUARZEL_VERSION "\(.*\)"/\1/p' include/vardel_ip_quarzel.h)
if [ "$(dpkg-parsechangelog -S Version)" != "$version" ]; then
    echo "debian/changelog is not of version $version" >&2
    exit 1
fi
work=build/package
rm -rf "$work"
mkdir -p "$work/quarzel-$version"
git ls-files --cached --others --exclude-standard -z | tar c --null --files-from=- | tar x -C "$work/quarzel-$version"
echo "Building the Debian packages (some minutes, log in $work/log)"
if ! (cd "$work/quarzel-$version" && dpkg-buildpackage --build=binary --no-sign) >"$work/log" 2>&1; then
    cat "$work/log" >&2
    exit 1
fi
lintian --allow-root --fail-on error,warning "$work"/*.changes
ls "$work"/*.deb
