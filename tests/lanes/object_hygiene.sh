#!/usr/bin/env bash
# SPDX-License-Identifier: MIT
# Code for a newer processor stays where it was asked for: object_hygiene.sh OBJECT...
#
# Objects of the lanes share nothing with others through the linker: they define no weak symbol, and none outside
# quarzel::lanes. Only those of an instruction set that has them use registers of more than 128 bits.
set -euo pipefail
lanes=0
others=0
failed=0
for object in "$@"; do
  case "$object" in
    */lanes_*)
      lanes=$((lanes + 1))
      # The types of symbols that the linker may merge or hand out: weak (W, V), unique (u), global (capital letters).
      symbols=$(nm --defined-only "$object")
      if grep -E ' [WwVvu] ' <<<"$symbols"; then
        echo "weak symbols in $object"
        failed=1
      fi
      symbols=$(nm --defined-only --extern-only "$object")
      if grep -vE ' [A-Z] _ZN7quarzel5lanes' <<<"$symbols"; then
        echo "symbols outside quarzel::lanes in $object"
        failed=1
      fi
      ;;
  esac
  case "$object" in
    */lanes_avx2.* | */lanes_avx512bw.*) ;;
    *)
      others=$((others + 1))
      code=$(objdump -d --no-show-raw-insn "$object")
      if grep -qE '%[yz]mm[0-9]' <<<"$code"; then
        echo "wide registers in $object"
        failed=1
      fi
      ;;
  esac
done
echo "$lanes lane objects, $others objects for every processor"
[[ $lanes -eq 4 && $others -gt 20 && $failed -eq 0 ]]
