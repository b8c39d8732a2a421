#!/usr/bin/env bash
# check_levels.sh <baseline objects...> -- <objects of a higher level...>
#
# A unit compiled for a higher x86-64 level and its baseline twin may both define the
# same inline function; the linker then keeps one of the two for every caller. That is
# harmless only while the level's copy is baseline code. This fails when a function that
# a level object shares by name with its baseline twin uses anything the baseline lacks:
# VEX or EVEX instructions (mnemonics from v), ymm, zmm or mask registers, BMI, LZCNT,
# POPCNT or MOVBE.
# Arguments may also be ;-separated lists (CMake's $<TARGET_OBJECTS:...>).
set -euo pipefail
baseline=()
levels=()
side=baseline
for arg in "$@"; do
  if [ "$arg" = "--" ]; then side=levels; continue; fi
  IFS=';' read -ra parts <<< "$arg"
  if [ $side = baseline ]; then baseline+=("${parts[@]}"); else levels+=("${parts[@]}"); fi
done
status=0
for object in "${levels[@]}"; do
  twin=""
  for b in "${baseline[@]}"; do [ "$(basename "$b")" = "$(basename "$object")" ] && twin=$b; done
  if [ -z "$twin" ]; then echo "no baseline twin for $object" >&2; status=1; continue; fi
  shared=$(comm -12 <(nm --defined-only -g "$twin" | awk '{print $3}' | sort -u) \
                    <(nm --defined-only -g "$object" | awk '{print $3}' | sort -u))
  bad=$(objdump -d --no-show-raw-insn "$object" | awk -v shared="$shared" '
    BEGIN { n = split(shared, s, "\n"); for (i = 1; i <= n; i++) is_shared[s[i]] = 1 }
    /^[0-9a-f]+ <.*>:$/ { name = substr($2, 2, length($2) - 3); next }
    /^ +[0-9a-f]+:\t/ {
      if (!(name in is_shared) || (name in reported)) next
      split($0, f, "\t"); insn = f[2]
      if (insn ~ /^v/ || insn ~ /%[yz]mm|%k[0-7]/ || insn ~ /^(shlx|shrx|sarx|rorx|andn|bls|bzhi|pdep|pext|tzcnt|lzcnt|popcnt|movbe)/) {
        print name; reported[name] = 1
      }
    }')
  if [ -n "$bad" ]; then
    echo "$(basename "$object"): shares these functions with its baseline twin but uses wider instructions:" >&2
    echo "$bad" | c++filt | sed 's/^/  /' >&2
    status=1
  fi
done
[ $status -eq 0 ] && echo "every function that ${#levels[@]} level objects share with the baseline is baseline code"
exit $status
