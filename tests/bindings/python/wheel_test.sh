#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Install the wheel and run the pages and the example in an empty directory: wheel_test.sh PYTHON DIST SOURCE PAGE...
set -euo pipefail
python=$1
dist=$2
source=$3
shift 3
work=$(mktemp -d)
trap 'rm -rf "$work"' EXIT

"$python" "$source/tests/bindings/python/look_into_wheel.py" "$dist"/quarzel-*.whl
"$python" -m pip install --quiet --disable-pip-version-check --root-user-action=ignore --no-index --no-deps \
    --no-compile --target "$work/packages" "$dist"/quarzel-*.whl
export PYTHONPATH=$work/packages PYTHONDONTWRITEBYTECODE=1 MPLCONFIGDIR=$work
mkdir "$work/empty"
cd "$work/empty"
for page in "$@"; do
    "$python" "$source/tests/bindings/run_page.py" "$source/docs/$page.md"
done
rows=$("$python" "$source/examples/python_waterfall.py" --blocks 20 | wc -l)
if [ "$rows" -ne 12 ]; then
    echo "the example printed $rows lines, not a heading and 11 points" >&2
    exit 1
fi
echo "ok: the example"
# Matplotlib is large, and nothing but the picture needs it.
if "$python" -c "import matplotlib" 2>/dev/null; then
    "$python" "$source/examples/python_waterfall.py" --blocks 2 --picture waterfall.svg >/dev/null
    grep -q "</svg>" waterfall.svg
    echo "ok: the picture of the example"
else
    echo "not tried, for want of Matplotlib: the picture of the example"
fi
