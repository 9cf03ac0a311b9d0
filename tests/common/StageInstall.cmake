# Installs the build in BINARY_DIR into a fresh staging prefix under
# WORK_DIR and sets `prefix` to it. The variables named are required.
macro(stage_install)
  foreach(var BINARY_DIR WORK_DIR ${ARGN})
    if(NOT DEFINED ${var})
      message(FATAL_ERROR "${var} not set")
    endif()
  endforeach()
  file(REMOVE_RECURSE ${WORK_DIR})
  set(prefix ${WORK_DIR}/prefix)
  execute_process(COMMAND ${CMAKE_COMMAND} --install ${BINARY_DIR} --prefix ${prefix}
                  RESULT_VARIABLE result OUTPUT_QUIET)
  if(result)
    message(FATAL_ERROR "install failed: ${result}")
  endif()
endmacro()
