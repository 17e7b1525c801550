# SPDX-License-Identifier: MIT
# vrx_add_product_target(): the target "product" builds every library and program of the folders that were added so far,
# which is what staging takes.
function(vrx_targets_below folder targets)
  get_property(found DIRECTORY ${folder} PROPERTY BUILDSYSTEM_TARGETS)
  get_property(subfolders DIRECTORY ${folder} PROPERTY SUBDIRECTORIES)
  foreach(subfolder ${subfolders})
    vrx_targets_below(${subfolder} below)
    list(APPEND found ${below})
  endforeach()
  set(${targets} ${found} PARENT_SCOPE)
endfunction()

function(vrx_add_product_target)
  vrx_targets_below(${PROJECT_SOURCE_DIR} targets)
  set(built "")
  foreach(target ${targets})
    get_target_property(type ${target} TYPE)
    if(type MATCHES "EXECUTABLE|STATIC_LIBRARY|SHARED_LIBRARY|MODULE_LIBRARY|OBJECT_LIBRARY")
      list(APPEND built ${target})
    endif()
  endforeach()
  add_custom_target(product DEPENDS ${built})
endfunction()
