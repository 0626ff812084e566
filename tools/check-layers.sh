#!/usr/bin/env bash
# Fails when an include in src/ climbs: a folder may include its own files and the folders below
# it, never a folder above it or beside it.
#   platform < catalogue < output < location < checks, maps, rewrite < commands < shell, cli
cd "$(dirname "$0")/../src" || exit 2
rank() {
    case $1 in
        platform) echo 0 ;; catalogue) echo 1 ;; output) echo 2 ;; location) echo 3 ;;
        checks | maps | rewrite) echo 4 ;; commands) echo 5 ;; shell | cli) echo 6 ;; *) echo 99 ;;
    esac
}
climbs=0
while IFS=: read -r file _ included; do
    from=${file%%/*}
    to=$(echo "$included" | sed -E 's/.*#include "([^/"]+)\/.*/\1/')
    [ "$to" = "$from" ] && continue
    if [ "$(rank "$to")" -ge "$(rank "$from")" ]; then
        echo "climbs: $file includes $to/"
        climbs=$((climbs + 1))
    fi
done < <(grep -rnE '^#include "[^/"]+/' --include='*.h' --include='*.cpp' .| sed 's#^\./##')
[ "$climbs" = 0 ] && echo "includes point down only"
[ "$climbs" = 0 ]
