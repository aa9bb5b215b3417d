# Installs BUILD and moves the tree to PREFIX: nothing in it may depend on where it was installed.
file(REMOVE_RECURSE "${PREFIX}" "${PREFIX} first")
execute_process(
    COMMAND "${CMAKE_COMMAND}" --install "${BUILD}" --prefix "${PREFIX} first"
    COMMAND_ERROR_IS_FATAL ANY)
file(RENAME "${PREFIX} first" "${PREFIX}")
