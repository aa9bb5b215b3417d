# 64-bit ARM.
set(CMAKE_SYSTEM_PROCESSOR aarch64)
set(kq_machine aarch64)
include("${CMAKE_CURRENT_LIST_DIR}/linux.cmake")
