cmake_minimum_required(VERSION 3.25)

# Saving with Ctrl+S writes the project's own file, and closing asks while there are changes:
# "Cancel" keeps the program going, "Don't Save" leaves the file as it was. Ctrl+O opens a saved
# file in place of the demo. A file that does not exist yet is a new project that saves there.
#   -DPROGRAM=path  -DPROJECT=file (copied, never written)  -DSCRIPTS=dir  -DOUT=dir
file(REMOVE_RECURSE "${OUT}")
file(MAKE_DIRECTORY "${OUT}")

function(run_program project script)
  if(NOT IS_ABSOLUTE "${script}")
    set(script "${SCRIPTS}/${script}")
  endif()
  execute_process(COMMAND "${PROGRAM}" --headless --project "${project}" --script "${script}"
                          --out "${OUT}"
                  RESULT_VARIABLE exit_code OUTPUT_VARIABLE out ERROR_VARIABLE err)
  if(NOT exit_code EQUAL 0)
    message(FATAL_ERROR "${script} exited with ${exit_code}:\n${err}")
  endif()
  if(err MATCHES "warning:" AND NOT err MATCHES "the lines after it did not run")
    message(FATAL_ERROR "${script} warned:\n${err}")
  endif()
endfunction()

function(expect_document dump member expected)
  file(READ "${OUT}/${dump}" json)
  string(JSON actual GET "${json}" document ${member})
  if(NOT actual STREQUAL expected)
    message(FATAL_ERROR "${dump}: document.${member} is '${actual}', expected '${expected}'")
  endif()
endfunction()

# Opens `project` and writes it again as `name` under OUT (the program's canonical form).
function(resave project name)
  file(WRITE "${OUT}/resave-${name}.ecs" "save ${name}\n")
  run_program("${project}" "${OUT}/resave-${name}.ecs")
endfunction()

function(expect_same a b)
  file(READ "${a}" first)
  file(READ "${b}" second)
  if(NOT first STREQUAL second)
    message(FATAL_ERROR "${a} and ${b} differ")
  endif()
endfunction()

# Cancel, then Ctrl+S, then a close that needs no question.
configure_file("${PROJECT}" "${OUT}/work.json" COPYONLY)
run_program("${OUT}/work.json" edit-save-close.ecs)
expect_document(edited.dump.json modified ON)
expect_document(kept.dump.json modified ON)
expect_document(saved.dump.json modified OFF)
expect_document(saved.dump.json lastError "")
if(EXISTS "${OUT}/never.dump.json")
  message(FATAL_ERROR "the script went on after the project was closed")
endif()
resave("${PROJECT}" original.json)
file(READ "${OUT}/original.json" original)
file(READ "${OUT}/work.json" saved)
if(saved STREQUAL original)
  message(FATAL_ERROR "Ctrl+S did not write the added marker into work.json")
endif()

# The saved file opens again and saves to the same bytes.
resave("${OUT}/work.json" resaved.json)
expect_same("${OUT}/work.json" "${OUT}/resaved.json")

# Open (Ctrl+O) from the built-in demo: the document is the opened file from then on.
file(WRITE "${OUT}/open.ecs" "input-answer ${OUT}/work.json\ncommand cmd.file.open\ndump opened.dump.json\n")
execute_process(COMMAND "${PROGRAM}" --headless --script "${OUT}/open.ecs" --out "${OUT}"
                RESULT_VARIABLE exit_code ERROR_VARIABLE err)
if(NOT exit_code EQUAL 0 OR err MATCHES "warning:")
  message(FATAL_ERROR "open.ecs exited with ${exit_code}:\n${err}")
endif()
expect_document(opened.dump.json path "${OUT}/work.json")
expect_document(opened.dump.json modified OFF)

# Don't Save: the file stays as it was.
configure_file("${OUT}/work.json" "${OUT}/before-discard.json" COPYONLY)
run_program("${OUT}/work.json" edit-discard.ecs)
expect_same("${OUT}/work.json" "${OUT}/before-discard.json")

# A new file.
run_program("${OUT}/new.json" new-project.ecs)
expect_document(new.dump.json modified OFF)
if(NOT EXISTS "${OUT}/new.json")
  message(FATAL_ERROR "saving a new project did not write new.json")
endif()
