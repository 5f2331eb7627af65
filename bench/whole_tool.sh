#!/usr/bin/env bash
# Whole-tool figures: CPU time (user + system), wall time and peak resident
# memory of fresh processes running --show-events, --show-battery, --dump and
# the dashboard over sample stores of several lengths. Each figure is the
# median of RUNS runs (default 3); peak memory is also shown against the
# store's bytes. Stores are generated once under STORES (default
# /tmp/brindlewick-stores).
#
#   bench/whole_tool.sh [BINARY] [DAYS...]     e.g. bench/whole_tool.sh build/src/brindlewick 1 10 30 90
set -euo pipefail
cd "$(dirname "$0")/.."
bin=${1:-build/src/brindlewick}
shift || true
days=("$@")
[[ ${#days[@]} -gt 0 ]] || days=(1 10 30 90)
runs=${RUNS:-3}
stores=${STORES:-/tmp/brindlewick-stores}
generator=${GENERATOR:-build/tools/samplestore/brindlewick-samplestore}
command -v /usr/bin/time >/dev/null || { echo "needs GNU time (apt-get install time)" >&2; exit 1; }

median() { sort -g | awk '{v[NR]=$1} END {print v[int((NR+1)/2)]}'; }

printf "%-15s %5s %9s %8s %8s %9s %7s\n" mode days store_MB cpu_s wall_s peak_MB x_store
for d in "${days[@]}"; do
  store="$stores/d$d"
  [[ -d $store ]] || "$generator" --quiet --days "$d" --output "$store"
  bytes=$(du -sb "$store" | cut -f1)
  for mode in --show-events --show-battery --dump dashboard; do
    flag=$mode
    [[ $mode == dashboard ]] && flag=
    cpu=() wall=() peak=()
    for ((r = 0; r < runs; r++)); do
      read -r u s e m < <(/usr/bin/time -f "%U %S %e %M" "$bin" --from "$store" $flag 2>&1 >/dev/null | tail -1)
      cpu+=("$(echo "$u + $s" | bc)") wall+=("$e") peak+=("$m")
    done
    c=$(printf "%s\n" "${cpu[@]}" | median)
    w=$(printf "%s\n" "${wall[@]}" | median)
    p=$(printf "%s\n" "${peak[@]}" | median)
    awk -v mode="$mode" -v d="$d" -v b="$bytes" -v c="$c" -v w="$w" -v p="$p" 'BEGIN {
      printf "%-15s %5d %9.1f %8.2f %8.2f %9.1f %7.2f\n", mode, d, b / 1e6, c, w, p * 1024 / 1e6, p * 1024 / b }'
  done
done
