# Finds the ncurses of wide characters: Ncursesw::Ncursesw. A target with the property LINK_STATICALLY gets the archives
# in place of the shared libraries, where there are any.
find_path(Ncursesw_INCLUDE_DIR curses.h PATH_SUFFIXES ncursesw)
find_library(Ncursesw_LIBRARY ncursesw)
find_library(Ncursesw_STATIC_LIBRARY libncursesw.a)
# Most systems have the part that knows the terminals in a library of its own.
find_library(Ncursesw_TERMINALS NAMES tinfo tinfow)
find_library(Ncursesw_STATIC_TERMINALS NAMES libtinfo.a libtinfow.a)
mark_as_advanced(Ncursesw_INCLUDE_DIR Ncursesw_LIBRARY Ncursesw_STATIC_LIBRARY Ncursesw_TERMINALS
  Ncursesw_STATIC_TERMINALS)
include(FindPackageHandleStandardArgs)
find_package_handle_standard_args(Ncursesw REQUIRED_VARS Ncursesw_LIBRARY Ncursesw_INCLUDE_DIR)
if(Ncursesw_FOUND AND NOT TARGET Ncursesw::Ncursesw)
  set(ovrin_shared ${Ncursesw_LIBRARY})
  set(ovrin_archives ${Ncursesw_STATIC_LIBRARY})
  if(Ncursesw_TERMINALS)
    list(APPEND ovrin_shared ${Ncursesw_TERMINALS})
    list(APPEND ovrin_archives ${Ncursesw_STATIC_TERMINALS})
  endif()
  set(ovrin_static "$<BOOL:$<TARGET_PROPERTY:LINK_STATICALLY>>")
  add_library(Ncursesw::Ncursesw INTERFACE IMPORTED)
  set_target_properties(Ncursesw::Ncursesw PROPERTIES
    INTERFACE_LINK_LIBRARIES "$<IF:${ovrin_static},${ovrin_archives},${ovrin_shared}>"
    INTERFACE_INCLUDE_DIRECTORIES "${Ncursesw_INCLUDE_DIR}")
endif()
