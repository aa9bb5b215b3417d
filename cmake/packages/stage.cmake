# CPack runs this when the files of all components are in place and no package has been made. Each
# component gets what policy wants of every package: /usr/share/doc/PACKAGE/copyright, made from the
# licence, and changelog.gz; man pages are compressed.
cmake_minimum_required(VERSION 3.25)

if("$ENV{SOURCE_DATE_EPOCH}" STREQUAL "")
  message(FATAL_ERROR "SOURCE_DATE_EPOCH is not set; it dates the packages, so that the same "
                      "sources give the same packages: "
                      "SOURCE_DATE_EPOCH=$(git log -1 --format=%ct)")
endif()

# Compresses a file, leaving out the name and time of the original.
function(kq_gzip file)
  execute_process(COMMAND gzip -9nf "${file}" COMMAND_ERROR_IS_FATAL ANY)
endfunction()

# The licence as a machine-readable copyright file. Its first line is its name, then comes the
# copyright line, then the terms. What others made is in COMPONENT.copyright, under the same terms;
# so is the solver where it is linked into a component's files.
function(kq_copyright variable component)
  file(READ "${CPACK_RESOURCE_FILE_LICENSE}" text)
  if(NOT text MATCHES "^MIT License\n\nCopyright (\\(c\\) )?([0-9][^\n]*)\n\n(.*[^\n])\n*$")
    message(FATAL_ERROR "${CPACK_RESOURCE_FILE_LICENSE}: the packages' copyright files are made of "
                        "'MIT License', a line 'Copyright YEAR AUTHORS' and the terms, with empty "
                        "lines between; write it so, or change cmake/packages/stage.cmake")
  endif()
  set(holder "${CMAKE_MATCH_2}")
  string(REGEX REPLACE "\n\n" "\n.\n" terms "${CMAKE_MATCH_3}")
  string(REGEX REPLACE "\n" "\n " terms "${terms}")
  set(others "")
  if(EXISTS "${CMAKE_CURRENT_LIST_DIR}/${component}.copyright")
    file(READ "${CMAKE_CURRENT_LIST_DIR}/${component}.copyright" others)
  endif()
  set(files "${CPACK_KQ_SOLVER_FILES_${component}}")
  if(files)
    file(READ "${CMAKE_CURRENT_LIST_DIR}/solver.copyright" solver)
    string(CONFIGURE "${solver}" solver @ONLY)
    string(APPEND others "${solver}")
  endif()
  set(${variable} "Format: https://www.debian.org/doc/packaging-manuals/copyright-format/1.0/
Upstream-Name: Kq_BoolEquation

Files: *
Copyright: ${holder}
License: Expat

${others}License: Expat
 ${terms}
" PARENT_SCOPE)
endfunction()

string(TIMESTAMP date "%a, %d %b %Y %H:%M:%S +0000" UTC)

foreach(component IN LISTS CPACK_COMPONENTS_ALL)
  string(TOUPPER "${component}" upper)
  set(package "${CPACK_DEBIAN_${upper}_PACKAGE_NAME}")
  if(NOT package)
    message(FATAL_ERROR "component '${component}': cmake/Packages.cmake has no package for it")
  endif()
  set(tree "${CPACK_TEMPORARY_INSTALL_DIRECTORY}/${component}${CPACK_PACKAGING_INSTALL_PREFIX}")
  file(GLOB man_pages "${tree}/share/man/man?/*.?")
  foreach(page IN LISTS man_pages)
    kq_gzip("${page}")
  endforeach()
  set(documents "${tree}/share/doc/${package}")
  kq_copyright(copyright "${component}")
  file(WRITE "${documents}/copyright" "${copyright}")
  file(WRITE "${documents}/changelog"
"${CPACK_DEBIAN_PACKAGE_SOURCE} (${CPACK_PACKAGE_VERSION}) unstable; urgency=medium

  * Version ${CPACK_PACKAGE_VERSION}: see CHANGELOG.md in kq-boolequation-doc.

 -- ${CPACK_PACKAGE_CONTACT}  ${date}
")
  kq_gzip("${documents}/changelog")
endforeach()
