# The extension library: the search engine (engine/) and its widgets (ui/).
# Sources are picked up by folder so that each class is one header and one
# source file beside it.
file(GLOB FIF_ENGINE_SOURCES CONFIGURE_DEPENDS
     ${PROJECT_SOURCE_DIR}/engine/*.cpp ${PROJECT_SOURCE_DIR}/engine/*.h)
file(GLOB FIF_UI_SOURCES CONFIGURE_DEPENDS
     ${PROJECT_SOURCE_DIR}/ui/*.cpp ${PROJECT_SOURCE_DIR}/ui/*.h
     ${PROJECT_SOURCE_DIR}/ui/*.ui ${PROJECT_SOURCE_DIR}/ui/*.qrc)

# Headers that stay inside the library: not exported, not installed.
set(FIF_PRIVATE_HEADERS
    ${PROJECT_SOURCE_DIR}/engine/FifWorker.h
    ${PROJECT_SOURCE_DIR}/engine/FifScanPool.h
    ${PROJECT_SOURCE_DIR}/engine/FifFileScanner.h
    ${PROJECT_SOURCE_DIR}/engine/FifFolderWalker.h
    ${PROJECT_SOURCE_DIR}/engine/FifNameFilter.h
    ${PROJECT_SOURCE_DIR}/engine/FifOutbox.h
    ${PROJECT_SOURCE_DIR}/engine/FifLineScanner.h
    ${PROJECT_SOURCE_DIR}/engine/FifPrefilter.h
    ${PROJECT_SOURCE_DIR}/engine/FifRegExpTranslator.h
    ${PROJECT_SOURCE_DIR}/engine/FifAsciiMatcher.h
    ${PROJECT_SOURCE_DIR}/engine/FifTextTest.h
    ${PROJECT_SOURCE_DIR}/engine/FifLineCounter.h
    ${PROJECT_SOURCE_DIR}/engine/FifFileDevice.h
    ${PROJECT_SOURCE_DIR}/engine/FifLocker.h
    ${PROJECT_SOURCE_DIR}/engine/FifHandOff.h)

# The internal classes with their sources: tests and fuzz targets that use
# them directly compile them in, as the library keeps their symbols hidden.
set(FIF_ENGINE_INTERNAL_SOURCES ${FIF_PRIVATE_HEADERS})
foreach(_fif_header ${FIF_PRIVATE_HEADERS})
  string(REGEX REPLACE "\\.h$" ".cpp" _fif_source ${_fif_header})
  if(EXISTS ${_fif_source})
    list(APPEND FIF_ENGINE_INTERNAL_SOURCES ${_fif_source})
  endif()
endforeach()

add_library(FindInFiles SHARED ${FIF_ENGINE_SOURCES} ${FIF_UI_SOURCES})
add_library(FindInFiles::FindInFiles ALIAS FindInFiles)
set_target_properties(FindInFiles PROPERTIES
    VERSION ${PROJECT_VERSION}
    SOVERSION ${PROJECT_VERSION_MAJOR}
    AUTOUIC_SEARCH_PATHS ${PROJECT_SOURCE_DIR}/ui)
generate_export_header(FindInFiles
    BASE_NAME FIF
    EXPORT_FILE_NAME ${PROJECT_BINARY_DIR}/include/fif_export.h)
target_include_directories(FindInFiles PUBLIC
    $<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}/engine>
    $<BUILD_INTERFACE:${PROJECT_SOURCE_DIR}/ui>
    $<BUILD_INTERFACE:${PROJECT_BINARY_DIR}/include>
    $<INSTALL_INTERFACE:${CMAKE_INSTALL_INCLUDEDIR}/FindInFiles>)
# PCRE2 decides lines of ASCII characters for regular expressions; tests and
# fuzz targets that compile the internal classes in need it too.
find_package(PkgConfig REQUIRED)
pkg_check_modules(PCRE2 REQUIRED IMPORTED_TARGET libpcre2-8)
target_link_libraries(FindInFiles
    PUBLIC FindInFiles::Host Qt6::Core Qt6::Gui Qt6::Widgets Qt6::Core5Compat
           $<BUILD_INTERFACE:PkgConfig::PCRE2>)

set(_fif_public_headers ${FIF_ENGINE_SOURCES} ${FIF_UI_SOURCES})
list(FILTER _fif_public_headers INCLUDE REGEX "\\.h$")
list(REMOVE_ITEM _fif_public_headers ${FIF_PRIVATE_HEADERS})
install(TARGETS FindInFiles EXPORT FindInFilesTargets
    LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR}
    ARCHIVE DESTINATION ${CMAKE_INSTALL_LIBDIR}
    RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
install(FILES ${_fif_public_headers} ${PROJECT_BINARY_DIR}/include/fif_export.h
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/FindInFiles)
