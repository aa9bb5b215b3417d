# What the tool-chain files of Linux share. 'kq_machine' is the processor and, unless the file says
# otherwise, the name of its emulator; programs use the C library of Debian's cross compiler.
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_C_COMPILER ${kq_machine}-linux-gnu-gcc)
set(CMAKE_CXX_COMPILER ${kq_machine}-linux-gnu-g++)
set(CMAKE_FIND_ROOT_PATH /usr/${kq_machine}-linux-gnu)
if(NOT CMAKE_CROSSCOMPILING_EMULATOR)
  set(CMAKE_CROSSCOMPILING_EMULATOR "qemu-${kq_machine};-L;/usr/${kq_machine}-linux-gnu")
endif()
include("${CMAKE_CURRENT_LIST_DIR}/common.cmake")
