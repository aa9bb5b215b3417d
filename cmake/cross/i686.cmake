# 32 bits: size_t, long and pointers are half as wide as elsewhere. An x86-64 kernel runs the programs
# itself; under qemu-i386 a test of threads that takes seconds there had not ended after seven minutes.
set(CMAKE_SYSTEM_PROCESSOR i686)
set(kq_machine i686)
set(CMAKE_CROSSCOMPILING_EMULATOR
    "/usr/i686-linux-gnu/lib/ld-linux.so.2;--library-path;/usr/i686-linux-gnu/lib")
include("${CMAKE_CURRENT_LIST_DIR}/linux.cmake")
