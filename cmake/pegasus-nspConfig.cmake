# The host framework's contract and the reference host's libraries: vrx::contract, vrx::core, vrx::inmem, vrx::xmlparser;
# vrx::cmpi has the C headers for vendors' providers, as <cmpi/cmpidt.h> and as <cmpidt.h>.
# pegasus-nsp_TREE is the deployed tree, pegasus-nsp_PLUGIN the plug-in in it, which a host loads and never links.
include(CMakeFindDependencyMacro)
find_dependency(Boost 1.74)
# A system's lib/cmake has a link to the tree's files, which are found from the tree.
get_filename_component(pegasus-nsp_TREE ${CMAKE_CURRENT_LIST_FILE} REALPATH)
get_filename_component(pegasus-nsp_TREE ${pegasus-nsp_TREE}/../../../.. ABSOLUTE)
include(${pegasus-nsp_TREE}/lib/cmake/pegasus-nsp/pegasus-nspTargets.cmake)
if(NOT TARGET vrx::cmpi)
  add_library(vrx::cmpi INTERFACE IMPORTED)
  target_include_directories(vrx::cmpi INTERFACE ${pegasus-nsp_TREE}/include ${pegasus-nsp_TREE}/include/cmpi)
endif()
set(pegasus-nsp_PLUGIN ${pegasus-nsp_TREE}/libpegasus.nsp.so)
