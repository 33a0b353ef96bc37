#!/usr/bin/env bash
# The 32-bit Windows DLL of the plug-in, cross-built with mingw-w64 (i686) in build-mingw/ with
# everything else (the build 70-wine32.sh runs; it is built even where Wine cannot run it): it
# builds with warnings as errors, exports exactly the OrvNebu_ functions of the public header
# under their plain names, and needs no DLL of the compiler's runtime.
source "$(dirname "$0")/common.bash"
source "$(dirname "$0")/wine.bash"
need g++-mingw-w64-i686-posix googletest
build="$root/build-mingw"
objdump=i686-w64-mingw32-objdump

mingw_build i686 "$build" wine

dll="$build/bin/orvnebu.dll"
[ -f "$dll" ] || fail "no $dll"
for lib in libOrvCore.dll.a libOrvJtag.dll.a libOrvUtil.dll.a liborvnebu.dll.a; do
  [ -f "$build/lib/$lib" ] || fail "no import library $lib"
done
[ -f "$build/bin/nebu_tests.exe" ] || fail "no nebu_tests.exe"

dump=$("$objdump" -p "$dll")
grep -q 'file format pei-i386' <<<"$dump" || fail "not a 32-bit DLL"

# The export names, from the table objdump prints, against the functions the header declares.
exports=$(sed -n '/\[Ordinal\/Name Pointer\] Table/,/^$/p' <<<"$dump" |
          sed -n 's/^[[:space:]]*\[ *[0-9]*\] \(.*\)$/\1/p' | sort)
declared=$(grep -o 'ORVNEBU_CALL OrvNebu_[A-Za-z]*' "$root/include/orvnebu/orvnebu.h" |
           sed 's/ORVNEBU_CALL //' | sort)
[ "$(wc -l <<<"$declared")" -eq 27 ] || fail "the header declares $(wc -l <<<"$declared") functions"
if [ "$exports" != "$declared" ]; then
  diff <(echo "$declared") <(echo "$exports") >&2 || true
  fail "the DLL's exports differ from the header's 27 functions (< header, > DLL)"
fi

# The host ships its own DLLs and the system's; nothing of this compiler's runtime.
imports=$(sed -n 's/^[[:space:]]*DLL Name: //p' <<<"$dump" | sort)
unexpected=$(grep -v -i -x -e OrvCore.dll -e OrvJtag.dll -e OrvUtil.dll -e KERNEL32.dll \
                         -e msvcrt.dll <<<"$imports" || true)
[ -z "$unexpected" ] || fail "the DLL needs $unexpected"
echo "$pass: orvnebu.dll (pei-i386) exports the 27 functions; imports: $(echo $imports)"
