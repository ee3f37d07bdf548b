# `format-check` fails on a file that is not in the house format; `format` rewrites; `tidy` lints.
find_program(CLANG_FORMAT clang-format)
find_program(RUN_CLANG_TIDY NAMES run-clang-tidy run-clang-tidy-14)
file(GLOB_RECURSE VENTRIK_SOURCES RELATIVE ${PROJECT_SOURCE_DIR}
  PropertyList/*.cpp PropertyList/*.h Packets/*.cpp Packets/*.h Files/*.cpp Files/*.h Platform/*.cpp Platform/*.h
  LogGenerator/*.cpp LogGenerator/*.h Model/*.cpp Model/*.h Charts/*.cpp Charts/*.h
  Report/*.cpp Report/*.h Capture/*.cpp Capture/*.h App/*.cpp App/*.h
  TelephonyService/*.cpp TelephonyService/*.h Tools/*.cpp Tools/*.h Tests/*.cpp Tests/*.h
  Benchmarks/*.cpp Fuzz/*.cpp)
if(CLANG_FORMAT)
  add_custom_target(format-check
    COMMAND ${CLANG_FORMAT} --dry-run --Werror ${VENTRIK_SOURCES}
    WORKING_DIRECTORY ${PROJECT_SOURCE_DIR} COMMENT "Checking the house format" VERBATIM)
  add_custom_target(format
    COMMAND ${CLANG_FORMAT} -i ${VENTRIK_SOURCES}
    WORKING_DIRECTORY ${PROJECT_SOURCE_DIR} COMMENT "Applying the house format" VERBATIM)
endif()
if(RUN_CLANG_TIDY)
  add_custom_target(tidy
    COMMAND ${RUN_CLANG_TIDY} -quiet -p ${CMAKE_BINARY_DIR}
      "^${PROJECT_SOURCE_DIR}/(PropertyList|Packets|Files|Platform|LogGenerator|Model|Charts|Report|Capture|App|TelephonyService|Tools)/"
    WORKING_DIRECTORY ${PROJECT_SOURCE_DIR} VERBATIM)
endif()
