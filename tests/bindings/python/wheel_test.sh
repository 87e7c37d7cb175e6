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
# run_example NAME BLOCKS POINTS
run_example() {
    rows=$("$python" "$source/examples/$1.py" --blocks "$2" | wc -l)
    if [ "$rows" -ne $(($3 + 1)) ]; then
        echo "$1.py printed $rows lines, not a heading and $3 points" >&2
        exit 1
    fi
    echo "ok: $1.py"
}
run_example python_waterfall 20 11
run_example python_throughput 2 27
# Matplotlib is large, and nothing but the picture needs it.
if "$python" -c "import matplotlib" 2>/dev/null; then
    for name in python_waterfall python_throughput; do
        "$python" "$source/examples/$name.py" --blocks 2 --picture $name.svg >/dev/null
        grep -q "</svg>" $name.svg
    done
    echo "ok: the pictures of the examples"
else
    echo "not tried, for want of Matplotlib: the pictures of the examples"
fi
