# The command-line tests run the fif program itself; the comparison with grep
# also applies the worker's own text test, which is internal to the library.
foreach(_fif_test tst_fif tst_fifgrep)
  if(NOT TARGET ${_fif_test})
    continue()
  endif()
  if(TARGET fif)
    add_dependencies(${_fif_test} fif)
    set_property(TEST ${_fif_test} APPEND PROPERTY ENVIRONMENT
                 "FIF_EXECUTABLE=$<TARGET_FILE:fif>")
  else()
    set_tests_properties(${_fif_test} PROPERTIES DISABLED TRUE)
  endif()
endforeach()
if(TARGET tst_fifgrep)
  target_sources(tst_fifgrep PRIVATE ${FIF_ENGINE_INTERNAL_SOURCES})
endif()
