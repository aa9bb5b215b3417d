# What the tool-chain files of Linux share. 'kq_machine' is the processor and the name of its
# emulator; programs run under qemu-user with the C library of Debian's cross compiler.
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_C_COMPILER ${kq_machine}-linux-gnu-gcc)
set(CMAKE_CXX_COMPILER ${kq_machine}-linux-gnu-g++)
set(CMAKE_FIND_ROOT_PATH /usr/${kq_machine}-linux-gnu)
if(NOT kq_emulator)
  set(kq_emulator qemu-${kq_machine})
endif()
set(CMAKE_CROSSCOMPILING_EMULATOR "${kq_emulator};-L;/usr/${kq_machine}-linux-gnu")
include("${CMAKE_CURRENT_LIST_DIR}/common.cmake")
