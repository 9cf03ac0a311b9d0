# The worker, its line scanner and their helpers are internal to the library
# (not exported), so the engine's tests compile them in.
file(GLOB _fif_engine_tests ${CMAKE_CURRENT_LIST_DIR}/tst_*.cpp)
foreach(_fif_source ${_fif_engine_tests})
  get_filename_component(_fif_test ${_fif_source} NAME_WE)
  target_sources(${_fif_test} PRIVATE ${FIF_ENGINE_INTERNAL_SOURCES})
endforeach()
