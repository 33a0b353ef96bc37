# What the two mingw-w64 toolchain files share; they set NEBU_MINGW_PREFIX and
# CMAKE_SYSTEM_PROCESSOR first. The posix flavour of the compiler, because the host libraries
# use std::mutex and std::recursive_timed_mutex.
set(CMAKE_SYSTEM_NAME Windows)

set(CMAKE_C_COMPILER ${NEBU_MINGW_PREFIX}-gcc-posix)
set(CMAKE_CXX_COMPILER ${NEBU_MINGW_PREFIX}-g++-posix)
set(CMAKE_RC_COMPILER ${NEBU_MINGW_PREFIX}-windres)
set(CMAKE_OBJDUMP ${NEBU_MINGW_PREFIX}-objdump)

set(CMAKE_FIND_ROOT_PATH /usr/${NEBU_MINGW_PREFIX})
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)

# printf and strtod of mingw-w64 instead of msvcrt.dll's: the same %f digits, %lld and long
# double as on every other platform (libstdc++ asks for them too; this says so for C code).
set(CMAKE_C_FLAGS_INIT "-D__USE_MINGW_ANSI_STDIO=1")
set(CMAKE_CXX_FLAGS_INIT "-D__USE_MINGW_ANSI_STDIO=1")

# The DLLs and programs carry their own C++ runtime and thread library: the real host is not
# built with this compiler and ships none of its DLLs.
# --exclude-libs: a DLL without export marks (the virtual board) exports its own code only
# (not ALL: CMake hands a target its own objects as an archive too).
set(NEBU_MINGW_RUNTIME "-static-libgcc -static-libstdc++ -Wl,-Bstatic,--whole-archive -lwinpthread -Wl,--no-whole-archive,-Bdynamic")
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-Wl,--exclude-libs,libgcc.a:libgcc_eh.a:libstdc++.a:libwinpthread.a ${NEBU_MINGW_RUNTIME}")
set(CMAKE_EXE_LINKER_FLAGS_INIT "${NEBU_MINGW_RUNTIME}")
