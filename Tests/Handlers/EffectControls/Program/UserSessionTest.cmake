cmake_minimum_required(VERSION 3.25)

# Runs an automation script of user actions on the demo project and checks what it left:
# the program ran cleanly (no warning, so every click reached a control and every answer a
# popup), no dump recorded a debug assertion, and the expectations below hold.
#   -DPROGRAM=path            the effectcontrols executable
#   -DRUN_PROGRAM=path        Tests/Host/Shell/Program/RunProgram.cmake
#   -DSCRIPT=path             the .ecs script; it writes *.dump.json and *.project.json
#   -DOUT=dir                 output folder
#   -DEXPECT_UNDO=f=N,M       (optional, repeatable with ;) dump f has N steps done, M undone
#   -DEXPECT_LAST=f=name      (optional) the last step done in dump f is `name`
#   -DEXPECT_VALUE=f:a/b=v    (optional, repeatable) the value at path a/b of dump f is v
#   -DEXPECT_SAME=a=b         (optional, repeatable) files a and b under OUT are identical
#   -DEXPECT_DIFFERENT=a=b    (optional, repeatable) files a and b under OUT differ
#   -DALLOW_WARNINGS=1        (optional) clicks that reach nothing are expected (random input)
set(ARGS "--headless;--size;1100x620;--script;${SCRIPT};--out;<out>")
set(EXPECT_EXIT 0)
include(${RUN_PROGRAM})
if(NOT ALLOW_WARNINGS AND err MATCHES "warning:")
  message(FATAL_ERROR "the run warned: a click or an answer went nowhere")
endif()

function(read_dump out name)
  if(NOT EXISTS "${OUT}/${name}")
    message(FATAL_ERROR "missing output ${OUT}/${name}")
  endif()
  file(READ "${OUT}/${name}" json)
  set(${out} "${json}" PARENT_SCOPE)
endfunction()

file(GLOB dumps RELATIVE "${OUT}" "${OUT}/*.dump.json")
if(NOT dumps)
  message(FATAL_ERROR "the script wrote no dump")
endif()
foreach(name IN LISTS dumps)
  read_dump(json ${name})
  string(JSON count LENGTH "${json}" assertions)
  if(NOT count EQUAL 0)
    string(JSON first GET "${json}" assertions 0)
    message(FATAL_ERROR "${name} recorded ${count} debug assertion(s), the first: ${first}")
  endif()
endforeach()

foreach(check IN LISTS EXPECT_UNDO)
  string(REGEX MATCH "^([^=]+)=([0-9]+),([0-9]+)$" _ "${check}")
  set(name ${CMAKE_MATCH_1})
  set(done ${CMAKE_MATCH_2})
  set(undone ${CMAKE_MATCH_3})
  read_dump(json ${name})
  string(JSON have_done LENGTH "${json}" undo done)
  string(JSON have_undone LENGTH "${json}" undo undone)
  if(NOT have_done EQUAL done OR NOT have_undone EQUAL undone)
    message(FATAL_ERROR "${name}: expected ${done} steps done and ${undone} undone, "
                        "found ${have_done} and ${have_undone}")
  endif()
endforeach()

foreach(check IN LISTS EXPECT_LAST)
  string(REGEX MATCH "^([^=]+)=(.+)$" _ "${check}")
  set(name ${CMAKE_MATCH_1})
  set(expected ${CMAKE_MATCH_2})
  read_dump(json ${name})
  string(JSON count LENGTH "${json}" undo done)
  if(count EQUAL 0)
    message(FATAL_ERROR "${name}: no step done, expected ${expected} last")
  endif()
  math(EXPR last "${count} - 1")
  string(JSON name_done GET "${json}" undo done ${last})
  if(NOT name_done STREQUAL expected)
    message(FATAL_ERROR "${name}: the last step done is ${name_done}, expected ${expected}")
  endif()
endforeach()

foreach(check IN LISTS EXPECT_VALUE)
  string(REGEX MATCH "^([^:]+):([^=]+)=(.*)$" _ "${check}")
  set(name ${CMAKE_MATCH_1})
  string(REPLACE "/" ";" path "${CMAKE_MATCH_2}")
  set(expected "${CMAKE_MATCH_3}")
  read_dump(json ${name})
  string(JSON value ERROR_VARIABLE error GET "${json}" ${path})
  if(error OR NOT value STREQUAL expected)
    if(error)
      set(value "missing (${error})")
    endif()
    message(FATAL_ERROR "${name}: ${CMAKE_MATCH_2} is ${value}, expected ${expected}")
  endif()
endforeach()

foreach(pair IN LISTS EXPECT_SAME EXPECT_DIFFERENT)
  string(REGEX MATCH "^([^=]+)=(.+)$" _ "${pair}")
  set(a ${CMAKE_MATCH_1})
  set(b ${CMAKE_MATCH_2})
  read_dump(first ${a})
  read_dump(second ${b})
  list(FIND EXPECT_SAME "${pair}" same)
  if(same GREATER_EQUAL 0 AND NOT first STREQUAL second)
    message(FATAL_ERROR "${a} and ${b} differ")
  elseif(same LESS 0 AND first STREQUAL second)
    message(FATAL_ERROR "${a} and ${b} are the same")
  endif()
endforeach()
