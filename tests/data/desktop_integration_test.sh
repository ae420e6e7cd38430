#!/usr/bin/env bash
# Installs the build into a temporary prefix and checks the desktop files it puts there:
# tests/data/desktop_integration_test.sh BUILD_DIR [CMAKE]
set -euo pipefail
build=$1
cmake=${2:-cmake}
prefix=$(mktemp -d)
trap 'rm -rf "$prefix"' EXIT
fail() { echo "FAIL: $*" >&2; exit 1; }

XDG_DATA_HOME="$prefix/share" "$cmake" --install "$build" --prefix "$prefix" >/dev/null

# Where the freedesktop rules look.
desktop=$prefix/share/applications/ondrel.desktop
mime=$prefix/share/mime/packages/ondrel.xml
icon=$prefix/share/icons/hicolor/scalable/apps/ondrel.svg
[ -x "$prefix/bin/ondrel" ] || fail "no program in $prefix/bin"
for f in "$desktop" "$mime" "$icon"; do [ -s "$f" ] || fail "missing $f"; done

grep -qx 'Exec=ondrel %F' "$desktop" || fail "launcher does not pass the files to ondrel"
# Every type the launcher claims is defined by the package, and the other way round.
claimed=$(sed -n 's/^MimeType=//p' "$desktop" | tr ';' '\n' | sed '/^$/d' | sort)
defined=$(sed -n 's/.*<mime-type type="\([^"]*\)".*/\1/p' "$mime" | sort)
[ "$claimed" = "$defined" ] || fail "launcher types ($claimed) differ from the package's ($defined)"
[ "$(echo "$defined" | wc -l)" -eq 6 ] || fail "expected six types, got: $defined"

if command -v desktop-file-validate >/dev/null; then
    desktop-file-validate "$desktop" || fail "desktop-file-validate"
else
    echo "skipped: desktop-file-validate is not installed"
fi

if command -v xmllint >/dev/null; then
    # Debian ships no schema for shared-mime-info packages: well-formedness here, and the
    # database compiler below checks the content.
    xmllint --noout "$mime" "$icon" || fail "xmllint"
else
    echo "skipped: xmllint is not installed"
fi

if command -v update-mime-database >/dev/null; then
    db=$prefix/share/mime
    errors=$(XDG_DATA_HOME="$prefix/share" update-mime-database "$db" 2>&1 >/dev/null || true)
    [ -z "$errors" ] || fail "update-mime-database: $errors"
    for glob in otm mod s3m mtm xm avr; do
        grep -qx "audio/x-$glob:\*\.$glob" "$db/globs" || fail "no glob for *.$glob"
    done
    # The compiled magic holds each signature: the MOD marks at 1080, SCRM at 44, the rest at 0.
    for sig in 'M.K.' '8CHN' '32CH' 'SCRM' 'MTM' 'Extended Module: ' '2BIT'; do
        grep -qaF "$sig" "$db/magic" || fail "no magic for $sig"
    done
else
    echo "skipped: update-mime-database is not installed"
fi
echo "desktop files installed and valid under $prefix"
