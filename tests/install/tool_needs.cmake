# Without CLI11 or nlohmann-json, configuring ends with a message that says what to install, unless
# the tool is switched off; as part of another project the library is built without the tool.
# Variables: SOURCE, SCRATCH, CMAKE_CXX_COMPILER.
cmake_minimum_required(VERSION 3.25)

file(REMOVE_RECURSE "${SCRATCH}")
function(kq_configure name source expects)
  execute_process(
      COMMAND "${CMAKE_COMMAND}" -G Ninja -S "${source}" -B "${SCRATCH}/${name}"
              "-DCMAKE_CXX_COMPILER=${CMAKE_CXX_COMPILER}" -DBUILD_TESTING=OFF ${ARGN}
      RESULT_VARIABLE status OUTPUT_VARIABLE said ERROR_VARIABLE said)
  string(REGEX REPLACE "[ \n]+" " " said "${said}") # CMake breaks lines
  if(expects STREQUAL "error" AND NOT status EQUAL 0 OR expects STREQUAL "done" AND status EQUAL 0)
    set(said "${said}" PARENT_SCOPE)
    return()
  endif()
  message(FATAL_ERROR "${name}: status ${status}, ${expects} was expected:\n${said}")
endfunction()

set(hint "install them (Debian: libcli11-dev nlohmann-json3-dev), or say -DKQ_BUILD_TOOLS=OFF")
foreach(missing IN ITEMS CLI11 nlohmann_json)
  kq_configure("${missing}" "${SOURCE}" error "-DCMAKE_DISABLE_FIND_PACKAGE_${missing}=ON")
  string(FIND "${said}" "${hint}" place)
  if(place EQUAL -1)
    message(FATAL_ERROR "${missing} is missing, and nobody says so:\n${said}")
  endif()
  kq_configure("off ${missing}" "${SOURCE}" done "-DCMAKE_DISABLE_FIND_PACKAGE_${missing}=ON"
               -DKQ_BUILD_TOOLS=OFF)
endforeach()

file(WRITE "${SCRATCH}/part/CMakeLists.txt" "cmake_minimum_required(VERSION 3.25)
project(Whole CXX)
add_subdirectory(\"${SOURCE}\" equations)
")
kq_configure("built part" "${SCRATCH}/part" done -DCMAKE_DISABLE_FIND_PACKAGE_CLI11=ON)
string(FIND "${said}" "booleq is not built: " place)
if(place EQUAL -1)
  message(FATAL_ERROR "the tool is left out, and nobody says so:\n${said}")
endif()
