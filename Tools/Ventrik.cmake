add_executable(ventrik OwnDirectory.cpp OwnService.cpp ventrik.cpp)
target_compile_definitions(ventrik PRIVATE VENTRIK_VERSION="${PROJECT_VERSION}")
target_link_libraries(ventrik PRIVATE ventrik-app ventrik-tools ventrik-capture)
# Other programs may look up these two functions in the executable.
set_target_properties(ventrik PROPERTIES ENABLE_EXPORTS ON)
target_link_options(ventrik PRIVATE -Wl,-u,lz4_decode_fast -Wl,-u,ETLDLFAddVersionReport)

install(TARGETS ventrik COMPONENT viewer)
