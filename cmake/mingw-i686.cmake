# Cross build for 32-bit Windows with Debian's mingw-w64 (i686). The posix flavour of the
# compiler, because the host libraries use std::mutex and std::recursive_timed_mutex.
#   cmake -S . -B build-mingw -DCMAKE_TOOLCHAIN_FILE=cmake/mingw-i686.cmake
set(CMAKE_SYSTEM_NAME Windows)
set(CMAKE_SYSTEM_PROCESSOR i686)

set(NEBU_MINGW_PREFIX i686-w64-mingw32)
set(CMAKE_C_COMPILER ${NEBU_MINGW_PREFIX}-gcc-posix)
set(CMAKE_CXX_COMPILER ${NEBU_MINGW_PREFIX}-g++-posix)
set(CMAKE_RC_COMPILER ${NEBU_MINGW_PREFIX}-windres)
set(CMAKE_OBJDUMP ${NEBU_MINGW_PREFIX}-objdump)

set(CMAKE_FIND_ROOT_PATH /usr/${NEBU_MINGW_PREFIX})
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)

# The DLLs carry their own C++ runtime and thread library: the real host is not built with
# this compiler and ships none of its DLLs.
# --exclude-libs: a DLL without export marks (the virtual board) exports its own code only
# (not ALL: CMake hands a target its own objects as an archive too).
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-Wl,--exclude-libs,libgcc.a:libgcc_eh.a:libstdc++.a:libwinpthread.a -static-libgcc -static-libstdc++ -Wl,-Bstatic,--whole-archive -lwinpthread -Wl,--no-whole-archive,-Bdynamic")
