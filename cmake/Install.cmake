# What an installation holds beside the programs, and the two Debian packages of it: the viewer with
# its window, and the programs for terminals, which need neither a display nor widgets.
install(DIRECTORY ${PROJECT_SOURCE_DIR}/Resources/ DESTINATION ${CMAKE_INSTALL_DATADIR}/ventrik
  FILES_MATCHING PATTERN "*.plist" PATTERN "man" EXCLUDE PATTERN "systemd" EXCLUDE)
install(DIRECTORY ${PROJECT_SOURCE_DIR}/Resources/systemd/ DESTINATION lib/systemd/user)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/ventrik.png
  DESTINATION ${CMAKE_INSTALL_DATADIR}/ventrik COMPONENT viewer)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/ventrik.desktop
  DESTINATION ${CMAKE_INSTALL_DATADIR}/applications COMPONENT viewer)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/org.ventrik.Ventrik.metainfo.xml
  DESTINATION ${CMAKE_INSTALL_DATADIR}/metainfo COMPONENT viewer)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/ventrik.svg
  DESTINATION ${CMAKE_INSTALL_DATADIR}/icons/hicolor/scalable/apps COMPONENT viewer)
install(FILES ${PROJECT_SOURCE_DIR}/Resources/ventrik.png
  DESTINATION ${CMAKE_INSTALL_DATADIR}/icons/hicolor/128x128/apps COMPONENT viewer)
foreach(package "ventrik-tools;tools" "ventrik;viewer")
  list(GET package 0 name)
  list(GET package 1 component)
  install(FILES ${PROJECT_SOURCE_DIR}/CHANGELOG.md
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${name} COMPONENT ${component})
  install(FILES ${PROJECT_SOURCE_DIR}/LICENSE
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${name} RENAME copyright COMPONENT ${component})
endforeach()

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_PACKAGE_CONTACT "Ventrik <dev@ventrik.example>")
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_ALL tools viewer)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_TOOLS_PACKAGE_NAME ventrik-tools)
set(CPACK_DEBIAN_TOOLS_PACKAGE_SECTION net)
set(CPACK_COMPONENT_TOOLS_DESCRIPTION
"What the cellular baseband tells, in a terminal and offline
A viewer for a terminal, a decoder for captures that gives values to other
programs, and a telephony service for machines without a baseband, for captures
and for phones at a serial port. They need no display.")
set(CPACK_DEBIAN_VIEWER_PACKAGE_NAME ventrik)
set(CPACK_DEBIAN_VIEWER_PACKAGE_SECTION net)
set(CPACK_DEBIAN_VIEWER_PACKAGE_DEPENDS "ventrik-tools (= ${PROJECT_VERSION})")
set(CPACK_DEBIAN_VIEWER_PACKAGE_RECOMMENDS fonts-dejavu-core)
set(CPACK_COMPONENT_VIEWER_DESCRIPTION
"What the cellular baseband tells, in a window
A tree of tables that refreshes every two seconds, to be walked by touch or by
keys, with snapshots of the recent history.")
include(CPack)
