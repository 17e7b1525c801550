# SPDX-License-Identifier: MIT
# vrx_precompile(TARGET...): with VRX_PRECOMPILE, the libraries among the targets take the headers of the C++ library that
# most of them include from one precompiled file. It is made with the options of the current folder, which are theirs too.
# A file that does not fit a target's options is a warning, and the target reads the headers themselves.
option(VRX_PRECOMPILE "Compile the C++ library's headers once for the whole product" OFF)

# ccache does not see which macros a precompiled file looked at, and has to be allowed to use one.
if(VRX_PRECOMPILE AND VRX_CCACHE AND CMAKE_CXX_COMPILER_LAUNCHER STREQUAL VRX_CCACHE)
  set(CMAKE_CXX_COMPILER_LAUNCHER ${CMAKE_COMMAND} -E env CCACHE_SLOPPINESS=pch_defines,time_macros ${VRX_CCACHE})
endif()

function(vrx_precompile)
  if(NOT VRX_PRECOMPILE)
    return()
  endif()
  file(CONFIGURE OUTPUT ${PROJECT_BINARY_DIR}/precompiled.cpp CONTENT "" @ONLY)
  add_library(vrx_precompiled OBJECT ${PROJECT_BINARY_DIR}/precompiled.cpp)
  target_link_libraries(vrx_precompiled PRIVATE vrx_warnings)
  # Unlike its options, a folder's definitions are looked up when all folders are known; some are gone by then.
  get_directory_property(definitions COMPILE_DEFINITIONS)
  target_compile_definitions(vrx_precompiled PRIVATE ${definitions})
  target_precompile_headers(vrx_precompiled PRIVATE
    <algorithm> <array> <charconv> <chrono> <cstring> <filesystem> <functional> <map> <memory> <mutex> <optional> <set>
    <sstream> <string> <string_view> <system_error> <unordered_map> <utility> <vector>)
  foreach(target ${ARGN})
    get_target_property(type ${target} TYPE)
    if(NOT type STREQUAL EXECUTABLE) # it is compiled with -fPIE, and the file with -fPIC
      target_precompile_headers(${target} REUSE_FROM vrx_precompiled)
      target_compile_options(${target} PRIVATE $<$<CXX_COMPILER_ID:GNU>:-fpch-preprocess -Wno-error=invalid-pch>)
    endif()
  endforeach()
endfunction()
