#!/bin/sh
# Calls the Windows program by Wine as if it were one of this system, so that tests can: QREX_EXE, or else that of the build.
here=$(cd "$(dirname "$(readlink -f "$0")")/../.." && pwd)
export WINEPREFIX="${WINEPREFIX:-$here/build-windows/wine}" WINEDEBUG="${WINEDEBUG:--all}"
exec /usr/lib/wine/wine64 "${QREX_EXE:-$here/build-windows/Qrex.exe}" "$@"
