# CPack runs this when the packages are made. Each is unpacked, fixed and packed again:
#   - The field Multi-Arch is added; CPack has it only from 3.31 on.
#   - Scripts that call ldconfig are removed: policy wants the trigger in the library's package.
cmake_minimum_required(VERSION 3.25)

function(kq_run)
  execute_process(COMMAND ${ARGN} COMMAND_ERROR_IS_FATAL ANY)
endfunction()

foreach(file IN LISTS CPACK_PACKAGE_FILES)
  set(tree "${file}.tree")
  file(REMOVE_RECURSE "${tree}")
  kq_run(dpkg-deb --raw-extract "${file}" "${tree}")

  file(READ "${tree}/DEBIAN/control" control)
  foreach(component IN LISTS CPACK_COMPONENTS_ALL)
    string(TOUPPER "${component}" upper)
    set(multi_arch "${CPACK_DEBIAN_${upper}_PACKAGE_MULTIARCH}")
    if(multi_arch AND NOT control MATCHES "\nMulti-Arch:" AND
       control MATCHES "\nPackage: ${CPACK_DEBIAN_${upper}_PACKAGE_NAME}\n")
      string(REPLACE "\nPackage:" "\nMulti-Arch: ${multi_arch}\nPackage:" control "${control}")
    endif()
  endforeach()
  file(WRITE "${tree}/DEBIAN/control" "${control}")

  foreach(script IN ITEMS postinst postrm)
    if(EXISTS "${tree}/DEBIAN/${script}")
      file(READ "${tree}/DEBIAN/${script}" text)
      if(text MATCHES "ldconfig")
        file(REMOVE "${tree}/DEBIAN/${script}")
      endif()
    endif()
  endforeach()

  # One thread, because the number of threads affects the compressed bytes.
  kq_run(dpkg-deb --root-owner-group --threads-max=1 --build "${tree}" "${file}")
  file(REMOVE_RECURSE "${tree}")
endforeach()
