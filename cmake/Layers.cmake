# Layers: a target sees the headers of its own folder and of the folders that it is given, and of no other.
#
# Headers are included by folder ("host/scene/Module.h"). Each folder is reached through a directory of its
# own that holds one link, build/include/FOLDER/FOLDER (a folder inside another: build/include/host.keys/host/keys),
# so a folder that a target was not given is not found by the compiler. Paths that climb ("../") would get around that and are refused at configuration time.

function(talix_layer_root folder out)
  string(REPLACE "/" "." name ${folder})
  set(root ${CMAKE_BINARY_DIR}/include/${name})
  get_filename_component(above ${root}/${folder} DIRECTORY)
  file(MAKE_DIRECTORY ${above})
  if(NOT EXISTS ${root}/${folder})
    file(CREATE_LINK ${CMAKE_SOURCE_DIR}/${folder} ${root}/${folder} SYMBOLIC)
  endif()
  set(${out} ${root} PARENT_SCOPE)
endfunction()

# The sources below FOLDER, checked for climbing includes.
function(talix_layer_sources folder out)
  file(GLOB_RECURSE sources CONFIGURE_DEPENDS ${CMAKE_SOURCE_DIR}/${folder}/*.cpp)
  file(GLOB_RECURSE headers CONFIGURE_DEPENDS ${CMAKE_SOURCE_DIR}/${folder}/*.h)
  foreach(file IN LISTS sources headers)
    file(STRINGS ${file} climbing REGEX "^[ \t]*#[ \t]*include[ \t]*\"[^\"]*\\.\\./")
    if(climbing)
      message(FATAL_ERROR "${file}: includes go by folder, not by ..: ${climbing}")
    endif()
  endforeach()
  set(${out} ${sources} PARENT_SCOPE)
endfunction()

# talix_layer(TARGET SEES folder...): gives TARGET the headers of these folders.
function(talix_layer target)
  cmake_parse_arguments(LAYER "" "" "SEES" ${ARGN})
  foreach(folder IN LISTS LAYER_SEES)
    talix_layer_root(${folder} root)
    target_include_directories(${target} PRIVATE ${root})
  endforeach()
endfunction()
