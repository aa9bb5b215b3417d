# 32 bits: size_t, long and pointers are half as wide as elsewhere.
set(CMAKE_SYSTEM_PROCESSOR i686)
set(kq_machine i686)
set(kq_emulator qemu-i386)
include("${CMAKE_CURRENT_LIST_DIR}/linux.cmake")
