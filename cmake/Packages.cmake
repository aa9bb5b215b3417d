# Debian packages, one for each component that was installed above. './dev packages' makes them, or
# cpack in the build tree of the preset 'debian'. packages/stage.cmake and packages/finish.cmake do
# what Debian 12's CPack (3.25) does not.
set(kq_library_package libkq-boolequation${PROJECT_VERSION_MAJOR})
set(kq_about "Boolean equations such as 'A & ~B' are parsed, evaluated, written in four
syntaxes, tabulated, and converted to and from init values of look-up tables.")

set(CPACK_GENERATOR DEB)
set(CPACK_VERBATIM_VARIABLES ON)
set(CPACK_PACKAGE_NAME kq-boolequation)
set(CPACK_PACKAGE_VENDOR "The Kq_BoolEquation authors")
set(CPACK_PACKAGE_CONTACT "Kq_BoolEquation maintainers <maintainers@kq-boolequation.invalid>")
set(CPACK_RESOURCE_FILE_LICENSE "${PROJECT_SOURCE_DIR}/LICENSE")
set(CPACK_STRIP_FILES ON)
set(CPACK_PRE_BUILD_SCRIPTS "${CMAKE_CURRENT_LIST_DIR}/packages/stage.cmake")
set(CPACK_POST_BUILD_SCRIPTS "${CMAKE_CURRENT_LIST_DIR}/packages/finish.cmake")

# The files that the solver is linked into; the copyright of their packages names its authors.
get_property(kq_has_solver GLOBAL PROPERTY KQ_HAS_SOLVER)
if(kq_has_solver)
  set(CPACK_KQ_SOLVER_FILES_logic "lib/*/libkq_logic.so.*")
  set(CPACK_KQ_SOLVER_FILES_tool "bin/booleq")
  set(CPACK_KQ_SOLVER_FILES_python "lib/python3/dist-packages/booleq/*.so")
endif()

set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_COMPRESSION_TYPE xz)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_SOURCE kq-boolequation)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
# dpkg-shlibdeps finds the dependencies. The project's own library is not installed at that time, so
# it is looked for in the build tree, and packages that need it name it.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS
    "${PROJECT_BINARY_DIR}" "${PROJECT_BINARY_DIR}/port")

