# The form test compiles the dialog's Designer form itself.
set_target_properties(tst_findinfilesdlgclass PROPERTIES
    AUTOUIC_SEARCH_PATHS ${PROJECT_SOURCE_DIR}/ui)
