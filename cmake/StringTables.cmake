# The string table "Localizable" in each language of resources/strings, where an installed program would find it too.
find_package(Gettext REQUIRED)

file(GLOB string_tables CONFIGURE_DEPENDS ${PROJECT_SOURCE_DIR}/resources/strings/*.po)
set(compiled_tables)
foreach(table IN LISTS string_tables)
  cmake_path(GET table STEM language)
  set(compiled ${CMAKE_BINARY_DIR}/share/quorl/locale/${language}/LC_MESSAGES/Localizable.mo)
  cmake_path(GET compiled PARENT_PATH folder)
  add_custom_command(
    OUTPUT ${compiled}
    COMMAND ${CMAKE_COMMAND} -E make_directory ${folder}
    COMMAND ${GETTEXT_MSGFMT_EXECUTABLE} --check --output-file=${compiled} ${table}
    DEPENDS ${table} VERBATIM)
  list(APPEND compiled_tables ${compiled})
endforeach()
add_custom_target(quorl_strings ALL DEPENDS ${compiled_tables})
