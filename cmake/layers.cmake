# The layers of the source tree. Every folder declares the folders it uses directly (DEPS), and only
# folders declared before it, so the layers cannot form a cycle. A folder may use itself and what its
# declarations reach, nothing else. The build enforces that twice:
#   1. Includes: before anything compiles, cmake/check_layers.cmake reads every #include of every
#      declared folder and fails the build when one names a folder outside the reach.
#   2. Calls: each layer of the component is linked on its own with exactly the objects it reaches,
#      undefined symbols refused, so a call into a higher layer fails to link even when the caller
#      declared the function by hand. The component and the host library link the same way.
# A layer may be declared before its folder exists (or while it has no sources): it then has no
# target, and the layers above it link what it reaches directly.

option(XAL_CHECK_LAYERS "Fail the build on an include or call across the layers" ON)
set_property(GLOBAL PROPERTY XAL_LAYERS)

# Declares folder `name`, the folders it uses directly (DEPS) and the outside libraries it links (LIBS).
function(xal_layer name)
  cmake_parse_arguments(L "" "" "DEPS;LIBS" ${ARGN})
  get_property(known GLOBAL PROPERTY XAL_LAYERS)
  foreach(d ${L_DEPS})
    if(NOT d IN_LIST known)
      message(FATAL_ERROR "layer ${name} uses ${d}, which is not declared below it")
    endif()
  endforeach()
  set_property(GLOBAL APPEND PROPERTY XAL_LAYERS ${name})
  set_property(GLOBAL PROPERTY XAL_LAYER_DEPS_${name} ${L_DEPS})
  set_property(GLOBAL PROPERTY XAL_LAYER_LIBS_${name} ${L_LIBS})
endfunction()

# The layers `name` reaches through its declarations, itself excluded.
function(xal_layer_reach name out)
  set(reach)
  get_property(todo GLOBAL PROPERTY XAL_LAYER_DEPS_${name})
  while(todo)
    list(POP_FRONT todo d)
    if(NOT d IN_LIST reach)
      list(APPEND reach ${d})
      get_property(more GLOBAL PROPERTY XAL_LAYER_DEPS_${d})
      list(APPEND todo ${more})
    endif()
  endwhile()
  set(${out} ${reach} PARENT_SCOPE)
endfunction()

# The object targets and outside libraries of `name` and of everything it reaches.
function(xal_layer_parts name objects_out libs_out)
  xal_layer_reach(${name} reach)
  set(objects)
  set(libs)
  foreach(d ${name} ${reach})
    if(TARGET xal_${d})
      list(APPEND objects xal_${d})
    endif()
    get_property(l GLOBAL PROPERTY XAL_LAYER_LIBS_${d})
    list(APPEND libs ${l})
  endforeach()
  list(REMOVE_DUPLICATES libs)
  set(${objects_out} ${objects} PARENT_SCOPE)
  set(${libs_out} ${libs} PARENT_SCOPE)
endfunction()

# A folder of the component: a layer, and an object library when the folder has sources.
function(xal_folder name)
  xal_layer(${name} ${ARGN})
  file(GLOB _src CONFIGURE_DEPENDS ${PROJECT_SOURCE_DIR}/${name}/*.cpp ${PROJECT_SOURCE_DIR}/${name}/internal/*.cpp)
  if(NOT _src)
    return()
  endif()
  add_library(xal_${name} OBJECT ${_src})
  target_include_directories(xal_${name} PUBLIC
    $<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}>
    $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}/xalscript>
    $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}>)
  xal_layer_parts(${name} objects libs)
  list(REMOVE_ITEM objects xal_${name})
  target_link_libraries(xal_${name} PUBLIC ${objects} ${libs})
  set_property(GLOBAL APPEND PROPERTY XAL_FOLDERS ${name})
endfunction()

# Sanitizer runtimes leave symbols to the executable, so the link check needs a plain build.
function(xal_refuse_undefined target)
  if(XAL_CHECK_LAYERS AND NOT CMAKE_CXX_FLAGS MATCHES "-fsanitize")
    target_link_options(${target} PRIVATE LINKER:--no-undefined)
  endif()
endfunction()

# Step 2: links every component layer that has a target on its own with what it reaches (the top
# one is the library itself).
function(xal_check_layer_calls)
  if(NOT XAL_CHECK_LAYERS OR CMAKE_CXX_FLAGS MATCHES "-fsanitize")
    return()
  endif()
  get_property(folders GLOBAL PROPERTY XAL_FOLDERS)
  list(LENGTH folders all)
  foreach(f ${folders})
    xal_layer_parts(${f} objects libs)
    list(LENGTH objects n)
    if(n EQUAL all)
      continue()  # the whole component: the library itself is linked this way
    endif()
    list(TRANSFORM objects REPLACE "(.+)" "$<TARGET_OBJECTS:\\1>")
    add_library(xal_layer_${f} SHARED ${objects})
    target_link_libraries(xal_layer_${f} PRIVATE ${libs})
    set_target_properties(xal_layer_${f} PROPERTIES LIBRARY_OUTPUT_DIRECTORY ${CMAKE_BINARY_DIR}/layers)
    xal_refuse_undefined(xal_layer_${f})
  endforeach()
endfunction()

# Step 1: the include check, run before any target in `ARGN` compiles.
function(xal_check_layer_includes)
  if(NOT XAL_CHECK_LAYERS)
    return()
  endif()
  get_property(layers GLOBAL PROPERTY XAL_LAYERS)
  set(table "set(XAL_LAYERS \"${layers}\")\n")
  set(all_files)
  foreach(l ${layers})
    xal_layer_reach(${l} reach)
    file(GLOB_RECURSE files CONFIGURE_DEPENDS ${PROJECT_SOURCE_DIR}/${l}/*.h ${PROJECT_SOURCE_DIR}/${l}/*.hpp
                                              ${PROJECT_SOURCE_DIR}/${l}/*.cpp ${PROJECT_SOURCE_DIR}/${l}/*.inc)
    string(APPEND table "set(XAL_REACH_${l} \"${reach}\")\nset(XAL_FILES_${l} \"${files}\")\n")
    list(APPEND all_files ${files})
  endforeach()
  set(dir ${CMAKE_BINARY_DIR}/layers)
  file(CONFIGURE OUTPUT ${dir}/table.cmake CONTENT "${table}" @ONLY)
  add_custom_command(OUTPUT ${dir}/includes.stamp
    COMMAND ${CMAKE_COMMAND} -DROOT=${PROJECT_SOURCE_DIR} -DTABLE=${dir}/table.cmake -DSTAMP=${dir}/includes.stamp
            -P ${PROJECT_SOURCE_DIR}/cmake/check_layers.cmake
    DEPENDS ${all_files} ${dir}/table.cmake ${PROJECT_SOURCE_DIR}/cmake/check_layers.cmake
    COMMENT "Checking every folder's includes against its layer")
  add_custom_target(xal_layer_includes ALL DEPENDS ${dir}/includes.stamp)
  foreach(t ${ARGN})
    add_dependencies(${t} xal_layer_includes)
  endforeach()
endfunction()
