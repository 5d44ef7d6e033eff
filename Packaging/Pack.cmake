# Read by cpack for each kind of package. A package for one system asks it for the libraries that the programs need;
# an archive is for any system, and has programs that need none.
set(targets OvrinMerge ovrin ${CPACK_OVRIN_WEB} completions)
set(components Unspecified programs)
if(NOT CPACK_GENERATOR MATCHES "^(DEB|RPM)$")
  if(NOT CPACK_OVRIN_STATIC_LINK)
    message(FATAL_ERROR "An archive for any Linux needs programs that are linked statically, and this build can't link "
      "so: it is one with sanitizers, or libyaml.a, libncursesw.a, libstdc++.a or libc.a is missing. Debian has them "
      "in libyaml-dev, libncurses-dev, g++ and libc6-dev, Fedora in libyaml-static, ncurses-static, libstdc++-static and "
      "glibc-static. "
      "Install them and configure the build in a new folder.")
  endif()
  set(targets OvrinMerge-static ovrin-static completions)
  set(components Unspecified archive)
  set(CPACK_PACKAGING_INSTALL_PREFIX /)
endif()

# Not what was built last: cpack doesn't look whether that is there or true to the sources.
execute_process(COMMAND ${CMAKE_COMMAND} --build ${CPACK_OVRIN_BUILD} --target ${targets}
  COMMAND_ERROR_IS_FATAL ANY)
set(CPACK_INSTALL_CMAKE_PROJECTS "")
foreach(component ${components})
  list(APPEND CPACK_INSTALL_CMAKE_PROJECTS ${CPACK_OVRIN_BUILD} OvrinMerge ${component} /)
endforeach()
