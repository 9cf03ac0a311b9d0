# Installs the project into a staging prefix and checks that the application
# installs as a desktop application: the program, a desktop entry that
# names it and its icon (validated by desktop-file-validate where that is
# installed), the icon in the hicolor theme, and --help and --version
# answered without a display.
include(${CMAKE_CURRENT_LIST_DIR}/../common/StageInstall.cmake)
stage_install(VERSION)

set(entry ${prefix}/share/applications/findinfiles.desktop)
file(STRINGS ${entry} exec REGEX "^Exec=")
file(STRINGS ${entry} icon REGEX "^Icon=")
if(NOT exec MATCHES "^Exec=findinfiles( |$)" OR NOT icon STREQUAL "Icon=findinfiles")
  message(FATAL_ERROR "the desktop entry names another program or icon: ${exec} ${icon}")
endif()
file(READ ${prefix}/share/icons/hicolor/scalable/apps/findinfiles.svg svg LIMIT 200)
if(NOT svg MATCHES "<svg ")
  message(FATAL_ERROR "the installed icon is not an SVG picture")
endif()

find_program(validate desktop-file-validate)
if(validate)
  execute_process(COMMAND ${validate} ${entry} RESULT_VARIABLE result
                  OUTPUT_VARIABLE out ERROR_VARIABLE out)
  if(result OR out)
    message(FATAL_ERROR "desktop-file-validate: ${result} ${out}")
  endif()
else()
  message(STATUS "desktop-file-validate not found: the desktop entry is not validated")
endif()

set(program ${prefix}/bin/findinfiles)
foreach(option --version --help)
  execute_process(COMMAND ${CMAKE_COMMAND} -E env --unset=DISPLAY --unset=WAYLAND_DISPLAY
                          --unset=QT_QPA_PLATFORM ${program} ${option}
                  RESULT_VARIABLE result OUTPUT_VARIABLE out ERROR_VARIABLE err)
  set(expected "^findinfiles ${VERSION}\n$")
  if(option STREQUAL "--help")
    set(expected "^Usage: [^\n]*findinfiles \\[options\\] \\[FOLDER\\]\n")
  endif()
  if(result OR NOT out MATCHES "${expected}")
    message(FATAL_ERROR "findinfiles ${option}: exit ${result}, printed \"${out}\" ${err}")
  endif()
endforeach()
