# What `cmake --install` puts under the prefix: the library and the engine modules (lib), qorhost,
# the demo game library and the font generator, the headers a user includes (include/qorui), the
# default data (share/qorui/data), the CMake package (lib/cmake/qorui) and the pkg-config file
# (lib/pkgconfig/qorui.pc).
include(CMakePackageConfigHelpers)
set(QOR_INSTALL_CMAKEDIR ${CMAKE_INSTALL_LIBDIR}/cmake/qorui)

# The library and the engine modules, exported as qorui::<name>.
install(TARGETS qor_engine_headers qorplatform qordebug qorMemoryManager qorbase qorscriptsystem qorui
        EXPORT qoruiTargets LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR})
# The public headers: the library's (with detail/, which they include) and the engine modules'.
install(DIRECTORY ${PROJECT_SOURCE_DIR}/inc/ ${PROJECT_SOURCE_DIR}/engine/include/
        DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/qorui COMPONENT headers FILES_MATCHING PATTERN "*.h")
install(DIRECTORY ${PROJECT_SOURCE_DIR}/data/ DESTINATION ${QOR_INSTALL_DATADIR})

# Programs find the modules in the library folder.
foreach(program qorhost qorfontgen)
  if(TARGET ${program})
    set_target_properties(${program} PROPERTIES INSTALL_RPATH "$ORIGIN/${QOR_LIBDIR_FROM_BIN}")
  endif()
endforeach()
if(TARGET qorhost)
  install(TARGETS qorhost EXPORT qoruiTargets RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
  install(TARGETS gameui_demo qorhost_graph_profiler LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR})
endif()
if(TARGET qorfontgen)
  install(TARGETS qorfontgen RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR})
endif()

install(EXPORT qoruiTargets NAMESPACE qorui:: DESTINATION ${QOR_INSTALL_CMAKEDIR})
configure_package_config_file(${CMAKE_CURRENT_LIST_DIR}/qoruiConfig.cmake.in
                              ${CMAKE_BINARY_DIR}/qoruiConfig.cmake INSTALL_DESTINATION ${QOR_INSTALL_CMAKEDIR}
                              PATH_VARS QOR_INSTALL_DATADIR)
write_basic_package_version_file(${CMAKE_BINARY_DIR}/qoruiConfigVersion.cmake COMPATIBILITY SameMajorVersion)
install(FILES ${CMAKE_BINARY_DIR}/qoruiConfig.cmake ${CMAKE_BINARY_DIR}/qoruiConfigVersion.cmake
        DESTINATION ${QOR_INSTALL_CMAKEDIR})

# pkg-config: the same flags for builds without CMake. Like the CMake package, the file finds the
# prefix from where it lies, so an install with --prefix elsewhere works.
file(RELATIVE_PATH QOR_PC_TO_PREFIX ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_PREFIX})
string(REGEX REPLACE "/$" "" QOR_PC_TO_PREFIX "${QOR_PC_TO_PREFIX}")
get_filename_component(QOR_LOKI_FILE ${LOKI_LIBRARY} NAME)
get_target_property(QOR_PUBLIC_DEFINITIONS qorui INTERFACE_COMPILE_DEFINITIONS)
list(TRANSFORM QOR_PUBLIC_DEFINITIONS PREPEND "-D")
list(JOIN QOR_PUBLIC_DEFINITIONS " " QOR_PC_DEFINES)
configure_file(${CMAKE_CURRENT_LIST_DIR}/qorui.pc.in ${CMAKE_BINARY_DIR}/qorui.pc @ONLY)
install(FILES ${CMAKE_BINARY_DIR}/qorui.pc DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig)
