# Each program's man page is made of what it says with --help and, for what goes beyond that, of
# Resources/man/PROGRAM.h2m. Builds that are only for checking have none.
set(VENTRIK_MAN_PAGES)
if(VENTRIK_SANITIZE OR VENTRIK_COVERAGE OR VENTRIK_FUZZ)
  return()
endif()
find_program(HELP2MAN help2man)
if(NOT HELP2MAN OR CMAKE_CROSSCOMPILING)
  message(STATUS "No man pages: they need help2man and programs that run on this machine")
  return()
endif()

foreach(program ventrik ventrik-decode ventrik-telephony ventrik-watch)
  set(page ${CMAKE_BINARY_DIR}/man/${program}.1)
  set(more ${PROJECT_SOURCE_DIR}/Resources/man/${program}.h2m)
  add_custom_command(OUTPUT ${page}
    COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_BINARY_DIR}/man
    COMMAND ${HELP2MAN} --no-info --source=Ventrik --include=${more} --output=${page}
      $<TARGET_FILE:${program}>
    DEPENDS ${program} ${more} VERBATIM)
  list(APPEND VENTRIK_MAN_PAGES ${page})
endforeach()
add_custom_target(man-pages ALL DEPENDS ${VENTRIK_MAN_PAGES})
foreach(page ${VENTRIK_MAN_PAGES})
  set(component tools)
  if(page MATCHES "/ventrik\\.1$")
    set(component viewer)
  endif()
  install(FILES ${page} DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT ${component})
endforeach()
