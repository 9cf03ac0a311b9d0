# The command-line test runs the fif program itself.
if(TARGET tst_fif)
  if(TARGET fif)
    add_dependencies(tst_fif fif)
    set_property(TEST tst_fif APPEND PROPERTY ENVIRONMENT "FIF_EXECUTABLE=$<TARGET_FILE:fif>")
  else()
    set_tests_properties(tst_fif PROPERTIES DISABLED TRUE)
  endif()
endif()
