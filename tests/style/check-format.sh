#!/bin/sh
# SPDX-FileCopyrightText: 2026 The Cadenza developers
# SPDX-License-Identifier: LGPL-2.1-or-later
# Fails when a tracked C++ file differs from what the committed .clang-format makes of it, and names
# the files. Run from the top of a git checkout; $1 is the clang-format program.
set -eu
clang_format=${1:-clang-format}
files=$(git ls-files '*.cpp' '*.h')
[ -n "$files" ] || { echo "check-format: no tracked C++ files found (not a git checkout?)" >&2; exit 1; }
bad=""
for file in $files; do
  if ! "$clang_format" --dry-run --Werror "$file" >/dev/null 2>&1; then
    bad="$bad $file"
  fi
done
if [ -n "$bad" ]; then
  echo "Not formatted (run: clang-format -i <file>):" >&2
  for file in $bad; do echo "  $file" >&2; done
  exit 1
fi
echo "check-format: $(echo "$files" | wc -l) files formatted"
