# A big-endian machine: the first byte of a word is its highest.
set(CMAKE_SYSTEM_PROCESSOR s390x)
set(kq_machine s390x)
include("${CMAKE_CURRENT_LIST_DIR}/linux.cmake")
