# SPDX-License-Identifier: MIT
"""Run the Python of a page as its reader would, in the current directory: run_page.py PAGE

The blocks marked ```python are one program. What it prints is compared with the blocks marked ```text.
"""

import contextlib
import io
import re
import sys
from pathlib import Path


def main():
    page = Path(sys.argv[1])
    blocks = re.findall(r"^```(python|text)\n(.*?)^```$", page.read_text(), re.MULTILINE | re.DOTALL)
    code = "\n".join(text for kind, text in blocks if kind == "python")
    expected = "".join(text for kind, text in blocks if kind == "text")
    if not code:
        sys.exit(f"{page.name} shows no Python")
    printed = io.StringIO()
    with contextlib.redirect_stdout(printed):
        exec(compile(code, page.name, "exec"), {"__name__": "__main__"})
    if printed.getvalue() != expected:
        sys.exit(f"{page.name} printed\n{printed.getvalue()}instead of\n{expected}")
    print(f"ok: {page.name}")


if __name__ == "__main__":
    main()
