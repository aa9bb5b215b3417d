# GoogleTest for another machine, from the sources that Debian provides.
set(INSTALL_GTEST OFF CACHE BOOL "")
set(BUILD_GMOCK OFF CACHE BOOL "")
add_subdirectory(/usr/src/googletest "${CMAKE_BINARY_DIR}/googletest" EXCLUDE_FROM_ALL SYSTEM)
foreach(name IN ITEMS gtest gtest_main)
  target_compile_options(${name} PRIVATE -w) # our warnings are for our code
endforeach()
