# find_package(OvrinYAML) brings the target OvrinYAML::OvrinYAML, with libyaml and threads behind it.
include(CMakeFindDependencyMacro)
set(ovrin_module_path "${CMAKE_MODULE_PATH}")
list(APPEND CMAKE_MODULE_PATH "${CMAKE_CURRENT_LIST_DIR}")
find_dependency(Threads)
find_dependency(LibYAML)
set(CMAKE_MODULE_PATH "${ovrin_module_path}")
include("${CMAKE_CURRENT_LIST_DIR}/OvrinYAMLTargets.cmake")
