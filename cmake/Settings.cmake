# SPDX-License-Identifier: MIT
# Compiler settings that all targets share, and the folders of the staged tree.
include(GNUInstallDirs)

set(CMAKE_CXX_STANDARD 17)
set(CMAKE_CXX_STANDARD_REQUIRED ON)
set(CMAKE_CXX_EXTENSIONS OFF)
set(CMAKE_C_STANDARD 11)
set(CMAKE_C_EXTENSIONS OFF)
set(CMAKE_POSITION_INDEPENDENT_CODE ON)
set(CMAKE_EXPORT_COMPILE_COMMANDS ON)
set(THREADS_PREFER_PTHREAD_FLAG ON)
find_package(Threads REQUIRED)

if(NOT CMAKE_BUILD_TYPE)
  set(CMAKE_BUILD_TYPE RelWithDebInfo CACHE STRING "" FORCE)
endif()

find_program(VRX_CCACHE ccache)
if(VRX_CCACHE AND NOT CMAKE_CXX_COMPILER_LAUNCHER)
  set(CMAKE_C_COMPILER_LAUNCHER ${VRX_CCACHE})
  set(CMAKE_CXX_COMPILER_LAUNCHER ${VRX_CCACHE})
endif()

# Warnings, as errors: a target of ours links vrx_warnings (PRIVATE).
add_library(vrx_warnings INTERFACE)
target_compile_options(vrx_warnings INTERFACE
  -Wall -Wextra -Werror -Wshadow -Wconversion -Wformat=2
  $<$<COMPILE_LANGUAGE:CXX>:-Wnon-virtual-dtor -Woverloaded-virtual -Wold-style-cast>)
target_compile_definitions(vrx_warnings INTERFACE _GNU_SOURCE)
# GCC's flow analysis gives false warnings in code that the sanitizers have instrumented, mostly in Boost's headers.
if(CMAKE_CXX_FLAGS MATCHES "-fsanitize" AND CMAKE_CXX_COMPILER_ID STREQUAL "GNU")
  target_compile_options(vrx_warnings INTERFACE -Wno-maybe-uninitialized)
endif()

# vrx_seldom_run(TARGET...): code that runs once, or once for each command or file. It is compiled with -O1, which takes up
# to a third less time than -O2. What works for each instance, value or request stays at -O2.
function(vrx_seldom_run)
  foreach(target ${ARGN})
    target_compile_options(${target} PRIVATE $<$<NOT:$<CONFIG:Debug>>:-O1>)
  endforeach()
endfunction()

# A library or program of ours: undefined symbols are link errors. Under a sanitizer they are allowed, because the
# sanitizer's runtime is in the executable.
add_library(vrx_strict_link INTERFACE)
if(NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
  target_link_options(vrx_strict_link INTERFACE -Wl,-z,defs)
endif()

# The deployed tree R: R/vrxhost, R/lib*.so, R/pegasus/{tree.conf,bin,lib,provider,pegSchema}.
set(VRX_DEST_ROOT .)
set(VRX_DEST_PEGASUS pegasus)
set(VRX_DEST_PEGASUS_BIN pegasus/bin)
set(VRX_DEST_PEGASUS_LIB pegasus/lib)
set(VRX_DEST_PROVIDER pegasus/provider)
set(VRX_DEST_SCHEMA pegasus/pegSchema)
set(CMAKE_BUILD_WITH_INSTALL_RPATH OFF)
# vrxhost and the server refuse a tree that others may write, and everybody may read one, so the modes must not depend on
# the umask of who stages it. Files get theirs (644, 755) from install(); a folder would be subject to the umask.
install(CODE [[
  foreach(folder "" include include/cmpi include/host lib lib/cmake lib/cmake/pegasus-nsp pegasus pegasus/bin pegasus/lib
                 pegasus/pegSchema pegasus/pegSchema/PG_InterOp pegasus/pegSchema/PG_Internal
                 pegasus/provider pegasus/provider/linux
                 share share/examples share/examples/conformance share/examples/example-vendor share/examples/fleet share/examples/fleet/bin
                 share/examples/fleet/postgresql share/examples/fleet/rsyslog share/examples/fleet/systemd)
    set(path "$ENV{DESTDIR}${CMAKE_INSTALL_PREFIX}/${folder}")
    if(NOT EXISTS "${path}" OR folder MATCHES "^pegasus")
      file(MAKE_DIRECTORY "${path}")
      file(CHMOD "${path}" PERMISSIONS
        OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
    endif()
  endforeach()]])
