# What all tool-chain files share: libraries come from the other machine only, programs from this
# one. The two header-only packages that booleq needs are found in this folder, where nothing else
# of this machine can be seen with them.
set(CMAKE_FIND_ROOT_PATH_MODE_PROGRAM NEVER)
set(CMAKE_FIND_ROOT_PATH_MODE_LIBRARY ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_INCLUDE ONLY)
set(CMAKE_FIND_ROOT_PATH_MODE_PACKAGE ONLY)
set(CLI11_DIR "${CMAKE_CURRENT_LIST_DIR}")
set(nlohmann_json_DIR "${CMAKE_CURRENT_LIST_DIR}")
