#!/usr/bin/env bash
# Fails when clang-format would change a file.
set -euo pipefail
cd "$(dirname "${BASH_SOURCE[0]}")/.."
find src tool tests bench fuzz \( -name '*.h' -o -name '*.cpp' -o -name '*.proto' \) -print0 |
  xargs -0 clang-format --dry-run -Werror
echo "format: clean"
