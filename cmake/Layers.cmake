# vrx_layer(<target> <folder> [PRIVATE]): <target>, and what links it unless PRIVATE, may include the folder's headers as
# "<folder>/X.h".
# Each folder gets an include root of its own, a link to it under the build folder. A target so sees the layers that it
# links and no others: an include of a higher layer does not compile. tools/check layers looks at the rest.
function(vrx_layer target folder)
  cmake_path(GET folder PARENT_PATH parent)
  string(REPLACE "/" "_" name ${folder})
  set(root ${PROJECT_BINARY_DIR}/layers/${name})
  file(MAKE_DIRECTORY ${root}/${parent})
  file(CREATE_LINK ${PROJECT_SOURCE_DIR}/${folder} ${root}/${folder} SYMBOLIC)
  get_target_property(type ${target} TYPE)
  if(type STREQUAL INTERFACE_LIBRARY)
    target_include_directories(${target} INTERFACE $<BUILD_INTERFACE:${root}>)
  elseif("PRIVATE" IN_LIST ARGN)
    target_include_directories(${target} PRIVATE ${root})
  else()
    target_include_directories(${target} PUBLIC $<BUILD_INTERFACE:${root}>)
  endif()
endfunction()
