# Debian packages, one a component:
#
#     scripts/install-packages package    # as root, where they are missing
#     cmake --preset package && cmake --build --preset package && (cd build/package && cpack)
#
# The packages are for the Debian that they are built on: dpkg-shlibdeps names the libraries they need.
set(FWZEL_PACKAGE_CONTACT "The FwZel authors <fwzel@example.org>" CACHE STRING "Maintainer field of the packages")

set(CPACK_GENERATOR DEB)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_PACKAGING_INSTALL_PREFIX ${CMAKE_INSTALL_PREFIX})
set(CPACK_PRE_BUILD_SCRIPTS ${CMAKE_CURRENT_LIST_DIR}/debian/FinishFiles.cmake)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "") # each package has its own
set(CPACK_PACKAGE_CONTACT ${FWZEL_PACKAGE_CONTACT})
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS
  ${PROJECT_BINARY_DIR}/gpu_renderer/FwZel ${PROJECT_BINARY_DIR}/gpu_renderer/Cg)

set(about "FwZel is for makers of renderers: textures with host buffers, pixel buffers
and framebuffers, one field a buffer where wanted, bit-exact video test
patterns, PNG and PPM readers, and Cg programs.")

# fwzel_package(component package section summary description): with what every Debian package has to hold.
function(fwzel_package component package section summary description)
  string(TOUPPER ${component} COMPONENT)
  set(CPACK_DEBIAN_${COMPONENT}_PACKAGE_NAME ${package} PARENT_SCOPE)
  set(CPACK_DEBIAN_${COMPONENT}_PACKAGE_SECTION ${section} PARENT_SCOPE)
  set(CPACK_DEBIAN_${COMPONENT}_DESCRIPTION "${summary}\n${about}\n.\n${description}" PARENT_SCOPE)
  set(folder ${CMAKE_INSTALL_DATAROOTDIR}/doc/${package})
  foreach(file copyright changelog)
    install(FILES cmake/debian/${file} DESTINATION ${folder} COMPONENT ${component})
  endforeach()
  set(overrides cmake/debian/${package}.lintian-overrides)
  if(EXISTS ${PROJECT_SOURCE_DIR}/${overrides})
    install(FILES ${overrides} RENAME ${package}
      DESTINATION ${CMAKE_INSTALL_DATAROOTDIR}/lintian/overrides COMPONENT ${component})
  endif()
endfunction()

fwzel_package(runtime libfwzel1 libs "rendering support library for broadcast video graphics"
  "This package holds the shared libraries.")
# libepoxy loads OpenGL and EGL when they are first called; what only computes does without.
set(opengl "libegl1, libgl1")
set(CPACK_DEBIAN_RUNTIME_PACKAGE_RECOMMENDS ${opengl})
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS ON)
set(CPACK_DEBIAN_PACKAGE_GENERATE_SHLIBS_POLICY >=)
set(CPACK_DEBIAN_RUNTIME_PACKAGE_CONTROL_EXTRA ${CMAKE_CURRENT_LIST_DIR}/debian/triggers)

fwzel_package(development libfwzel-dev libdevel "rendering support library for broadcast video graphics - headers"
  "This package holds what programs that use the libraries are built with.")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SHLIBDEPS OFF)
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_DEPENDS "libfwzel1 (= ${PROJECT_VERSION}), libboost-dev")
set(CPACK_DEBIAN_DEVELOPMENT_PACKAGE_SUGGESTS fwzel-doc)

fwzel_package(tools fwzel-tools graphics "test patterns and pictures on the command line"
  "This package holds the command fwzel.")
set(CPACK_DEBIAN_TOOLS_PACKAGE_DEPENDS "libfwzel1 (= ${PROJECT_VERSION})")
set(CPACK_DEBIAN_TOOLS_PACKAGE_RECOMMENDS ${opengl})

fwzel_package(documentation fwzel-doc doc "rendering support library for broadcast video graphics - documents"
  "This package holds the documents and an example.")
set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_ARCHITECTURE all)
set(CPACK_DEBIAN_DOCUMENTATION_PACKAGE_SHLIBDEPS OFF)

include(CPack)
