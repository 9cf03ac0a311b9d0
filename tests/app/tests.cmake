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
# The application installs as a desktop application (see the script).
if(TARGET findinfiles)
  add_test(NAME findinfiles_install
           COMMAND ${CMAKE_COMMAND} -DBINARY_DIR=${PROJECT_BINARY_DIR}
                   -DWORK_DIR=${CMAKE_CURRENT_BINARY_DIR}/findinfiles_install
                   -DVERSION=${PROJECT_VERSION}
                   -P ${CMAKE_CURRENT_LIST_DIR}/check_install.cmake)
  set_tests_properties(findinfiles_install PROPERTIES LABELS app TIMEOUT 600 RUN_SERIAL TRUE)
endif()
