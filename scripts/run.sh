#!/usr/bin/env bash
# Set-up as for the tests, then the program on the built-in simulated module.
# Extra arguments go to kv700, e.g. `scripts/run.sh KV718-1A Debug`.
set -euo pipefail
cd "$(dirname "$0")/.."
scripts/setup.sh
exec build/ui/kv700 --demo "$@"
