#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""Change the library in one place at a time and see whether its tests notice: mutate.py [--count N] [--seed S] [PATH...]

The mutants are drawn from the files of src/, or from PATHs, and tried in a copy of the sources in build/mutants. What was
seen of each stands in build/mutants/seed-S.txt, so that an interrupted run goes on there: killed by a test program,
SURVIVED, or not counted, as the compiler refuses the mutant or makes the very same library of it. --again tries the
survivors anew. Fails when more than one mutant in twenty survives."""
import argparse
import hashlib
import os
import pathlib
import random
import re
import shutil
import subprocess
import sys
import time

ROOT = pathlib.Path(__file__).resolve().parents[2]
WORK = ROOT / "build/mutants"
SOURCE = WORK / "source"
BUILD = WORK / "build"
ROOMS = ["fixed", "interleaver", "engine", "decoder", "interface", "lanes", "oracle"]

# What stands in code and what it becomes. Blanks tell operators from templates and signs.
SWAPS = [
    (" == ", " != "), (" != ", " == "), (" < ", " <= "), (" <= ", " < "), (" > ", " >= "), (" >= ", " > "),
    (" + ", " - "), (" - ", " + "), (" * ", " + "), (" / ", " * "), (" % ", " / "), (" && ", " || "), (" || ", " && "),
    (" += ", " -= "), ("std::min", "std::max"), ("std::max", "std::min"), ("++", "--"), ("true", "false"),
    ("false", "true"), (" << ", " >> "), (" >> ", " << "), (" & ", " | "), (" | ", " & "), (" ? ", " ? true ? "),
]
STATEMENT = re.compile(r"\s+(?!return|case|using|const|auto|break|continue|static|else|delete|throw)"
                       r"[\w.:>\[\]*-]+(\(| [-+|&]?= ).*;$")
NUMBER = re.compile(r"(?<![\w.\"])\d+(?=U?\b(?!\.))")
TEXT = re.compile(r'"[^"\\]{4,}"')
NO_CODE = re.compile(r"\s*(//|#|\{\d|static_assert|template|using|namespace)")  # nor rows of a table


def mutants_of(path):
    """(path, line number, line, new line) of every mutant of a file."""
    for number, line in enumerate((ROOT / path).read_text(encoding="utf-8").splitlines(), 1):
        if NO_CODE.match(line):
            continue
        code = line.split("//")[0].rstrip()
        for old, new in SWAPS:
            for found in re.finditer(re.escape(old), code):
                yield path, number, line, line[:found.start()] + new + line[found.end():]
        for found in NUMBER.finditer(code):
            yield path, number, line, f"{line[:found.start()]}{int(found[0]) + 1}{line[found.end():]}"
        for found in TEXT.finditer(code):
            yield path, number, line, line[:found.start() + 1] + "~" + line[found.start() + 2:]
        if STATEMENT.match(code):
            yield path, number, line, line[:len(line) - len(line.lstrip())] + ";"


def run(command, seconds=900, **options):
    """Whether a command succeeds in time."""
    with subprocess.Popen(command, stdout=subprocess.DEVNULL, stderr=subprocess.DEVNULL, process_group=0,
                          **options) as process:
        try:
            return process.wait(seconds) == 0
        except subprocess.TimeoutExpired:
            os.killpg(process.pid, 9)
            return False


def build(target):
    return run(["cmake", "--build", BUILD, "--target", target])


def copy_sources():
    """Bring the copy up to date; files that did not change keep their dates."""
    names = subprocess.run(["git", "ls-files", "-z", "--cached", "--others", "--exclude-standard"], cwd=ROOT, check=True,
                           capture_output=True).stdout.decode().split("\0")
    for name in filter(lambda name: name and (ROOT / name).is_file(), names):
        content = (ROOT / name).read_bytes()
        target = SOURCE / name
        if not target.is_file() or target.read_bytes() != content:
            target.parent.mkdir(parents=True, exist_ok=True)
            target.write_bytes(content)


def configure():
    options = ["-DCMAKE_BUILD_TYPE=Release", "-DCMAKE_C_COMPILER=clang", "-DCMAKE_CXX_COMPILER=clang++",
               "-DCMAKE_CXX_FLAGS_RELEASE=-O1", "-DQUARZEL_LANES_LEVEL=-O1",
               "-DQUARZEL_TOOL=OFF", "-DQUARZEL_HARDEN=OFF", "-DQUARZEL_WERROR=OFF",
               "-DCMAKE_GTEST_DISCOVER_TESTS_DISCOVERY_MODE=PRE_TEST"]
    if shutil.which("ld.lld"):
        options += ["-DCMAKE_EXE_LINKER_FLAGS=-fuse-ld=lld", "-DCMAKE_SHARED_LINKER_FLAGS=-fuse-ld=lld"]
    if shutil.which("ccache"):
        options += ["-DCMAKE_CXX_COMPILER_LAUNCHER=ccache"]
    subprocess.run(["cmake", "-G", "Ninja", "-S", SOURCE, "-B", BUILD, *options], check=True, stdout=subprocess.DEVNULL)


def library():
    """A digest of the objects of the library."""
    digest = hashlib.sha256()
    for file in sorted((BUILD / "src").rglob("*.o")):
        digest.update(file.read_bytes())
    return digest.digest()


class Tests:
    """The test programs of the library, with the seconds that each takes, and what they killed in each folder."""

    def __init__(self, seed):
        self.environment = dict(os.environ, QUARZEL_TEST_SEED=str(seed))
        self.seconds = {}
        self.kills = {}
        if not all(build(f"tests/{room}/all") for room in ROOMS):
            sys.exit("the sources do not build without a mutant")
        for program in sorted(program for room in ROOMS for program in (BUILD / "tests" / room).glob("*_test")):
            begin = time.monotonic()
            if not self.passes(program, 900):
                sys.exit(f"{program.name} does not pass without a mutant")
            self.seconds[program] = time.monotonic() - begin

    def passes(self, program, seconds):
        return run([program, "--gtest_brief=1", "--gtest_fail_fast"], seconds, env=self.environment, cwd=BUILD)

    def killer(self, folder):
        """The first program that fails, and None when none does: those with the best prospect in their time come first."""
        def prospect(program):
            return (self.kills.get((folder, program.name), 0) + 0.3) / (self.seconds[program] + 1)

        for program in sorted(self.seconds, key=prospect, reverse=True):
            if not build(program.name) or not self.passes(program, 10 + 5 * self.seconds[program]):
                self.count(folder, program.name)
                return program.name
        return None

    def count(self, folder, name):
        self.kills[folder, name] = self.kills.get((folder, name), 0) + 1


def judge(mutant, tests, original):
    path, number, _, line = mutant
    file = SOURCE / path
    text = file.read_text(encoding="utf-8")
    lines = text.split("\n")
    lines[number - 1] = line
    file.write_text("\n".join(lines), encoding="utf-8")
    try:
        if not build("vardel_ip_quarzel_static"):
            return "refused by the compiler"
        if library() == original:
            return "the same library"
        killer = tests.killer(path.parent.name)
        return f"killed by {killer}" if killer else "SURVIVED"
    finally:
        file.write_text(text, encoding="utf-8")


def main():
    parser = argparse.ArgumentParser(description=__doc__, formatter_class=argparse.RawDescriptionHelpFormatter)
    parser.add_argument("--count", type=int, default=300)
    parser.add_argument("--seed", type=int, default=random.SystemRandom().randrange(10**6))
    parser.add_argument("--again", action="store_true")
    parser.add_argument("paths", nargs="*", default=["src"])
    arguments = parser.parse_args()
    files = sorted({file.relative_to(ROOT) for path in arguments.paths for file in [ROOT / path, *(ROOT / path).rglob("*")]
                    if file.suffix in {".cpp", ".hpp"}})
    everything = [mutant for file in files for mutant in mutants_of(file)]
    random.Random(arguments.seed).shuffle(everything)
    print(f"seed {arguments.seed}: {arguments.count} of {len(everything)} mutants", flush=True)

    copy_sources()
    configure()
    tests = Tests(arguments.seed)
    original = library()
    results = WORK / f"seed-{arguments.seed}.txt"
    seen = dict(reversed(line.split("  ", 1)) for line in results.read_text().splitlines()) if results.is_file() else {}
    for text, verdict in seen.items():
        if verdict.startswith("killed by "):
            tests.count(pathlib.Path(text.split(":")[0]).parent.name, verdict.removeprefix("killed by "))
    judged = {}
    for mutant in everything:
        if len(judged) == arguments.count:
            break
        path, number, was, line = mutant
        text = f"{path}:{number}: {was.strip()}  ->  {line.strip()}"
        verdict = seen.get(text)
        if verdict is None or (arguments.again and verdict == "SURVIVED"):
            verdict = judge(mutant, tests, original)
            with results.open("a", encoding="utf-8") as log:
                print(f"{verdict}  {text}", file=log)
        if verdict == "SURVIVED" or verdict.startswith("killed"):
            judged[text] = verdict
    survivors = [text for text, verdict in judged.items() if verdict == "SURVIVED"]
    print(f"{len(judged) - len(survivors)} of {len(judged)} mutants died. The others:")
    print("\n".join(survivors))
    return 0 if 20 * len(survivors) <= len(judged) else 1


if __name__ == "__main__":
    sys.exit(main())
