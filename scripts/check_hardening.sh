#!/usr/bin/env bash
# check_hardening.sh --linked|--compiled PROGRAM...: programs must be position independent, with all relocations bound
# and read-only before main, and without an executable stack. With --compiled they must be protected on their stack and
# call the library's checked functions, too.
set -euo pipefail
kind=$1
shift
failed=0
for program in "$@"; do
  headers=$(readelf --wide --file-header --program-headers --dynamic "$program")
  symbols=$(readelf --wide --dyn-syms "$program")
  must() {
    grep -Eq "$2" <<<"$3" && return
    echo "$program: $1" >&2
    failed=1
  }
  must "is not position independent" 'FLAGS_1.*PIE' "$headers"
  must "has relocations that stay writable" 'GNU_RELRO' "$headers"
  must "binds functions as they are called" 'BIND_NOW|FLAGS_1.*NOW' "$headers"
  must "may run code on its stack" 'GNU_STACK.* RW ' "$headers"
  [ "$kind" = --compiled ] || continue
  must "has no stack protection" '__stack_chk_fail' "$symbols"
  must "has no checked library calls" '__(memcpy|memmove|memset|snprintf|read|strncpy|fprintf|vfprintf|pread64)_chk' "$symbols"
done
exit $failed
