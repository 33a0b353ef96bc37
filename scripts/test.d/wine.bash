# Shared by the Windows passes (sourced after common.bash): the mingw-w64 cross build of
# everything, Wine made ready without a display, the suite under Wine, and the console's output
# under Wine against the Linux console's.

# mingw_build ARCH DIR LOADER: cross-builds the plug-in, stand-in host, board, console and
# nebu_tests for Windows (ARCH i686 or x86_64); ctest runs the test programs with LOADER
# (wine64 or wine).
mingw_build() {
  local arch=$1 dir=$2 loader=$3
  configure "$dir" -DCMAKE_TOOLCHAIN_FILE="$root/cmake/mingw-$arch.cmake" \
    -DNEBU_GTEST_FROM_SOURCE=ON -DNEBU_TEST_TIMEOUT="${NEBU_WINE_TEST_TIMEOUT:-120}" \
    -DCMAKE_CROSSCOMPILING_EMULATOR="$root/scripts/wine-run;$dir/wineprefix;$loader"
  cmake --build "$dir" -j "$jobs"
}

# wine_server DIR ARG...: the Wine server of the pass's prefix (-p: stay, -w: wait for its end,
# -k: stop).
wine_server() {
  local dir=$1 server
  shift
  server=$(command -v wineserver || true)
  for candidate in /usr/lib/wine/wineserver /usr/lib/wine/wineserver64 /usr/lib/wine/wineserver32; do
    [ -n "$server" ] || [ ! -x "$candidate" ] || server=$candidate
  done
  [ -n "$server" ] || return 1
  WINEPREFIX="$dir/wineprefix" "$server" "$@" </dev/null >/dev/null 2>&1
}

# wine_probe ARCH DIR LOADER: a hello program of this cross compiler runs under LOADER. Makes
# the Wine prefix and leaves a Wine server running for the pass (stopped when the pass ends):
# without it every test program pays seconds for a new one. The server and the programs Wine
# starts beside it (services, devices) hold no terminal or pipe of ours: they would keep a
# test's output open and ctest waiting for it.
wine_probe() {
  local arch=$1 dir=$2 loader=$3 probe="$2/probe"
  mkdir -p "$probe"
  printf '#include <cstdio>\nint main() { std::puts("hello from Windows"); }\n' >"$probe/hello.cpp"
  "$arch-w64-mingw32-g++-posix" -static -o "$probe/hello.exe" "$probe/hello.cpp" ||
    skip "$arch-w64-mingw32-g++-posix cannot build a probe program"
  timeout 600 "$root/scripts/wine-run" "$dir/wineprefix" "$loader" wineboot -i \
    </dev/null >"$probe/wineboot.log" 2>&1 || true
  wine_server "$dir" -w || true
  wine_server "$dir" -p || true
  trap 'wine_server "'"$dir"'" -k || true' EXIT
  timeout 120 "$root/scripts/wine-run" "$dir/wineprefix" "$loader" "$probe/hello.exe" \
    </dev/null >"$probe/hello.out" 2>"$probe/hello.err" || true
  [ "$(tr -d '\r' <"$probe/hello.out")" = "hello from Windows" ] ||
    skip "$loader cannot run a $arch Windows probe program ($(head -c 200 "$probe/hello.err" | tr '\n' ' '))"
}

# compare_console DIR LOADER: nebu.exe (loading orvnebu.dll beside it) runs the demo tour as
# scripts/demo does (the transcripts already run under Wine as tests); standard output, standard
# error and exit status must equal those of the Linux console (build/) line for line.
compare_console() {
  local dir=$1 loader=$2 out="$1/console" script=scripts/demo.nebu name=demo status=0
  [ -f "$root/build/CMakeCache.txt" ] || configure "$root/build"
  cmake --build "$root/build" -j "$jobs" --target nebu >/dev/null
  mkdir -p "$out"
  (cd "$root" && set +e
   build/bin/nebu "$script" </dev/null >"$out/$name.linux.out" 2>"$out/$name.linux.err"
   echo "exit status $?" >>"$out/$name.linux.out"
   "$root/scripts/wine-run" "$dir/wineprefix" "$loader" "$dir/bin/nebu.exe" "$script" \
     </dev/null >"$out/$name.windows.out" 2>"$out/$name.windows.err"
   echo "exit status $?" >>"$out/$name.windows.out")
  for stream in out err; do
    if ! diff -u "$out/$name.linux.$stream" "$out/$name.windows.$stream" \
      >"$out/$name.$stream.diff"; then
      head -40 "$out/$name.$stream.diff" >&2
      echo "$pass: nebu.exe differs from the Linux console on $script" \
        "(std$stream, ${out#"$root"/}/$name.$stream.diff)" >&2
      status=1
    fi
  done
  [ $status -ne 0 ] ||
    echo "$pass: nebu.exe $script: $(wc -l <"$out/$name.windows.out") lines, the same as on Linux"
  return $status
}

# wine_pass ARCH DIR LOADER: the whole Windows pass.
wine_pass() {
  local arch=$1 dir=$2 loader=$3 status=0
  wine_probe "$arch" "$dir" "$loader"
  mingw_build "$arch" "$dir" "$loader"
  run_ctest "$dir" || status=1
  compare_console "$dir" "$loader" || status=1
  return $status
}
