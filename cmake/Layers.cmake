# SPDX-License-Identifier: MIT
# vrx_layer(<target> <folder> [PRIVATE]): <target>, and what links it unless PRIVATE, may include the folder's headers as
# "<folder>/X.h".
# Each folder gets an include root of its own under the build folder: a link to the folder, and links to the .clang-tidy
# files above it, so that clang-tidy judges its headers by them. A target sees the layers that it links and no others; an
# include of a higher layer does not compile. tools/check layers compares each include with the table of layers.
function(vrx_layer target folder)
  string(REPLACE "/" "_" name ${folder})
  set(root ${PROJECT_BINARY_DIR}/layers/${name})
  cmake_path(GET folder PARENT_PATH above)
  file(MAKE_DIRECTORY ${root}/${above})
  file(CREATE_LINK ${PROJECT_SOURCE_DIR}/${folder} ${root}/${folder} SYMBOLIC)
  while(above)
    if(EXISTS ${PROJECT_SOURCE_DIR}/${above}/.clang-tidy)
      file(CREATE_LINK ${PROJECT_SOURCE_DIR}/${above}/.clang-tidy ${root}/${above}/.clang-tidy SYMBOLIC)
    endif()
    cmake_path(GET above PARENT_PATH above)
  endwhile()
  get_target_property(type ${target} TYPE)
  if(type STREQUAL INTERFACE_LIBRARY)
    target_include_directories(${target} INTERFACE $<BUILD_INTERFACE:${root}>)
  elseif("PRIVATE" IN_LIST ARGN)
    target_include_directories(${target} PRIVATE ${root})
  else()
    target_include_directories(${target} PUBLIC $<BUILD_INTERFACE:${root}>)
  endif()
endfunction()
