# The copyright files of the packages name the authors of their content: the solver's authors if it
# is linked in, and only then. Variables: BUILD, SCRATCH, HAS_SOLVER.
cmake_minimum_required(VERSION 3.25)

include("${BUILD}/CPackConfig.cmake")
file(REMOVE_RECURSE "${SCRATCH}")
set(CPACK_TEMPORARY_INSTALL_DIRECTORY "${SCRATCH}")
set(CPACK_PACKAGING_INSTALL_PREFIX "/usr")
set(ENV{SOURCE_DATE_EPOCH} 1)
include("${CPACK_PRE_BUILD_SCRIPTS}")

foreach(component IN LISTS CPACK_COMPONENTS_ALL)
  string(TOUPPER "${component}" upper)
  file(READ "${SCRATCH}/${component}/usr/share/doc/${CPACK_DEBIAN_${upper}_PACKAGE_NAME}/copyright"
       text)
  if(NOT text MATCHES "\nFiles: \\*\nCopyright: [0-9]" OR
     NOT text MATCHES "\nLicense: Expat\n Permission is hereby granted")
    message(FATAL_ERROR "${component}: this is not the copyright file:\n${text}")
  endif()
  set(names_solver OFF)
  if(text MATCHES "\nFiles: [^@\n]+\nCopyright: [^@]*Armin Biere[^@]*\nComment: The solver CaDiCaL ")
    set(names_solver ON)
  endif()
  set(has_it OFF)
  if(HAS_SOLVER AND component MATCHES "^(logic|tool|python)$")
    set(has_it ON)
  endif()
  if(NOT names_solver STREQUAL has_it)
    message(FATAL_ERROR "${component}: the solver is in it: ${has_it}, named: ${names_solver}\n${text}")
  endif()
endforeach()
