#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# What a user of pip does, offline and in empty directories, which compiles the library: pip_test.sh SOURCE PYTHON
# [PAGE...]. Options for CMake may stand in CMAKE_ARGS.
set -euo pipefail
source=$(realpath "$1")
python=$2
shift 2
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT
offline=(--quiet --disable-pip-version-check --no-index --no-build-isolation)

# A source distribution holds all that the build needs.
mkdir "$work/source"
(cd "$source" && git ls-files -z --cached --others --exclude-standard | xargs -0 cp --parents -t "$work/source")
(cd "$work/source" && "$python" -W ignore setup.py --quiet sdist --dist-dir "$work/sdist")
mkdir "$work/tree" "$work/empty"
tar -C "$work/tree" --strip-components=1 -xzf "$work"/sdist/quarzel-*.tar.gz

"$python" -m venv --system-site-packages "$work/env"
cd "$work/tree"
"$work/env/bin/pip" wheel "${offline[@]}" --wheel-dir "$work/wheels" --no-deps .
"$python" "$source/tests/bindings/python/look_into_wheel.py" --alone "$work"/wheels/quarzel-*.whl
echo "ok: pip wheel ."
# The objects of the first build are there.
"$work/env/bin/pip" install "${offline[@]}" .
echo "ok: pip install ."

cd "$work/empty"
"$work/env/bin/python" -c 'import quarzel, sys; sys.exit(not quarzel.__file__.startswith(sys.prefix))'
if ldd "$work"/env/lib/python3*/site-packages/quarzel/_*.so | grep -E 'lib(fmt|gmp|mpfr)\.so' | grep -vF "$work/env"; then
    echo "these come from the machine, not from the wheel" >&2
    exit 1
fi
for page in "$@"; do
    "$work/env/bin/python" "$source/tests/bindings/run_page.py" "$source/docs/$page.md"
done
