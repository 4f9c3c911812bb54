# What "cmake --install" puts where. Components: runtime, development, tools, documentation.
include(CMakePackageConfigHelpers)

# fwzel_install_library(target headers): the headers are included as <headers/...>. They lie below fwzel/, where
# no other Cg's headers are in their way.
function(fwzel_install_library target headers)
  install(TARGETS ${target} EXPORT FwZelTargets
    LIBRARY DESTINATION ${CMAKE_INSTALL_LIBDIR} COMPONENT runtime NAMELINK_COMPONENT development
    PUBLIC_HEADER DESTINATION ${CMAKE_INSTALL_INCLUDEDIR}/fwzel/${headers} COMPONENT development)
endfunction()
fwzel_install_library(FwZel FwZel)
fwzel_install_library(FwZelCg Cg)

set(package_folder ${CMAKE_INSTALL_LIBDIR}/cmake/FwZel)
install(EXPORT FwZelTargets NAMESPACE FwZel:: DESTINATION ${package_folder} COMPONENT development)
configure_package_config_file(cmake/FwZelConfig.cmake.in ${PROJECT_BINARY_DIR}/cmake/FwZelConfig.cmake
  INSTALL_DESTINATION ${package_folder})
write_basic_package_version_file(${PROJECT_BINARY_DIR}/cmake/FwZelConfigVersion.cmake
  COMPATIBILITY SameMajorVersion)
install(FILES
  ${PROJECT_BINARY_DIR}/cmake/FwZelConfig.cmake
  ${PROJECT_BINARY_DIR}/cmake/FwZelConfigVersion.cmake
  DESTINATION ${package_folder} COMPONENT development)

# The .pc files find the prefix from where they lie, so that --prefix may differ from the configured one. The folders
# may be configured as absolute paths.
file(RELATIVE_PATH prefix_from_pc ${CMAKE_INSTALL_FULL_LIBDIR}/pkgconfig ${CMAKE_INSTALL_PREFIX})
file(RELATIVE_PATH libdir_from_prefix ${CMAKE_INSTALL_PREFIX} ${CMAKE_INSTALL_FULL_LIBDIR})
file(RELATIVE_PATH includedir_from_prefix ${CMAKE_INSTALL_PREFIX} ${CMAKE_INSTALL_FULL_INCLUDEDIR})
foreach(pc fwzel fwzel-cg)
  configure_file(cmake/${pc}.pc.in ${PROJECT_BINARY_DIR}/cmake/${pc}.pc @ONLY)
  install(FILES ${PROJECT_BINARY_DIR}/cmake/${pc}.pc
    DESTINATION ${CMAKE_INSTALL_LIBDIR}/pkgconfig COMPONENT development)
endforeach()

install(TARGETS fwzel RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT tools)
install(DIRECTORY host/Cg DESTINATION ${CMAKE_INSTALL_DATADIR}/fwzel COMPONENT tools)
install(DIRECTORY docs/man/ DESTINATION ${CMAKE_INSTALL_MANDIR}/man1 COMPONENT tools)
install(FILES tools/completion.bash RENAME fwzel
  DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions COMPONENT tools)

set(doc_folder ${CMAKE_INSTALL_DATAROOTDIR}/doc/fwzel)
install(FILES README.md CHANGELOG.md CONTRIBUTING.md SECURITY.md DESTINATION ${doc_folder} COMPONENT documentation)
install(DIRECTORY docs DESTINATION ${doc_folder} COMPONENT documentation
  PATTERN man EXCLUDE
  PATTERN CMakeLists.txt EXCLUDE
  PATTERN reference.md EXCLUDE)
install(DIRECTORY examples/installed DESTINATION ${doc_folder}/examples COMPONENT documentation)
