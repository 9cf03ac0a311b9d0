# The application's tests drive the application's own window and viewer.
foreach(test tst_findinfiles tst_fileviewer)
  if(TARGET findinfiles_app)
    target_link_libraries(${test} PRIVATE findinfiles_app)
    add_dependencies(${test} findinfiles)
    target_compile_definitions(${test} PRIVATE FIF_TEST_FILE="${CMAKE_CURRENT_LIST_FILE}")
  else()
    # Without the application there is nothing to test.
    set_target_properties(${test} PROPERTIES EXCLUDE_FROM_ALL ON)
    set_tests_properties(${test} PROPERTIES DISABLED ON)
  endif()
endforeach()
