# Installs the project into a staging prefix, builds the consumer project
# against it and runs the consumer on a small tree.
include(${CMAKE_CURRENT_LIST_DIR}/../common/StageInstall.cmake)
stage_install(SOURCE_DIR)
# The staged package must be relocatable: move it before use.
file(RENAME ${prefix} ${WORK_DIR}/moved)
set(prefix ${WORK_DIR}/moved)

set(sanitize_args)
if(SANITIZE)
  set(sanitize_args "-DCMAKE_CXX_FLAGS=-fsanitize=${SANITIZE}"
                    "-DCMAKE_EXE_LINKER_FLAGS=-fsanitize=${SANITIZE}")
endif()
execute_process(COMMAND ${CMAKE_COMMAND} -S ${SOURCE_DIR}/tests/package/consumer
                        -B ${WORK_DIR}/build -G Ninja -DCMAKE_PREFIX_PATH=${prefix}
                        ${sanitize_args}
                RESULT_VARIABLE result)
if(result)
  message(FATAL_ERROR "configuring the consumer failed")
endif()
execute_process(COMMAND ${CMAKE_COMMAND} --build ${WORK_DIR}/build RESULT_VARIABLE result)
if(result)
  message(FATAL_ERROR "building the consumer failed")
endif()

file(WRITE ${WORK_DIR}/tree/notes.txt "first line\nthe needle is here\n")
execute_process(COMMAND ${WORK_DIR}/build/consumer needle ${WORK_DIR}/tree
                RESULT_VARIABLE result OUTPUT_VARIABLE output)
if(result OR NOT output MATCHES "notes.txt \\(2\\): the needle is here")
  message(FATAL_ERROR "consumer gave ${result}: ${output}")
endif()
