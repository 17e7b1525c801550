# SPDX-License-Identifier: MIT
# The mark of a deployed tree.
set(VRX_TREE_SERVER embedded)
if(PEGASUS_ROOT)
  set(VRX_TREE_SERVER "installed OpenPegasus")
  set(VRX_TREE_CONSUMER "consumer = ${PEGASUS_CONSUMER}")
endif()
configure_file(${CMAKE_CURRENT_LIST_DIR}/tree.conf.in ${PROJECT_BINARY_DIR}/tree.conf @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/tree.conf DESTINATION ${VRX_DEST_PEGASUS})

# What the developers of hosts and vendors get beside the deployed tree: headers, and a package for find_package. The
# Debian packages are made of the same install rules (tools/package, debian/).
include(CMakePackageConfigHelpers)

set(VRX_DEST_CMAKE lib/cmake/pegasus-nsp)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/host DESTINATION include FILES_MATCHING PATTERN "*.h")
install(DIRECTORY ${PROJECT_SOURCE_DIR}/pegasus/cmpi/include/cmpi DESTINATION include FILES_MATCHING PATTERN "*.h")
install(TARGETS vrx_contract EXPORT pegasus-nsp)
install(EXPORT pegasus-nsp NAMESPACE vrx:: FILE pegasus-nspTargets.cmake DESTINATION ${VRX_DEST_CMAKE})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/pegasus-nspConfigVersion.cmake COMPATIBILITY SameMinorVersion)
install(FILES ${CMAKE_CURRENT_LIST_DIR}/pegasus-nspConfig.cmake ${PROJECT_BINARY_DIR}/pegasus-nspConfigVersion.cmake
  DESTINATION ${VRX_DEST_CMAKE})
