#!/usr/bin/env bash
# Runs a test binary as an unprivileged user: root ignores terminal exclusivity,
# so only this shows whether a port is left locked for ordinary users.
# Skips (77) where we are not root or cannot drop privileges.
[ "$(id -u)" -eq 0 ] && command -v setpriv >/dev/null || exit 77
drop=(setpriv --reuid=65534 --regid=65534 --clear-groups)
# A checkout the unprivileged user cannot reach cannot be tested this way.
"${drop[@]}" test -x "$1" || exit 77
scratch=$(mktemp -d) && chmod 777 "$scratch"
trap 'rm -rf "$scratch"' EXIT
cd "$scratch" && HOME="$scratch" TMPDIR="$scratch" "${drop[@]}" "$@"
