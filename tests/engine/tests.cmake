# The worker and its line scanner are internal to the library (not
# exported), so their tests compile them in.
foreach(_fif_test tst_fifworker tst_fiflinescanner)
  if(TARGET ${_fif_test})
    target_sources(${_fif_test} PRIVATE
        ${PROJECT_SOURCE_DIR}/engine/FifWorker.cpp
        ${PROJECT_SOURCE_DIR}/engine/FifWorker.h
        ${PROJECT_SOURCE_DIR}/engine/FifLineScanner.cpp
        ${PROJECT_SOURCE_DIR}/engine/FifLineScanner.h)
  endif()
endforeach()
