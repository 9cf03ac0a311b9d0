# The worker, its line scanner and their helpers are internal to the library
# (not exported), so their tests compile them in.
set(_fif_engine_internals
    ${PROJECT_SOURCE_DIR}/engine/FifWorker.cpp
    ${PROJECT_SOURCE_DIR}/engine/FifWorker.h
    ${PROJECT_SOURCE_DIR}/engine/FifLineScanner.cpp
    ${PROJECT_SOURCE_DIR}/engine/FifLineScanner.h
    ${PROJECT_SOURCE_DIR}/engine/FifPrefilter.cpp
    ${PROJECT_SOURCE_DIR}/engine/FifPrefilter.h
    ${PROJECT_SOURCE_DIR}/engine/FifTextTest.cpp
    ${PROJECT_SOURCE_DIR}/engine/FifTextTest.h
    ${PROJECT_SOURCE_DIR}/engine/FifLineCounter.cpp
    ${PROJECT_SOURCE_DIR}/engine/FifLineCounter.h
    ${PROJECT_SOURCE_DIR}/engine/FifFileDevice.cpp
    ${PROJECT_SOURCE_DIR}/engine/FifFileDevice.h)
foreach(_fif_test tst_fifworker tst_fiflinescanner tst_fifprefilter tst_fiftexttest
                  tst_fiflinecounter)
  if(TARGET ${_fif_test})
    target_sources(${_fif_test} PRIVATE ${_fif_engine_internals})
  endif()
endforeach()
