# The version both programs print, what `cmake --install` puts where, and the
# Debian package: `cmake --build --preset release --target package` makes
# dovrel_VERSION_amd64.deb in the build folder. Included at the end of the top
# CMakeLists.txt, once every target exists.
include(GNUInstallDirs)

# The day of the release the metainfo names; moves with PROJECT_VERSION, as
# does the first entry of packaging/changelog (scripts/check-package checks it).
set(DOVREL_RELEASE_DATE 2026-12-06)

foreach(program dovrel-cli dovrel-viewer)
  if(TARGET ${program})
    target_compile_definitions(${program} PRIVATE DOVREL_VERSION="${PROJECT_VERSION}")
  endif()
endforeach()

set(DOVREL_PACKAGING_DIR ${PROJECT_SOURCE_DIR}/packaging)
set(DOVREL_GENERATED_DIR ${PROJECT_BINARY_DIR}/packaging)
set(CMAKE_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
    OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)

install(TARGETS dovrel-cli RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
if(TARGET dovrel-viewer)
  install(TARGETS dovrel-viewer RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
endif()
install(DIRECTORY ${DOVREL_DEMO_DIR}/ DESTINATION ${CMAKE_INSTALL_DATADIR}/dovrel/demo)

# The menu entry, its icon and the software-centre description.
configure_file(${DOVREL_PACKAGING_DIR}/org.dovrel.viewer.metainfo.xml.in
               ${DOVREL_GENERATED_DIR}/org.dovrel.viewer.metainfo.xml @ONLY)
install(FILES ${DOVREL_PACKAGING_DIR}/org.dovrel.viewer.desktop
              ${DOVREL_PACKAGING_DIR}/org.dovrel.viewer.demo.desktop
        DESTINATION ${CMAKE_INSTALL_DATADIR}/applications)
install(FILES ${DOVREL_PACKAGING_DIR}/org.dovrel.viewer.svg
        DESTINATION ${CMAKE_INSTALL_DATADIR}/icons/hicolor/scalable/apps)
install(FILES ${DOVREL_GENERATED_DIR}/org.dovrel.viewer.metainfo.xml
        DESTINATION ${CMAKE_INSTALL_DATADIR}/metainfo)
install(FILES ${DOVREL_PACKAGING_DIR}/dovrel.bash-completion
        DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions RENAME dovrel)
install(FILES ${DOVREL_PACKAGING_DIR}/dovrel.bash-completion
        DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions RENAME dovrel-viewer)

# The manual pages: dovrel.1 from the command's own help texts (help2man),
# dovrel-viewer.1 written by hand. Debian keeps them and the changelog
# compressed, without time stamps, so that equal sources make equal files.
find_program(DOVREL_HELP2MAN help2man)
find_program(DOVREL_GZIP gzip REQUIRED)
configure_file(${DOVREL_PACKAGING_DIR}/dovrel-viewer.1.in ${DOVREL_GENERATED_DIR}/dovrel-viewer.1
               @ONLY)
set(DOVREL_MANUALS ${DOVREL_GENERATED_DIR}/dovrel-viewer.1.gz)
add_custom_command(
  OUTPUT ${DOVREL_GENERATED_DIR}/dovrel-viewer.1.gz ${DOVREL_GENERATED_DIR}/changelog.gz
  COMMAND ${DOVREL_GZIP} -9n -c ${DOVREL_GENERATED_DIR}/dovrel-viewer.1
          > ${DOVREL_GENERATED_DIR}/dovrel-viewer.1.gz
  COMMAND ${DOVREL_GZIP} -9n -c ${DOVREL_PACKAGING_DIR}/changelog
          > ${DOVREL_GENERATED_DIR}/changelog.gz
  DEPENDS ${DOVREL_GENERATED_DIR}/dovrel-viewer.1 ${DOVREL_PACKAGING_DIR}/changelog)
if(DOVREL_HELP2MAN)
  add_custom_command(
    OUTPUT ${DOVREL_GENERATED_DIR}/dovrel.1.gz
    COMMAND ${DOVREL_PACKAGING_DIR}/make-manpage $<TARGET_FILE:dovrel-cli>
            ${DOVREL_GENERATED_DIR}/dovrel.1
    COMMAND ${DOVREL_GZIP} -9nf ${DOVREL_GENERATED_DIR}/dovrel.1
    DEPENDS dovrel-cli ${DOVREL_PACKAGING_DIR}/make-manpage
    COMMENT "Writing the manual page dovrel.1")
  list(APPEND DOVREL_MANUALS ${DOVREL_GENERATED_DIR}/dovrel.1.gz)
else()
  install(CODE "message(FATAL_ERROR \"help2man is needed for dovrel.1: scripts/install-deps --package\")")
endif()
add_custom_target(manuals ALL DEPENDS ${DOVREL_MANUALS} ${DOVREL_GENERATED_DIR}/changelog.gz)
install(FILES ${DOVREL_MANUALS} DESTINATION ${CMAKE_INSTALL_MANDIR}/man1)
install(FILES ${DOVREL_PACKAGING_DIR}/copyright DESTINATION ${CMAKE_INSTALL_DOCDIR})
install(FILES ${DOVREL_GENERATED_DIR}/changelog.gz DESTINATION ${CMAKE_INSTALL_DOCDIR})

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME dovrel)
set(CPACK_PACKAGE_VENDOR "The Dovrel developers")
set(CPACK_PACKAGE_CONTACT "The Dovrel developers <dovrel@example.org>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "viewer for the stock documents of a DOS accounting system")
# Debian shows the lines as they stand: each under 80 characters.
string(CONCAT CPACK_PACKAGE_DESCRIPTION
  "Dovrel shows the stock documents of a DOS-era Hebrew accounting system\n"
  "(tax invoices, delivery notes, orders, quotations, stock movements) one at\n"
  "a time, right to left, and prints them through the web browser. It reads\n"
  "the accounting system's data files read-only, while that system keeps\n"
  "running.\n"
  "\n"
  "This package holds the desktop viewer dovrel-viewer, the command dovrel\n"
  "and a demo company.")
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION misc)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
# The window needs Qt's X11 and Wayland plugins and Qt's own Hebrew texts;
# the pages use DejaVu Sans.
set(CPACK_DEBIAN_PACKAGE_DEPENDS "qt6-qpa-plugins, qt6-translations-l10n, fonts-dejavu-core")
# The browser shows and prints the pages.
set(CPACK_DEBIAN_PACKAGE_RECOMMENDS "chromium, xdg-utils")
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_STRIP_FILES ON)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
include(CPack)
