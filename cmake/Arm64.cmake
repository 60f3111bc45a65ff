# Toolchain file: AArch64 Linux, with Debian's cross compiler. ./dev test --arch arm64 makes the
# sysroot, which holds Debian's libraries, and the emulator runs the tests on them.

set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR aarch64)
set(CMAKE_CXX_COMPILER aarch64-linux-gnu-g++)

cmake_path(GET CMAKE_CURRENT_LIST_DIR PARENT_PATH sysroot)
string(APPEND sysroot /build/arm64-sysroot)
# The C and C++ libraries' headers are the compiler's own, so this is no CMAKE_SYSROOT.
set(CMAKE_FIND_ROOT_PATH ${sysroot})
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)

# The linker looks here for the libraries that the libraries themselves need. Flags are not quoted, so the
# checkout's path, which may have a blank, is not among them: Ninja builds in build/arm64.
foreach(folder aarch64-linux-gnu aarch64-linux-gnu/android p7zip)
    string(APPEND CMAKE_EXE_LINKER_FLAGS_INIT " -Wl,-rpath-link,../arm64-sysroot/usr/lib/${folder}")
endforeach()

set(CMAKE_CROSSCOMPILING_EMULATOR qemu-aarch64 -L ${sysroot})
