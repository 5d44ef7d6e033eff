# Finds libyaml, whose packages bring no file for CMake: LibYAML::LibYAML. A target with the property LINK_STATICALLY
# gets the archive in place of the shared library, where there is one.
find_path(LibYAML_INCLUDE_DIR yaml.h)
find_library(LibYAML_LIBRARY yaml)
find_library(LibYAML_STATIC_LIBRARY libyaml.a)
mark_as_advanced(LibYAML_INCLUDE_DIR LibYAML_LIBRARY LibYAML_STATIC_LIBRARY)
include(FindPackageHandleStandardArgs)
find_package_handle_standard_args(LibYAML REQUIRED_VARS LibYAML_LIBRARY LibYAML_INCLUDE_DIR)
if(LibYAML_FOUND AND NOT TARGET LibYAML::LibYAML)
  set(ovrin_static "$<BOOL:$<TARGET_PROPERTY:LINK_STATICALLY>>")
  add_library(LibYAML::LibYAML INTERFACE IMPORTED)
  set_target_properties(LibYAML::LibYAML PROPERTIES
    INTERFACE_LINK_LIBRARIES "$<IF:${ovrin_static},${LibYAML_STATIC_LIBRARY},${LibYAML_LIBRARY}>"
    INTERFACE_INCLUDE_DIRECTORIES "${LibYAML_INCLUDE_DIR}")
endif()
