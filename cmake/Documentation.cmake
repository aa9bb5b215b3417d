# The documentation as HTML: public headers, README.md and docs/. It can be installed alone, as the
# component 'documentation'.
find_package(Doxygen REQUIRED)
find_package(Python3 REQUIRED COMPONENTS Interpreter)

set(kq_docs_script "${CMAKE_CURRENT_SOURCE_DIR}/scripts/build_docs.py")
set(kq_docs_dir "${CMAKE_CURRENT_BINARY_DIR}/documentation")
file(GLOB kq_docs_sources CONFIGURE_DEPENDS
    *.md include/*.h include/kq_logic/*.h include/port/*.h docs/* docs/pictures/*)
add_custom_command(OUTPUT "${kq_docs_dir}/index.html"
    COMMAND Python3::Interpreter "${kq_docs_script}" "${CMAKE_CURRENT_SOURCE_DIR}" "${kq_docs_dir}"
    DEPENDS ${kq_docs_sources} CMakeLists.txt "${kq_docs_script}" scripts/doc_filter.py
    VERBATIM)
add_custom_target(kq_documentation ALL DEPENDS "${kq_docs_dir}/index.html")
install(DIRECTORY "${kq_docs_dir}/" DESTINATION "${CMAKE_INSTALL_DOCDIR}/html"
    COMPONENT documentation)
