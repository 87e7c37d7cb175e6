#!/usr/bin/env python3
# SPDX-License-Identifier: MIT
"""What draws and combines soft values calls no function of the mathematical library but sqrt, whose results might
differ from machine to machine: math_symbols.py NM [--but EXACT_FUNCTION]... ARCHIVE..."""
import subprocess
import sys

MATH = """acos asin atan atan2 cbrt ceil copysign cos cosh erf erfc exp exp10 exp2 expm1 fdim floor fma fmax fmin fmod
frexp hypot ilogb j0 j1 ldexp lgamma llrint llround log log10 log1p log2 logb lrint lround modf nearbyint nextafter
pow remainder remquo rint round scalbn sin sincos sinh tan tanh tgamma trunc y0 y1""".split()
NAMES = {name + suffix for name in MATH for suffix in ("", "f", "l")}
OTHERS = {"demodulation.cpp.o"}  # a function on arrays for users

nm, *archives = sys.argv[1:]
while archives[0] == "--but":
    NAMES.discard(archives[1])
    del archives[:2]
looked_at = 0
found = []
for archive in archives:
    member = ""
    for line in subprocess.run([nm, "--undefined-only", archive], check=True, text=True,
                               stdout=subprocess.PIPE).stdout.splitlines():
        if line.endswith(".o:"):
            member = line[:-1]
            looked_at += 1
        elif line.split()[-1:] and line.split()[-1].split("@")[0] in NAMES and member not in OTHERS:
            found.append(f"{member} calls {line.split()[-1]}")
print("\n".join(found))
sys.exit(0 if looked_at > 20 and not found else 1)
