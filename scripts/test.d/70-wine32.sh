#!/usr/bin/env bash
# Windows i686, the real host's word size, under Wine (build-mingw/, the build whose DLL
# 50-mingw.sh checks): every test under wine32, and nebu.exe's output compared with the Linux
# console's. Needs a machine that runs 32-bit programs, and Debian's wine32 (i386).
source "$(dirname "$0")/common.bash"
source "$(dirname "$0")/wine.bash"
need g++-multilib g++-mingw-w64-i686-posix googletest
probe_m32 "$root/build-mingw"
if ! dpkg --print-foreign-architectures | grep -qx i386; then
  sudo_cmd=()
  [ "$(id -u)" -ne 0 ] && sudo_cmd=(sudo)
  "${sudo_cmd[@]}" dpkg --add-architecture i386 || skip "cannot add Debian's i386 architecture"
fi
need wine32:i386
wine_pass i686 "$root/build-mingw" wine
