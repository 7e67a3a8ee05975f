# Debian packages, made by tools/package: qelosim-platform, qelosim-provider, qelosim-host, and
# qelosim, which is all of them.
set(CPACK_GENERATOR DEB)
# Each package has a summary of its own.
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")
set(CPACK_PACKAGE_NAME qelosim)
set(CPACK_PACKAGE_VENDOR "qelosim")
set(CPACK_PACKAGE_CONTACT "qelosim developers <developers@qelosim.test>")
set(CPACK_PACKAGE_HOMEPAGE_URL "")
# Files outside the prefix, those in /etc, go along only this way.
set(CPACK_SET_DESTDIR ON)
set(CPACK_PACKAGE_DIRECTORY ${CMAKE_BINARY_DIR}/packages)
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
  OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)

set(CPACK_COMPONENTS_ALL platform provider host meta)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION admin)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${CMAKE_BINARY_DIR}/lib)

set(qelo_version "${PROJECT_VERSION}-${CPACK_DEBIAN_PACKAGE_RELEASE}")

# qelo_package(COMPONENT SUMMARY DESCRIPTION DEPENDS)
macro(qelo_package component summary description depends)
  string(TOUPPER ${component} upper)
  if(${component} STREQUAL meta)
    set(package qelosim)
  else()
    set(package qelosim-${component})
  endif()
  set(CPACK_DEBIAN_${upper}_PACKAGE_NAME ${package})
  set(CPACK_DEBIAN_${upper}_DESCRIPTION "${summary}\n${description}")
  set(CPACK_DEBIAN_${upper}_PACKAGE_DEPENDS "${depends}")
  set(control)
  foreach(file conffiles postinst prerm postrm)
    if(EXISTS ${PROJECT_SOURCE_DIR}/packaging/${component}/${file})
      list(APPEND control ${PROJECT_SOURCE_DIR}/packaging/${component}/${file})
    endif()
  endforeach()
  set(CPACK_DEBIAN_${upper}_PACKAGE_CONTROL_EXTRA "${control}")
  if(EXISTS ${PROJECT_SOURCE_DIR}/packaging/${component}/lintian-overrides)
    install(FILES packaging/${component}/lintian-overrides
      DESTINATION ${CMAKE_INSTALL_DATADIR}/lintian/overrides RENAME ${package}
      COMPONENT ${component})
  endif()
  install(FILES packaging/copyright DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${package}
    COMPONENT ${component})
  install(FILES ${CMAKE_BINARY_DIR}/changelog.gz
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/${package} RENAME changelog.Debian.gz
    COMPONENT ${component})
endmacro()

add_custom_command(OUTPUT ${CMAKE_BINARY_DIR}/changelog.gz
  COMMAND ${QELO_GZIP} -9nc ${PROJECT_SOURCE_DIR}/packaging/changelog > ${CMAKE_BINARY_DIR}/changelog.gz
  DEPENDS ${PROJECT_SOURCE_DIR}/packaging/changelog VERBATIM)
add_custom_target(qelo_changelog ALL DEPENDS ${CMAKE_BINARY_DIR}/changelog.gz)

qelo_package(platform "stand-alone platform of the qelosim CIM provider"
  "Reads and changes the local accounts and groups (passwd, shadow, group,
gshadow) for the CIM provider, and has its logging and its captions."
  "passwd")
qelo_package(provider "CIM provider for local accounts and groups (CMPI)"
  "Serves the DMTF Simple Identity Management profile through CMPI 2.0:
provider libraries, class schema, registration for SFCB and OpenPegasus."
  "qelosim-platform (= ${qelo_version})")
qelo_package(host "stand-alone CIM object manager for accounts"
  "Serves CIM clients over HTTP and HTTPS, and shows and changes local
accounts and groups on the command line."
  "qelosim-provider (= ${qelo_version}), qelosim-platform (= ${qelo_version})")
qelo_package(meta "CIM management of local accounts and groups"
  "Installs the CIM provider for the Simple Identity Management profile with
its platform and its object manager."
  "qelosim-host (= ${qelo_version}), qelosim-provider (= ${qelo_version}), qelosim-platform (= ${qelo_version})")
set(CPACK_DEBIAN_META_PACKAGE_SHLIBDEPS OFF)
set(CPACK_DEBIAN_META_PACKAGE_ARCHITECTURE all)
set(CPACK_DEBIAN_META_PACKAGE_SECTION metapackages)

include(CPack)
