#!/usr/bin/env bash
# Runs the kernel benchmarks and writes their results as a Markdown table: per case and
# mode our time, pixel and byte rates, the reference's time and the ratio of the two.
# With gnuplot installed it also draws the ratios as a bar chart beside the table.
#
#   scripts/bench-report.sh [-b BUILD_DIR] [-o REPORT.md] [-- benchmark options...]
#
#   -b   build directory holding bench/corvane_bench (default build/host)
#   -o   the report (default BUILD_DIR/bench-report.md; the chart is REPORT.png)
#   benchmark options go to Google Benchmark, e.g. --benchmark_filter=boxfilter, or
#   --benchmark_repetitions=5 (the table then shows the medians)
#   CORVANE_MODE=scalar|shvx|dhvx keeps one mode; CORVANE_HOST_ISA=sse2|avx2|avx512 runs
#   the vector modes at that x86-64 level (the Level column shows the level used).
set -euo pipefail

root=$(cd "$(dirname "$0")/.." && pwd)
build="$root/build/host"
report=""
while [ $# -gt 0 ]; do
  case "$1" in
    -b) build=$2; shift 2 ;;
    -o) report=$2; shift 2 ;;
    --) shift; break ;;
    -h|--help) sed -n '2,13p' "$0" | sed 's/^# \{0,1\}//'; exit 0 ;;
    *) echo "bench-report: unknown argument $1 (try --help)" >&2; exit 2 ;;
  esac
done
report=${report:-$build/bench-report.md}
bench="$build/bench/corvane_bench"
if [ ! -x "$bench" ]; then
  echo "bench-report: no $bench; build it with: cmake --build $build --target corvane_bench" >&2
  exit 1
fi

csv=$(mktemp)
trap 'rm -f "$csv" "$csv.dat" "$csv.md"' EXIT
"$bench" --benchmark_min_time=0.5 "$@" --benchmark_out="$csv" --benchmark_out_format=csv

cpu=$(sed -n 's/^model name[[:space:]]*: //p' /proc/cpuinfo 2>/dev/null | head -n 1)
{
  echo "# Kernel benchmarks"
  echo
  echo "$(date -u '+%Y-%m-%d %H:%M UTC'), ${cpu:-unknown CPU}, $(nproc) hardware threads," \
       "load average $(cut -d' ' -f1-3 /proc/loadavg 2>/dev/null || echo '?')."
  echo "Frames are 1920x1080. Ours runs through the client in the mode named; the reference is"
  echo "OpenCV's operation on the same image. Ratio: our time / the reference's (below 1 is faster)."
  echo
} > "$csv.md"

# CSV fields may be quoted; a quoted field holds no line break here.
awk -v dat="$csv.dat" '
function split_csv(line, out,    n, i, c, field, quoted) {
  n = 0; field = ""; quoted = 0
  for (i = 1; i <= length(line); i++) {
    c = substr(line, i, 1)
    if (quoted) {
      if (c == "\"" && substr(line, i + 1, 1) == "\"") { field = field "\""; i++ }
      else if (c == "\"") quoted = 0
      else field = field c
    } else if (c == "\"") quoted = 1
    else if (c == ",") { out[++n] = field; field = "" }
    else field = field c
  }
  out[++n] = field
  return n
}
function ms(value, unit) {
  if (unit == "ns") return value / 1e6
  if (unit == "us") return value / 1e3
  if (unit == "s") return value * 1e3
  return value
}
function mode_name(key) {
  return key == "scalar" ? "Scalar" : key == "shvx" ? "SingleHVX" : key == "dhvx" ? "DualHVX" : key
}
/^name,/ {
  n = split_csv($0, h)
  for (i = 1; i <= n; i++) col[h[i]] = i
  started = 1
  next
}
started {
  split_csv($0, f)
  name = f[col["name"]]
  # With repetitions, the median row stands for the case.
  if (name ~ /_(mean|stddev|cv)$/) next
  sub(/_median$/, "", name)
  sub(/\/real_time$/, "", name)
  mode = name; sub(/.*\//, "", mode)
  kase = name; sub(/\/[^\/]*$/, "", kase)
  if (!(kase in seen)) { seen[kase] = 1; order[++cases] = kase }
  if (f[col["error_occurred"]] != "" && f[col["error_occurred"]] != "false") {
    err[kase, mode] = f[col["error_message"]]
  } else {
    t[kase, mode] = ms(f[col["real_time"]], f[col["time_unit"]])
    mpix[kase, mode] = f[col["items_per_second"]] / 1e6
    gbs[kase, mode] = f[col["bytes_per_second"]] / 1e9
    if ("ratio" in col) ratio[kase, mode] = f[col["ratio"]]
    if (mode == "opencv") ref[kase] = f[col["label"]]
    else level[kase, mode] = f[col["label"]]
  }
  if (!((kase, mode) in listed)) { listed[kase, mode] = 1; modes[kase] = modes[kase] " " mode }
}
END {
  print "| Benchmark | Mode | Level | Time [ms] | Mpixel/s | GB/s | Reference | Reference [ms] | Ratio |"
  print "|---|---|---|---:|---:|---:|---|---:|---:|"
  for (c = 1; c <= cases; c++) {
    kase = order[c]
    nm = split(modes[kase], ms_, " ")
    for (j = 1; j <= nm; j++) {
      mode = ms_[j]
      if (mode == "opencv") continue
      reference = (kase in ref) ? ref[kase] : ((kase, "opencv") in err ? err[kase, "opencv"] : "")
      ref_ms = ((kase, "opencv") in t) ? sprintf("%.3f", t[kase, "opencv"]) : ""
      if ((kase, mode) in err) {
        printf "| %s | %s | | skipped: %s | | | %s | %s | |\n", kase, mode_name(mode), err[kase, mode], reference, ref_ms
        continue
      }
      r = ((kase, mode) in ratio && ratio[kase, mode] > 0) ? sprintf("%.2f", ratio[kase, mode]) : ""
      printf "| %s | %s | %s | %.3f | %.0f | %.2f | %s | %s | %s |\n", kase, mode_name(mode), level[kase, mode], t[kase, mode],
             mpix[kase, mode], gbs[kase, mode], reference, ref_ms, r
      if (r != "") printf "\"%s %s\" %s\n", kase, mode, r > dat
    }
  }
}' "$csv" >> "$csv.md"

mkdir -p "$(dirname "$report")"
mv "$csv.md" "$report"
echo "bench-report: wrote $report" >&2

if command -v gnuplot > /dev/null && [ -s "$csv.dat" ]; then
  chart="${report%.md}.png"
  rows=$(wc -l < "$csv.dat")
  gnuplot <<EOF
set terminal png noenhanced size 900,$((120 + 22 * rows))
set output "$chart.tmp"
set title "Our time / the reference's time (below 1 is faster)"
set style fill solid 0.6
set yrange [*:*] reverse
set ytics nomirror
set xrange [0:*]
set grid x
unset key
set arrow from 1, graph 0 to 1, graph 1 nohead dashtype 2
plot "$csv.dat" using (\$2 / 2):0:(\$2 / 2):(0.35):yticlabels(1) with boxxyerror
EOF
  mv "$chart.tmp" "$chart"
  printf '\n![ratios](%s)\n' "$(basename "$chart")" >> "$report"
  echo "bench-report: drew $chart" >&2
fi
