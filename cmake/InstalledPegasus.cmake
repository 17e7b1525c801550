# SPDX-License-Identifier: MIT
# pegasus::client from an installed OpenPegasus under PEGASUS_ROOT: the same target that the embedded stack defines.
find_path(PEGASUS_INCLUDE_DIR Pegasus/Client/CIMClient.h
  HINTS ${PEGASUS_ROOT}/include ${PEGASUS_ROOT}/src ${PEGASUS_ROOT} NO_DEFAULT_PATH REQUIRED)
foreach(library pegclient pegcommon)
  find_library(PEGASUS_${library}_LIBRARY ${library}
    HINTS ${PEGASUS_ROOT}/lib ${PEGASUS_ROOT}/lib64 ${PEGASUS_ROOT}/lib/x86_64-linux-gnu NO_DEFAULT_PATH REQUIRED)
endforeach()

add_library(pegasus_client INTERFACE)
add_library(pegasus::client ALIAS pegasus_client)
target_include_directories(pegasus_client SYSTEM INTERFACE ${PEGASUS_INCLUDE_DIR})
target_compile_definitions(pegasus_client INTERFACE PEGASUS_PLATFORM_LINUX_X86_64_GNU)
target_link_libraries(pegasus_client INTERFACE ${PEGASUS_pegclient_LIBRARY} ${PEGASUS_pegcommon_LIBRARY})

# The programs are copied into the staged tree; the libraries stay where they are installed.
set(CMAKE_INSTALL_RPATH_USE_LINK_PATH TRUE PARENT_SCOPE)
foreach(program cimserver cimmof cimconfig cimprovagt)
  find_program(PEGASUS_${program} ${program} HINTS ${PEGASUS_ROOT}/bin ${PEGASUS_ROOT}/sbin NO_DEFAULT_PATH)
  if(PEGASUS_${program})
    install(PROGRAMS ${PEGASUS_${program}} DESTINATION ${VRX_DEST_PEGASUS_BIN})
  elseif(NOT program STREQUAL cimprovagt) # only some builds of OpenPegasus have it
    message(FATAL_ERROR "${PEGASUS_ROOT} holds no program ${program}")
  endif()
endforeach()

# That server loads these two from R/pegasus/lib under their plain names; whatever else they need they find themselves.
foreach(manager CMPIProviderManager DefaultProviderManager)
  file(GLOB candidates ${PEGASUS_ROOT}/lib/lib${manager}.so* ${PEGASUS_ROOT}/lib64/lib${manager}.so*
    ${PEGASUS_ROOT}/lib/x86_64-linux-gnu/lib${manager}.so*)
  if(NOT candidates)
    message(FATAL_ERROR "${PEGASUS_ROOT} holds no library lib${manager}.so, without which its server loads no provider")
  endif()
  list(GET candidates 0 library)
  file(REAL_PATH ${library} library)
  install(FILES ${library} DESTINATION ${VRX_DEST_PEGASUS_LIB} RENAME lib${manager}.so)
endforeach()

# Of itself it listens on all interfaces.
file(CONFIGURE OUTPUT ${CMAKE_CURRENT_BINARY_DIR}/cimserver_planned.conf CONTENT "listenAddress=127.0.0.1\n" @ONLY)
install(FILES ${CMAKE_CURRENT_BINARY_DIR}/cimserver_planned.conf DESTINATION ${VRX_DEST_PEGASUS})
