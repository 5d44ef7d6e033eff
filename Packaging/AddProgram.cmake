# ovrin_add_program(NAME MAIN LIBRARY): a program, and NAME-static, which is the same for the archive: it asks a
# machine for nothing but a kernel. That one is made only where it is wanted.

# Addresses that can't be guessed, where the compiler makes such code by itself.
include(CheckCXXSourceCompiles)
set(OVRIN_STATIC_LINK "")
foreach(form -static-pie -static)
  if(LibYAML_STATIC_LIBRARY AND Ncursesw_STATIC_LIBRARY AND NOT OVRIN_SANITIZE AND NOT OVRIN_STATIC_LINK)
    string(MAKE_C_IDENTIFIER OVRIN_LINKS${form} check)
    set(CMAKE_REQUIRED_LINK_OPTIONS ${form})
    set(CMAKE_REQUIRED_LIBRARIES ${LibYAML_STATIC_LIBRARY})
    set(CMAKE_REQUIRED_INCLUDES ${LibYAML_INCLUDE_DIR})
    check_cxx_source_compiles("#include <iostream>
      #include <yaml.h>
      int main() { std::cout << yaml_get_version_string() << \"\"; }" ${check})
    if(${check})
      set(OVRIN_STATIC_LINK ${form})
    endif()
  endif()
endforeach()
unset(CMAKE_REQUIRED_LINK_OPTIONS)
unset(CMAKE_REQUIRED_LIBRARIES)
unset(CMAKE_REQUIRED_INCLUDES)

function(ovrin_add_program name main library)
  add_executable(${name} ${main})
  target_link_libraries(${name} PRIVATE ${library})
  # Both programs look up the data files beside themselves.
  set_target_properties(${name} PROPERTIES RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR})
  if(NOT OVRIN_SANITIZE)
    # A merge of small files takes a few milliseconds: loading and binding these libraries is a fifth of it.
    target_link_options(${name} PRIVATE -static-libstdc++ -static-libgcc)
  endif()

  add_executable(${name}-static EXCLUDE_FROM_ALL ${main})
  target_link_libraries(${name}-static PRIVATE ${library})
  set_target_properties(${name}-static PROPERTIES LINK_STATICALLY ON
    OUTPUT_NAME ${name} RUNTIME_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/static)
  # The linker warns of functions that need shared libraries of the system when they run, for users and hosts.
  target_link_options(${name}-static PRIVATE ${OVRIN_STATIC_LINK} -Wl,--fatal-warnings)
endfunction()

# ovrin_link_quickly(NAME): a program of which speed doesn't matter does without interprocedural optimisation.
function(ovrin_link_quickly name)
  set_target_properties(${name} PROPERTIES INTERPROCEDURAL_OPTIMIZATION OFF)
  if(ovrin_fat_objects)
    target_link_options(${name} PRIVATE -fno-lto)
  endif()
endfunction()
