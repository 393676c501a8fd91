# SPDX-License-Identifier: GPL-3.0-or-later
# vaelo_layer(NAME USES other...): a static library of the folder NAME that sees the standard library and the named folders,
# nothing else. The check runs before its first source is compiled, so that a forbidden header fails the build.
find_package(Python3 REQUIRED COMPONENTS Interpreter)

function(vaelo_layer name)
  cmake_parse_arguments(LAYER "" "" "USES" ${ARGN})
  file(GLOB_RECURSE sources CONFIGURE_DEPENDS ${CMAKE_SOURCE_DIR}/${name}/*.cpp)
  file(GLOB_RECURSE headers CONFIGURE_DEPENDS ${CMAKE_SOURCE_DIR}/${name}/*.h)
  set(stamp ${CMAKE_BINARY_DIR}/layers/${name}.stamp)
  add_custom_command(OUTPUT ${stamp}
    COMMAND Python3::Interpreter ${CMAKE_SOURCE_DIR}/tools/check_layers.py ${CMAKE_SOURCE_DIR} ${name} ${LAYER_USES}
    COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_BINARY_DIR}/layers
    COMMAND ${CMAKE_COMMAND} -E touch ${stamp}
    DEPENDS ${sources} ${headers} ${CMAKE_SOURCE_DIR}/tools/check_layers.py
    COMMENT "Checking what ${name}/ includes")
  add_custom_target(check_${name} DEPENDS ${stamp})
  if(NOT sources)
    set(placeholder ${CMAKE_BINARY_DIR}/layers/${name}_empty.cpp)
    file(WRITE ${placeholder} "// ${name}/ holds headers only\n")
    set(sources ${placeholder})
  endif()
  add_library(vaelo_${name} STATIC ${sources})
  add_dependencies(vaelo_${name} check_${name})
  target_include_directories(vaelo_${name} PUBLIC ${CMAKE_SOURCE_DIR})
  target_link_libraries(vaelo_${name} PRIVATE vaelo_warnings)
  foreach(used ${LAYER_USES})
    target_link_libraries(vaelo_${name} PUBLIC vaelo_${used})
  endforeach()
endfunction()