set(CPACK_DEBIAN_LIBRARY_PACKAGE_NAME ${kq_library_package})
set(CPACK_DEBIAN_LIBRARY_PACKAGE_SECTION libs)
set(CPACK_DEBIAN_LIBRARY_PACKAGE_MULTIARCH same)
# As long as the number after .so stays, versions only add to the interface, so what was built
# against one version works with it and all later ones.
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY ">=")
set(CPACK_DEBIAN_LIBRARY_PACKAGE_CONTROL_EXTRA "${CMAKE_CURRENT_LIST_DIR}/packages/triggers")
set(CPACK_COMPONENT_LIBRARY_DESCRIPTION "Boolean equations and init values of look-up tables
${kq_about}

This package holds the shared library, and the default host library that it is
built on.")

set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME libkq-boolequation-dev)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SECTION libdevel)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_MULTIARCH same)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS "${kq_library_package} (= ${PROJECT_VERSION})")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SUGGESTS "kq-boolequation-doc")
set(CPACK_COMPONENT_DEVELOPMENT_DESCRIPTION "Boolean equations and init values - development files
${kq_about}

This package holds what programs in C++17 are built with: headers, a package
for CMake, and one for pkg-config.")

get_cmake_property(kq_components COMPONENTS)
if(logic IN_LIST kq_components)
  set(kq_logic_package libkq-logic${PROJECT_VERSION_MAJOR})
  set(CPACK_DEBIAN_LOGIC_PACKAGE_NAME ${kq_logic_package})
  set(CPACK_DEBIAN_LOGIC_PACKAGE_SECTION libs)
  set(CPACK_DEBIAN_LOGIC_PACKAGE_MULTIARCH same)
  set(CPACK_DEBIAN_LOGIC_PACKAGE_DEPENDS "${kq_library_package} (>= ${PROJECT_VERSION})")
  set(CPACK_DEBIAN_LOGIC_PACKAGE_CONTROL_EXTRA "${CMAKE_CURRENT_LIST_DIR}/packages/triggers")
  set(CPACK_COMPONENT_LOGIC_DESCRIPTION "Boolean functions - explain, match, convert, compare
${kq_about}

This package holds the shared library that explains, matches, permutes,
shortens, converts and compares the functions of such equations.")

  set(CPACK_DEBIAN_LOGIC_DEVELOPMENT_PACKAGE_NAME libkq-logic-dev)
  set(CPACK_DEBIAN_LOGIC_DEVELOPMENT_PACKAGE_SECTION libdevel)
  set(CPACK_DEBIAN_LOGIC_DEVELOPMENT_PACKAGE_MULTIARCH same)
  set(CPACK_DEBIAN_LOGIC_DEVELOPMENT_PACKAGE_DEPENDS "${kq_logic_package} (= ${PROJECT_VERSION}), \
${CPACK_DEBIAN_DEVELOPMENT_PACKAGE_NAME} (= ${PROJECT_VERSION})")
  set(CPACK_DEBIAN_LOGIC_DEVELOPMENT_PACKAGE_SUGGESTS "kq-boolequation-doc")
  set(CPACK_COMPONENT_LOGIC_DEVELOPMENT_DESCRIPTION "Boolean functions - development files
${kq_about}

This package holds what programs in C++17 that ask about functions are built
with: headers, a component of the package for CMake, and one for pkg-config.")
endif()

set(CPACK_DEBIAN_TOOL_PACKAGE_NAME booleq)
set(CPACK_DEBIAN_TOOL_PACKAGE_SECTION electronics)
set(CPACK_DEBIAN_TOOL_PACKAGE_MULTIARCH foreign)
set(CPACK_DEBIAN_TOOL_PACKAGE_DEPENDS "${kq_library_package} (>= ${PROJECT_VERSION})")
set(CPACK_DEBIAN_TOOL_PACKAGE_SUGGESTS "kq-boolequation-doc")
set(CPACK_COMPONENT_TOOL_DESCRIPTION "command-line tool for Boolean equations and init values
${kq_about}

This package holds booleq, which shows, explains, compares and converts them in
a terminal and in scripts, with its man page and its completion for bash.")

if(python IN_LIST kq_components)
  # A compiled module is for one minor version of Python.
  find_package(Python REQUIRED COMPONENTS Interpreter)
  math(EXPR kq_next_minor "${Python_VERSION_MINOR} + 1")
  set(kq_python_dependency "python3 (>= ${Python_VERSION_MAJOR}.${Python_VERSION_MINOR}~), \
python3 (<< ${Python_VERSION_MAJOR}.${kq_next_minor})")
  set(CPACK_DEBIAN_PYTHON_PACKAGE_NAME python3-booleq)
  set(CPACK_DEBIAN_PYTHON_PACKAGE_SECTION python)
  set(CPACK_DEBIAN_PYTHON_PACKAGE_DEPENDS
      "${kq_library_package} (>= ${PROJECT_VERSION}), ${kq_python_dependency}, python3-numpy")
  set(CPACK_DEBIAN_PYTHON_PACKAGE_RECOMMENDS booleq) # 'python3 -m booleq' starts it
  set(CPACK_DEBIAN_PYTHON_PACKAGE_SUGGESTS "kq-boolequation-doc")
  set(CPACK_DEBIAN_PYTHON_PACKAGE_CONTROL_EXTRA
      "${CMAKE_CURRENT_LIST_DIR}/packages/python/postinst"
      "${CMAKE_CURRENT_LIST_DIR}/packages/python/prerm")
  set(CPACK_COMPONENT_PYTHON_DESCRIPTION "Boolean equations and init values - module for Python 3
${kq_about}

This package holds the module booleq for Python 3. Tables and columns come as
arrays of NumPy.")
endif()

set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_NAME kq-boolequation-doc)
set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_ARCHITECTURE all)
set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_SECTION doc)
set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_MULTIARCH foreign)
set(CPACK_COMPONENT_DOCUMENTATION_DESCRIPTION "Boolean equations and init values - documentation
${kq_about}

This package holds the documents of the library, of the command-line tool
booleq, and of the module for Python, as Markdown and as HTML.")

include(CPack)
