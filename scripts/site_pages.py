# SPDX-License-Identifier: MIT
"""Gather the pages of the site, laid out as in the project: site_pages.py SOURCE PAGES

A source file becomes a page of its own. A line {LANGUAGE FILE HEADING} of the first page becomes the first block in that
language of a page, after the heading if there is one, or a whole source file.
"""

import re
import shutil
import sys
from pathlib import Path

SOURCES = ["include/**/*.h", "include/**/*.hpp", "examples/*.c", "examples/*.py", "examples/systemverilog/*.sv",
           "examples/vhdl/*.vhd", "bindings/systemverilog/*.sv", "bindings/vhdl/*.vhd", "packages.txt"]
LANGUAGES = {".h": "c", ".c": "c", ".hpp": "cpp", ".py": "python", ".sv": "verilog", ".vhd": "vhdl"}


def main():
    source, pages = Path(sys.argv[1]), Path(sys.argv[2])
    shutil.rmtree(pages, ignore_errors=True)
    shutil.copytree(source / "docs", pages / "docs", ignore=shutil.ignore_patterns("site", "*.json"))
    shown = set()
    for pattern in SOURCES:
        for path in source.glob(pattern):
            name = path.relative_to(source)
            shown.add(str(name))
            page = pages / f"{name}.md"
            page.parent.mkdir(parents=True, exist_ok=True)
            page.write_text(f"# {name.name}\n\n```{LANGUAGES.get(path.suffix, 'text')}\n{path.read_text()}```\n")
    # README.md would take the place of the first page.
    for name, page in (("README.md", "project.md"), ("CHANGELOG.md", "CHANGELOG.md"), ("HACKING.md", "HACKING.md")):
        shutil.copy(source / name, pages / page)
    for page in [*pages.glob("*.md"), *pages.glob("docs/*.md")]:
        def target(link):
            path, mark, anchor = link[1].partition("#")
            name = path.removeprefix("../")
            if name == "README.md":
                path = path.replace("README.md", "project.md")
            elif name in shown:
                path += ".md"
            elif name == "examples/systemverilog":
                path += "/bench.sv.md"
            return f"]({path}{mark}{anchor})"
        page.write_text(re.sub(r"\]\(([^)\s]+)\)", target, page.read_text()))

    def block(line):
        language, file, heading = line[1], line[2], line[3]
        text = (source / file).read_text()
        if file.endswith(".md"):
            text = text[text.index(heading):]
            found = re.search(rf"^```{language}\n(.*?)^```$", text, re.MULTILINE | re.DOTALL)
            if not found:
                sys.exit(f"{file} has no block in {language}")
            text = found[1]
        return f"```{language}\n{text}```"

    index = (source / "docs/site/index.md").read_text()
    (pages / "index.md").write_text(re.sub(r"^\{(\w+) (\S+) ?(.*)\}$", block, index, flags=re.MULTILINE))


if __name__ == "__main__":
    main()
