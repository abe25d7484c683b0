# Reads every #include of every declared folder and fails when one names a folder its layer does
# not reach (see cmake/layers.cmake). Run as a build step:
#   cmake -DROOT=<source dir> -DTABLE=<layers/table.cmake> -DSTAMP=<stamp file> -P check_layers.cmake
# The folder an include names is found in this order:
#   1. A quoted path that exists next to the including file: the folder that file lies in
#      ("x.h", "internal/x.h", "../server/x.h").
#   2. Otherwise the path's first component, when it is a declared folder ("server/x.h").
#   3. Anything else (the standard library, ICU, gtest, …) is outside the layers and not checked.
cmake_minimum_required(VERSION 3.25)
include(${TABLE})

set(XAL_FAULTS "")

# The declared folder an include of `file` names, or "" (steps 1 to 3 above).
function(included_folder file path quoted out)
  set(folder "")
  get_filename_component(dir ${file} DIRECTORY)
  if(quoted AND EXISTS ${dir}/${path})
    get_filename_component(abs ${dir}/${path} ABSOLUTE)
    file(RELATIVE_PATH rel ${ROOT} ${abs})
    string(REGEX MATCH "^[^/]+" first "${rel}")
    if(NOT rel MATCHES "^\\.\\./" AND first IN_LIST XAL_LAYERS)
      set(folder ${first})
    endif()
  elseif(path MATCHES "^([^/]+)/" AND CMAKE_MATCH_1 IN_LIST XAL_LAYERS)
    set(folder ${CMAKE_MATCH_1})
  endif()
  set(${out} "${folder}" PARENT_SCOPE)
endfunction()

# The line number of the first line of `file` that contains `text`.
function(line_of file text out)
  file(STRINGS ${file} lines)
  set(n 0)
  foreach(line IN LISTS lines)
    math(EXPR n "${n} + 1")
    string(FIND "${line}" "${text}" at)
    if(at GREATER -1)
      break()
    endif()
  endforeach()
  set(${out} ${n} PARENT_SCOPE)
endfunction()

set(include_re "^[ \t]*#[ \t]*include[ \t]*([<\"])([^>\"]+)[>\"]")
foreach(layer ${XAL_LAYERS})
  set(allowed ${layer} ${XAL_REACH_${layer}})
  foreach(file ${XAL_FILES_${layer}})
    file(STRINGS ${file} includes REGEX "${include_re}")
    foreach(line IN LISTS includes)
      string(REGEX MATCH "${include_re}" _ "${line}")
      set(path "${CMAKE_MATCH_2}")
      set(quoted OFF)
      if(CMAKE_MATCH_1 STREQUAL "\"")
        set(quoted ON)
      endif()
      included_folder(${file} "${path}" ${quoted} folder)
      if(folder AND NOT folder IN_LIST allowed)
        line_of(${file} "${path}" n)
        file(RELATIVE_PATH rel ${ROOT} ${file})
        list(TRANSFORM allowed APPEND "/" OUTPUT_VARIABLE reach)
        string(REPLACE ";" ", " reach "${reach}")
        string(APPEND XAL_FAULTS "${rel}:${n}: error: ${layer}/ may not include \"${path}\": ${folder}/ is not "
                                 "below it (${layer}/ may use only ${reach})\n")
      endif()
    endforeach()
  endforeach()
endforeach()

if(XAL_FAULTS)
  file(REMOVE ${STAMP})
  message(NOTICE "${XAL_FAULTS}")  # one unwrapped line each, as a compiler writes them
  message(FATAL_ERROR "includes across the layers (cmake/layers.cmake)")
endif()
file(TOUCH ${STAMP})
