# Internal engine classes (not exported) are compiled into their tests.
foreach(_fif_pair "tst_fifprefilter;FifPrefilter" "tst_fiftexttest;FifTextTest")
  list(GET _fif_pair 0 _fif_test)
  list(GET _fif_pair 1 _fif_class)
  if(TARGET ${_fif_test})
    target_sources(${_fif_test} PRIVATE
        ${PROJECT_SOURCE_DIR}/engine/${_fif_class}.cpp
        ${PROJECT_SOURCE_DIR}/engine/${_fif_class}.h)
  endif()
endforeach()
