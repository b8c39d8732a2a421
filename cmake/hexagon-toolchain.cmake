# Cross build for the Hexagon DSP (v66, 128-byte HVX) with Debian's clang-16 and lld-16.
# Programs are static and freestanding (the runtime is platform/hexagon); ctest runs
# them under qemu-hexagon. Configure with `cmake --preset hexagon`.
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_SYSTEM_PROCESSOR hexagon)

set(corvane_hexagon_triple hexagon-unknown-linux-musl)
find_program(CORVANE_CLANG NAMES clang-16 REQUIRED)
find_program(CORVANE_CLANGXX NAMES clang++-16 REQUIRED)
find_program(CORVANE_QEMU_HEXAGON NAMES qemu-hexagon REQUIRED)
# The lld 16 binary must be reached under the name ld.lld: -fuse-ld=lld would take
# /usr/bin/ld.lld, which is lld 14 when Debian's default llvm is installed too.
set(CORVANE_LLD /usr/lib/llvm-16/bin/ld.lld CACHE FILEPATH "lld 16, named ld.lld")
find_program(CORVANE_READELF NAMES llvm-readelf-16 llvm-readelf REQUIRED)

set(CMAKE_C_COMPILER ${CORVANE_CLANG})
set(CMAKE_CXX_COMPILER ${CORVANE_CLANGXX})
set(CMAKE_ASM_COMPILER ${CORVANE_CLANG})
set(CMAKE_C_COMPILER_TARGET ${corvane_hexagon_triple})
set(CMAKE_CXX_COMPILER_TARGET ${corvane_hexagon_triple})
set(CMAKE_ASM_COMPILER_TARGET ${corvane_hexagon_triple})

# No libc and no C++ library: freestanding, no builtins assumed, no exceptions or RTTI,
# no guards on static locals. Float contraction off, so that a*b+c rounds twice as on
# the host and results match it bit for bit. No packet may hold a store and then a load
# of the same address (a store in slot 1 with a load in slot 0, which the v65+ ISA
# allows): qemu-hexagon 7.2 can give such a load the memory's old value.
set(corvane_hexagon_flags "-mv66 -mhvx -mhvx-length=128b -ffreestanding -fno-builtin -ffp-contract=off \
-mllvm -slot1-store-slot0-load=false")
set(CMAKE_C_FLAGS_INIT "${corvane_hexagon_flags}")
set(CMAKE_CXX_FLAGS_INIT "${corvane_hexagon_flags} -fno-exceptions -fno-rtti -fno-threadsafe-statics")
set(CMAKE_ASM_FLAGS_INIT "-mv66")

# The compile flags reach the link step too, where -mllvm has nothing to do.
set(CMAKE_EXE_LINKER_FLAGS_INIT "-nostdlib -static --ld-path=${CORVANE_LLD} -Wno-unused-command-line-argument")
set(CMAKE_SHARED_LINKER_FLAGS_INIT "-nostdlib --ld-path=${CORVANE_LLD} -Wl,-z,defs -Wno-unused-command-line-argument")
set(CMAKE_TRY_COMPILE_TARGET_TYPE STATIC_LIBRARY)

# Nothing from the host's file system may be found as a target library or header.
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)

set(CMAKE_CROSSCOMPILING_EMULATOR ${CORVANE_QEMU_HEXAGON})
