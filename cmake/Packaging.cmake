# What `cmake --install` puts where, and the Debian package that `cpack` makes of it.
include(GNUInstallDirs)

set(programs quorl-tool)
if(TARGET quorl-simulator)
  list(APPEND programs quorl-simulator)
endif()
install(TARGETS ${programs} RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})

# The programs look for their resources beside them, in ../share/quorl.
set(quorl_data ${CMAKE_INSTALL_DATADIR}/quorl)
file(GLOB device_configurations CONFIGURE_DEPENDS ${PROJECT_SOURCE_DIR}/resources/*.deviceconfig)
install(FILES ${device_configurations} DESTINATION ${quorl_data})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/resources/recordings ${PROJECT_SOURCE_DIR}/resources/telephony
                  ${PROJECT_SOURCE_DIR}/resources/scenarios
        DESTINATION ${quorl_data})
install(DIRECTORY ${CMAKE_BINARY_DIR}/share/quorl/locale DESTINATION ${quorl_data})

foreach(program IN LISTS programs)
  set(manual ${PROJECT_SOURCE_DIR}/packaging/man/${program}.1)
  set(packed ${CMAKE_BINARY_DIR}/packaging/${program}.1.gz)
  add_custom_command(
    OUTPUT ${packed}
    COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_BINARY_DIR}/packaging
    COMMAND gzip -9nc ${manual} > ${packed}
    DEPENDS ${manual} VERBATIM)
  list(APPEND packed_manuals ${packed})
endforeach()
add_custom_target(quorl_manuals ALL DEPENDS ${packed_manuals})
install(FILES ${packed_manuals} DESTINATION ${CMAKE_INSTALL_MANDIR}/man1)

# What a Debian package has to say of itself. Both dates are those of the release.
set(QUORL_RELEASE_DATE 2026-11-21)
set(QUORL_CHANGELOG_DATE "Sat, 21 Nov 2026 12:00:00 +0000")
set(CPACK_PACKAGE_CONTACT "The Quorl developers <quorl@localhost>")
configure_file(${PROJECT_SOURCE_DIR}/packaging/changelog.in ${CMAKE_BINARY_DIR}/packaging/changelog @ONLY)
set(packed_changelog ${CMAKE_BINARY_DIR}/packaging/changelog.gz)
add_custom_command(
  OUTPUT ${packed_changelog}
  COMMAND gzip -9nc ${CMAKE_BINARY_DIR}/packaging/changelog > ${packed_changelog}
  DEPENDS ${CMAKE_BINARY_DIR}/packaging/changelog VERBATIM)
add_custom_target(quorl_changelog ALL DEPENDS ${packed_changelog})
install(FILES ${packed_changelog} ${PROJECT_SOURCE_DIR}/packaging/copyright DESTINATION ${CMAKE_INSTALL_DOCDIR})
install(FILES ${PROJECT_SOURCE_DIR}/README.md ${PROJECT_SOURCE_DIR}/CHANGELOG.md ${PROJECT_SOURCE_DIR}/SECURITY.md
        DESTINATION ${CMAKE_INSTALL_DOCDIR})

if(TARGET quorl-simulator)
  configure_file(${PROJECT_SOURCE_DIR}/packaging/com.ardent.quorl.metainfo.xml.in
                 ${CMAKE_BINARY_DIR}/packaging/com.ardent.quorl.metainfo.xml @ONLY)
  install(FILES ${CMAKE_BINARY_DIR}/packaging/com.ardent.quorl.metainfo.xml
          DESTINATION ${CMAKE_INSTALL_DATADIR}/metainfo)
  install(FILES ${PROJECT_SOURCE_DIR}/packaging/com.ardent.quorl.desktop
          DESTINATION ${CMAKE_INSTALL_DATADIR}/applications)
  install(FILES ${PROJECT_SOURCE_DIR}/packaging/com.ardent.quorl.svg
          DESTINATION ${CMAKE_INSTALL_DATADIR}/icons/hicolor/scalable/apps)
endif()

if(QUORL_TESTS AND NOT QUORL_SANITIZE AND NOT QUORL_FUZZ)
  list(TRANSFORM programs REPLACE "(.+)" "$<TARGET_FILE:\\1>" OUTPUT_VARIABLE program_files)
  add_test(NAME hardening COMMAND ${PROJECT_SOURCE_DIR}/scripts/check_hardening.sh
                                  $<IF:$<BOOL:${QUORL_HARDENED}>,--compiled,--linked> ${program_files})
endif()

if(QUORL_TESTS AND TARGET quorl-simulator)
  find_program(DESKTOP_FILE_VALIDATE desktop-file-validate REQUIRED)
  find_program(APPSTREAMCLI appstreamcli REQUIRED)
  add_test(NAME desktop_entry
           COMMAND ${DESKTOP_FILE_VALIDATE} --no-hints ${PROJECT_SOURCE_DIR}/packaging/com.ardent.quorl.desktop)
  add_test(NAME appstream_metadata
           COMMAND ${APPSTREAMCLI} validate --no-net ${CMAKE_BINARY_DIR}/packaging/com.ardent.quorl.metainfo.xml)
endif()

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME quorl)
set(CPACK_PACKAGE_VENDOR "The Quorl developers")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "cellular diagnostics monitor")
set(CPACK_DEBIAN_PACKAGE_DESCRIPTION
    "Shows what the baseband of a phone is doing now and what it did over the last\n\
thirty days: a dashboard of pinned attributes, metrics by technology, details,\n\
history, export and log capture. This package runs it on a simulated phone.")
set(CPACK_STRIP_FILES ON)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION net)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
if(TARGET quorl-simulator)
  # What QML loads at run time, which no linker sees.
  set(CPACK_DEBIAN_PACKAGE_DEPENDS
      "qml6-module-qt-labs-folderlistmodel, qml6-module-qtqml, qml6-module-qtqml-models, \
qml6-module-qtqml-workerscript, qml6-module-qtquick, qml6-module-qtquick-controls, qml6-module-qtquick-dialogs, \
qml6-module-qtquick-layouts, qml6-module-qtquick-shapes, qml6-module-qtquick-templates, qml6-module-qtquick-window, \
libqt6svg6, qt6-qpa-plugins")
  set(CPACK_DEBIAN_PACKAGE_RECOMMENDS "fonts-inter")
endif()
include(CPack)
