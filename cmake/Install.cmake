# Installation: the library, its headers, the CMake package, the pkg-config file and the documents.
# All of it may be moved to another place afterwards, except that a ready-made host library stays
# where it was. Every install() of this repository names its component: library, development, logic,
# logic_development, tool, python or documentation. cmake/Packages.cmake makes a package of each.
set(kq_package_dir "${CMAKE_INSTALL_LIBDIR}/cmake/KqBoolEquation")
set(kq_generated_dir "${CMAKE_CURRENT_BINARY_DIR}/package")

install(TARGETS kq_boolequation EXPORT KqBoolEquationTargets
    LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT library NAMELINK_COMPONENT development
    ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT development
    RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT library)
list(TRANSFORM kq_public_headers PREPEND include/ OUTPUT_VARIABLE kq_header_files)
install(FILES ${kq_header_files} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR} COMPONENT development)

install(EXPORT KqBoolEquationTargets NAMESPACE Kq:: DESTINATION ${kq_package_dir}
    COMPONENT development)
configure_package_config_file(cmake/KqBoolEquationConfig.cmake.in
    "${kq_generated_dir}/KqBoolEquationConfig.cmake"
    INSTALL_DESTINATION ${kq_package_dir}
    NO_SET_AND_CHECK_MACRO)
write_basic_package_version_file("${kq_generated_dir}/KqBoolEquationConfigVersion.cmake"
    VERSION ${PROJECT_VERSION}
    COMPATIBILITY SameMajorVersion)
install(FILES
    "${kq_generated_dir}/KqBoolEquationConfig.cmake"
    "${kq_generated_dir}/KqBoolEquationConfigVersion.cmake"
    DESTINATION ${kq_package_dir} COMPONENT development)

if(KQ_BUILD_LOGIC)
  install(TARGETS kq_logic EXPORT KqBoolLogicTargets
      LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT logic
              NAMELINK_COMPONENT logic_development
      ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT logic_development
      RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT logic)
  list(TRANSFORM kq_logic_headers PREPEND include/ OUTPUT_VARIABLE kq_logic_header_files)
  install(FILES ${kq_logic_header_files} DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/kq_logic
      COMPONENT logic_development)
  install(EXPORT KqBoolLogicTargets NAMESPACE Kq:: DESTINATION ${kq_package_dir}
      COMPONENT logic_development)
endif()

if(kq_port_is_imported)
  file(GENERATE OUTPUT "${kq_generated_dir}/KqBoolEquationHost.cmake" CONTENT
"add_library(Kq::Port UNKNOWN IMPORTED)
set_target_properties(Kq::Port PROPERTIES
    IMPORTED_LOCATION \"$<TARGET_FILE:kq_port>\"
    INTERFACE_INCLUDE_DIRECTORIES \"$<TARGET_PROPERTY:kq_port,INTERFACE_INCLUDE_DIRECTORIES>\")
")
  install(FILES "${kq_generated_dir}/KqBoolEquationHost.cmake" DESTINATION ${kq_package_dir}
      COMPONENT development)
endif()

# The pkg-config file finds its prefix from its own place. pkg-config escapes a blank there as long
# as the value is written without quotes; a fixed path needs them.
set(kq_pc_dir "${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig")
file(RELATIVE_PATH kq_pc_prefix "${kq_pc_dir}" "${CMAKE_INSTALL_PREFIX}")
string(REGEX REPLACE "/$" "" kq_pc_prefix "${kq_pc_prefix}")
file(RELATIVE_PATH kq_pc_libdir "${CMAKE_INSTALL_PREFIX}" "${CMAKE_INSTALL_FULL_LIBDIR}")
file(RELATIVE_PATH kq_pc_includedir "${CMAKE_INSTALL_PREFIX}" "${CMAKE_INSTALL_FULL_INCLUDEDIR}")
if(kq_port_is_imported)
  set(kq_includes "$<TARGET_PROPERTY:kq_port,INTERFACE_INCLUDE_DIRECTORIES>")
  set(kq_pc_host_libs "\"$<TARGET_FILE:kq_port>\"")
  set(kq_pc_host_cflags " \"-I$<JOIN:${kq_includes},\" \"-I>\"")
else()
  set(kq_pc_host_libs "-l$<TARGET_LINKER_FILE_BASE_NAME:kq_port>")
  set(kq_pc_host_cflags "")
endif()
configure_file(cmake/kq_boolequation.pc.in "${kq_generated_dir}/kq_boolequation.pc.in" @ONLY)
file(GENERATE OUTPUT "${kq_generated_dir}/kq_boolequation.pc"
    INPUT "${kq_generated_dir}/kq_boolequation.pc.in" TARGET kq_boolequation)
install(FILES "${kq_generated_dir}/kq_boolequation.pc"
    DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)
if(KQ_BUILD_LOGIC)
  configure_file(cmake/kq_boollogic.pc.in "${kq_generated_dir}/kq_boollogic.pc" @ONLY)
  install(FILES "${kq_generated_dir}/kq_boollogic.pc"
      DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT logic_development)
endif()

install(FILES README.md CHANGELOG.md CONTRIBUTING.md DESTINATION ${CMAKE_INSTALL_DOCDIR}
    COMPONENT documentation)
install(DIRECTORY docs DESTINATION ${CMAKE_INSTALL_DOCDIR} COMPONENT documentation
    FILES_MATCHING PATTERN "*.md" PATTERN "*.svg")
