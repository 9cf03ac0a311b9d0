# The installed package works for another CMake project. A sanitizer build's
# library needs a consumer built with the same sanitizers.
list(JOIN FIF_SANITIZE "," _fif_consumer_sanitize)
add_test(NAME package_consumer
         COMMAND ${CMAKE_COMMAND} -DBINARY_DIR=${PROJECT_BINARY_DIR}
                 "-DSANITIZE=${_fif_consumer_sanitize}"
                 -DSOURCE_DIR=${PROJECT_SOURCE_DIR}
                 -DWORK_DIR=${CMAKE_CURRENT_BINARY_DIR}/package_consumer
                 -P ${CMAKE_CURRENT_LIST_DIR}/check_consumer.cmake)
set_tests_properties(package_consumer PROPERTIES
    ENVIRONMENT "QT_QPA_PLATFORM=offscreen" TIMEOUT 600 RUN_SERIAL TRUE)
