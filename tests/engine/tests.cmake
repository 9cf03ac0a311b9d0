# The worker, its line scanner and their helpers are internal to the library
# (not exported), so their tests compile them in.
foreach(_fif_test tst_fifworker tst_fiflinescanner tst_fifprefilter tst_fiftexttest
                  tst_fiflinecounter)
  if(TARGET ${_fif_test})
    target_sources(${_fif_test} PRIVATE ${FIF_ENGINE_INTERNAL_SOURCES})
  endif()
endforeach()
