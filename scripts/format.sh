#!/usr/bin/env bash
# Formats every C and C++ file in the repository with clang-format 14 and the style in
# .clang-format. With --check it changes nothing, names each file that differs and fails; CI runs
# that first.
# Usage: scripts/format.sh [--check]
set -euo pipefail
cd "$(dirname "$0")/.."

case "${1:-}" in
  "") mode=(-i) ;;
  --check) mode=(--dry-run --Werror) ;;
  *) sed -n '2,5p' "$0" >&2; exit 2 ;;
esac

scripts/install-deps.sh
git ls-files -z '*.c' '*.cpp' '*.h' | xargs -0 clang-format-14 "${mode[@]}"
