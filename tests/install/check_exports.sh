#!/usr/bin/env bash
# The shared library exports its public classes and functions alone: no
# symbol of an internal namespace of zelta (the file device is public) and
# no implementation class.
set -euo pipefail
library=$1
symbols=$(nm -D --defined-only -C "$library")
test -n "$symbols"
internal=$(grep -E 'zelta::|[A-Za-z]Impl\b|\bImpl::|::impl\b' <<<"$symbols" | grep -vE 'zelta::file_device::(file_device|~file_device|[a-z_]+\()' || true)
if [ -n "$internal" ]; then
  echo "internal symbols exported:"
  echo "$internal"
  exit 1
fi
grep -q 'GenericKLVReader::read' <<<"$symbols"
grep -q 'zelta::file_device::open' <<<"$symbols"
echo "$(wc -l <<<"$symbols") symbols exported, none internal"
