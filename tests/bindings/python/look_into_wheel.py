# SPDX-License-Identifier: MIT
"""What a wheel holds and says of itself: look_into_wheel.py [--alone] WHEEL

The extension needs no library but those of every machine and those in the wheel; with --alone, that of sweeps neither.
"""

import re
import subprocess
import sys
import sysconfig
import tempfile
import zipfile
from pathlib import Path

EVERYWHERE = re.compile(r"(libc|libm|libstdc\+\+|libgcc_s|ld-linux-[\w-]+)\.so\.\d+")


def expect(condition, text):
    if not condition:
        sys.exit(f"the wheel {text}")


def needed(file):
    """The shared libraries that a file asks for."""
    text = subprocess.run(["readelf", "-d", file], check=True, capture_output=True, text=True).stdout
    return re.findall(r"\(NEEDED\).*\[(.*)\]", text)


def main():
    *options, wheel = sys.argv[1:]
    names = zipfile.ZipFile(wheel).namelist()
    folder = tempfile.TemporaryDirectory()
    zipfile.ZipFile(wheel).extractall(folder.name)
    (information,) = Path(folder.name).glob("quarzel-*.dist-info")
    python = f"cp{sys.version_info.major}{sys.version_info.minor}"
    platform = sysconfig.get_platform().replace("-", "_")
    expect(f"Tag: {python}-{python}-{platform}\n" in (information / "WHEEL").read_text(), "has another tag")
    metadata = (information / "METADATA").read_text()
    for line in ("License: MIT", "Requires-Dist: numpy (<2,>=1.21)", "Requires-Python: >=3.9"):
        expect(f"\n{line}\n" in metadata, f"does not say {line}")
    expect("MIT License" in (information / "LICENSE").read_text(), "does not carry its licence")
    extensions = list(Path(folder.name, "quarzel").glob("_*.so"))
    expect(any(extension.name.startswith("_core.") for extension in extensions), "has no extension")
    expect("quarzel/_core.pyi" in names and "quarzel/py.typed" in names, "has no types")
    for file in Path(folder.name, "quarzel").glob("*.so*" if "--alone" in options else "_core.*.so"):
        missing = [name for name in needed(file) if not EVERYWHERE.fullmatch(name) and f"quarzel/{name}" not in names]
        expect(not missing, f"lacks {', '.join(missing)} for {file.name}")
    for file in Path(folder.name, "quarzel").glob("lib*.so.*"):
        expect(f"quarzel/licences/{file.name}.txt" in names, f"does not carry the licence of {file.name}")
    print(f"ok: {Path(wheel).name}")


if __name__ == "__main__":
    main()
