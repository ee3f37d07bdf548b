# What an installation holds beside the programs, and the Debian package of it.
install(DIRECTORY ${PROJECT_SOURCE_DIR}/Resources/ DESTINATION ${CMAKE_INSTALL_DATADIR}/ventrik
  FILES_MATCHING PATTERN "*.plist" PATTERN "ventrik.png" PATTERN "man" EXCLUDE)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/ventrik.desktop
  DESTINATION ${CMAKE_INSTALL_DATADIR}/applications)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/org.ventrik.Ventrik.metainfo.xml
  DESTINATION ${CMAKE_INSTALL_DATADIR}/metainfo)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/ventrik.svg
  DESTINATION ${CMAKE_INSTALL_DATADIR}/icons/hicolor/scalable/apps)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/ventrik.png
  DESTINATION ${CMAKE_INSTALL_DATADIR}/icons/hicolor/128x128/apps)
install(FILES ${PROJECT_SOURCE_DIR}/CHANGELOG.md DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/ventrik)
install(FILES ${PROJECT_SOURCE_DIR}/LICENSE DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/ventrik
  RENAME copyright)

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_PACKAGE_CONTACT "Ventrik <dev@ventrik.example>")
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION net)
set(CPACK_DEBIAN_PACKAGE_DESCRIPTION
"Shows what the cellular baseband tells as a tree of tables that refreshes every
two seconds, in a window or in a terminal. With it come an offline decoder for
captures and a telephony service for machines without a baseband.")
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_RECOMMENDS fonts-dejavu-core)
include(CPack)
