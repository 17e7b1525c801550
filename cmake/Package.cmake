# SPDX-License-Identifier: MIT
# The mark of a deployed tree.
set(VRX_TREE_SERVER embedded)
if(PEGASUS_ROOT)
  set(VRX_TREE_SERVER "installed OpenPegasus")
  set(VRX_TREE_CONSUMER "consumer = ${PEGASUS_CONSUMER}")
endif()
configure_file(${CMAKE_CURRENT_LIST_DIR}/tree.conf.in ${PROJECT_BINARY_DIR}/tree.conf @ONLY)
install(FILES ${PROJECT_BINARY_DIR}/tree.conf DESTINATION ${VRX_DEST_PEGASUS})

# What a host's developer gets beside the deployed tree (headers, and a package for find_package), and the Debian
# package of both. Everything lies under one folder.
include(CMakePackageConfigHelpers)

set(VRX_DEST_CMAKE lib/cmake/pegasus-nsp)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/include/host DESTINATION include FILES_MATCHING PATTERN "*.h")
install(TARGETS vrx_contract EXPORT pegasus-nsp)
install(EXPORT pegasus-nsp NAMESPACE vrx:: FILE pegasus-nspTargets.cmake DESTINATION ${VRX_DEST_CMAKE})
configure_package_config_file(${CMAKE_CURRENT_LIST_DIR}/pegasus-nspConfig.cmake.in
  ${PROJECT_BINARY_DIR}/pegasus-nspConfig.cmake INSTALL_DESTINATION ${VRX_DEST_CMAKE} NO_CHECK_REQUIRED_COMPONENTS_MACRO)
write_basic_package_version_file(${PROJECT_BINARY_DIR}/pegasus-nspConfigVersion.cmake COMPATIBILITY SameMinorVersion)
install(FILES ${PROJECT_BINARY_DIR}/pegasus-nspConfig.cmake ${PROJECT_BINARY_DIR}/pegasus-nspConfigVersion.cmake
  DESTINATION ${VRX_DEST_CMAKE})

# /opt: a tree of its own; nothing of it goes where a system's or a user's files are.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGING_INSTALL_PREFIX /opt/pegasus-nsp)
set(CPACK_PACKAGE_DIRECTORY ${PROJECT_BINARY_DIR}/package)
set(CPACK_PACKAGE_CONTACT "The pegasus-nsp maintainers <root@localhost>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "Hardware vendors' CIM providers in a host's inventory: plug-in, server, host")
set(CPACK_STRIP_FILES ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION admin)
# The libraries' packages are looked up; ps is a program that the plug-in runs.
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${PROJECT_BINARY_DIR}/host/core ${PROJECT_BINARY_DIR}/host/inmem
  ${PROJECT_BINARY_DIR}/host/xmlparser ${PROJECT_BINARY_DIR}/pegasus ${PROJECT_BINARY_DIR}/pegasus/client)
set(CPACK_DEBIAN_PACKAGE_DEPENDS procps)
set(CPACK_DEBIAN_PACKAGE_CONTROL_EXTRA ${CMAKE_CURRENT_LIST_DIR}/postrm)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
include(CPack)
