# SPDX-License-Identifier: MIT
"""Builds the extension with CMake, and takes the version from the header of the C interface.

QUARZEL_EXTENSIONS names a directory with extensions that are built already; the build of the whole project sets it.
CMAKE_ARGS holds further options for CMake.
"""

import os
import re
import shlex
import shutil
import subprocess
import sys
from pathlib import Path

from setuptools import Extension, setup
from setuptools.command.build_ext import build_ext

ROOT = Path(__file__).resolve().parent


class CMakeBuild(build_ext):
    """Has CMake build the extension, and that of sweeps where its packages are found."""

    def run(self):
        given = os.environ.get("QUARZEL_EXTENSIONS")
        files = list(Path(given or self.build_by_cmake()).glob("*.so"))
        package = Path(self.get_ext_fullpath("quarzel._core")).parent
        package.mkdir(parents=True, exist_ok=True)
        for former in package.glob("*.so*"):
            former.unlink()
        for extension in files:
            shutil.copy2(extension, package)
            if not given:
                self.copy_libraries(extension, package)

    def copy_libraries(self, extension, package):
        """Lay beside an extension the libraries that not every machine has; it looks for them there."""
        needed = subprocess.run(["ldd", extension], check=True, capture_output=True, text=True).stdout
        for name, path in re.findall(r"(lib(?:fmt|gmp|mpfr)\.so\S*) => (\S+)", needed):
            shutil.copy2(path, package / name)
            self.copy_licence(name, package / "licences")

    def copy_licence(self, name, folder):
        """Lay beside a library what Debian says of its licence, with the texts that this names."""
        found = subprocess.run(["dpkg-query", "--search", f"*/{name}"], capture_output=True, text=True)
        if found.returncode != 0:
            self.warn(f"lay the licence of {name} beside the wheel before you hand it on: no Debian package holds it")
            return
        folder.mkdir(exist_ok=True)
        copyright = Path("/usr/share/doc", found.stdout.split(":")[0], "copyright")
        shutil.copy2(copyright, folder / f"{name}.txt")
        for text in re.findall(r"/usr/share/common-licenses/[\w.-]*\w", copyright.read_text(encoding="utf-8")):
            shutil.copy2(text, folder)

    def build_by_cmake(self):
        # A pybind11 that pip has installed brings its CMake files along; Debian's stand where CMake looks.
        try:
            import pybind11

            options = [f"-Dpybind11_DIR={pybind11.get_cmake_dir()}"]
        except ImportError:
            options = []
        build = Path(self.build_temp).resolve()
        parts = ["TOOL=OFF", "TESTS=OFF", "INSTALL=OFF", "WERROR=OFF", "BINDINGS=ON", f"PYTHON={sys.executable}"]
        options += [f"-DQUARZEL_{part}" for part in parts]
        # The old kind of run path also serves the libraries that the libraries need. OpenSSL's is linked in, since
        # Python itself may load another version of it.
        options += ["-DCMAKE_BUILD_RPATH=$ORIGIN", "-DCMAKE_MODULE_LINKER_FLAGS=-Wl,--disable-new-dtags"]
        options += ["-DOPENSSL_USE_STATIC_LIBS=ON"]
        subprocess.run(
            ["cmake", "-S", ROOT, "-B", build, "-DCMAKE_BUILD_TYPE=Release", *options]
            + shlex.split(os.environ.get("CMAKE_ARGS", "")),
            check=True,
        )
        parallel = ["--parallel", str(len(os.sched_getaffinity(0)))]
        subprocess.run(["cmake", "--build", build, "--target", "quarzel_python_extensions", *parallel], check=True)
        return build / "bindings/python/quarzel"


def version():
    header = (ROOT / "include/vardel_ip_quarzel.h").read_text(encoding="utf-8")
    return re.search(r"#define VARDEL_IP_QUARZEL_VERSION .*?(\d+\.\d+\.\d+)", header).group(1)


setup(
    version=version(),
    ext_modules=[Extension("quarzel._core", sources=[])],
    cmdclass={"build_ext": CMakeBuild},
)
