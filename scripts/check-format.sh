#!/usr/bin/env bash
# Fails when a C++ file of the repository differs from what the repository's .clang-format makes of
# it. With --fix, formats the files in place instead.
set -euo pipefail
cd "$(dirname "$0")/.."
formatter=${CLANG_FORMAT:-clang-format}
mapfile -t files < <(find rkcore rkhost rkcomponents tests bench fuzz -name '*.h' -o -name '*.cpp' | sort)
if [ "${1:-}" = "--fix" ]; then
  "$formatter" -i "${files[@]}"
  exit 0
fi
report=$(mktemp)
trap 'rm -f "$report"' EXIT
if ! "$formatter" --dry-run --Werror "${files[@]}" 2>"$report"; then
  grep -E '^[^ ].*(warning|error):' "$report" | cut -d: -f1 | sort -u | sed 's/^/not formatted: /'
  echo "check-format: run scripts/check-format.sh --fix"
  exit 1
fi
echo "check-format: ${#files[@]} files formatted"
