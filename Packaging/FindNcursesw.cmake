# Finds the ncurses of wide characters: Ncursesw::Ncursesw. A target with the property LINK_STATICALLY gets the archives
# in place of the shared libraries, where there are any.
set(CURSES_NEED_WIDE TRUE)
find_package(Curses)
find_library(Ncursesw_STATIC_LIBRARY libncursesw.a)
# Some systems have the part that knows the terminals in a library of its own.
find_library(Ncursesw_STATIC_TERMINALS NAMES libtinfo.a libtinfow.a)
mark_as_advanced(Ncursesw_STATIC_LIBRARY Ncursesw_STATIC_TERMINALS)
include(FindPackageHandleStandardArgs)
find_package_handle_standard_args(Ncursesw REQUIRED_VARS CURSES_LIBRARIES CURSES_INCLUDE_DIRS)
if(Ncursesw_FOUND AND NOT TARGET Ncursesw::Ncursesw)
  set(ovrin_archives ${Ncursesw_STATIC_LIBRARY})
  if(Ncursesw_STATIC_TERMINALS)
    list(APPEND ovrin_archives ${Ncursesw_STATIC_TERMINALS})
  endif()
  set(ovrin_static "$<BOOL:$<TARGET_PROPERTY:LINK_STATICALLY>>")
  add_library(Ncursesw::Ncursesw INTERFACE IMPORTED)
  set_target_properties(Ncursesw::Ncursesw PROPERTIES
    INTERFACE_LINK_LIBRARIES "$<${ovrin_static}:${ovrin_archives}>;$<$<NOT:${ovrin_static}>:${CURSES_LIBRARIES}>"
    INTERFACE_INCLUDE_DIRECTORIES "${CURSES_INCLUDE_DIRS}")
endif()
