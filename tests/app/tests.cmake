# The application's test drives the application's own window and viewer.
if(TARGET tst_findinfiles)
  if(TARGET findinfiles_app)
    target_link_libraries(tst_findinfiles PRIVATE findinfiles_app)
  else()
    # Without the application there is nothing to test.
    set_target_properties(tst_findinfiles PROPERTIES EXCLUDE_FROM_ALL ON)
    set_tests_properties(tst_findinfiles PROPERTIES DISABLED ON)
  endif()
endif()
