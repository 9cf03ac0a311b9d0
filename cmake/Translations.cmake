# Translation template: `cmake --build <dir> --target FindInFiles_lupdate`
# (or `update_translations`) rescans the library's sources and its Designer
# form and rewrites translations/findinfiles.ts, which translators copy to
# findinfiles_<language>.ts.
find_package(Qt6 QUIET COMPONENTS LinguistTools)
if(Qt6LinguistTools_FOUND)
  qt_add_lupdate(FindInFiles
      TS_FILES ${PROJECT_SOURCE_DIR}/translations/findinfiles.ts
      OPTIONS -no-obsolete -locations relative)
else()
  message(STATUS "Qt6LinguistTools not found: no translation template target")
endif()
