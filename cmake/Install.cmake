# Where everything goes. Three components, which become packages of their own: provider,
# platform, host.
include(GNUInstallDirs)

# Configuration of a system-wide installation is in /etc, whatever its prefix.
if(CMAKE_INSTALL_PREFIX STREQUAL "/usr")
  set(qelo_config_dir /etc)
else()
  set(qelo_config_dir ${CMAKE_INSTALL_SYSCONFDIR})
endif()

# Object managers look for providers in lib/cmpi, whatever the architecture's library folder.
set(QELO_PROVIDER_DIR lib/cmpi)
# The platform's libraries are found relative to who needs them. RUNPATH is looked at after
# LD_LIBRARY_PATH, and the provider's own folder first of all: an agent's libraries of the
# same sonames can take their place either way.
set(QELO_PRIVATE_DIR lib/qelosim)

set(qelo_provider_targets qelosimpleidentitymanagementprofileprovider qelocomputersystemprovider)
set(qelo_platform_targets qeloinstrumentationenvelope qeloCvLogger qeloteskcommon qelotesklocale
  qeloproviderutilities)

# The last place is for object managers that want links in a folder of their own: $ORIGIN is
# the folder of the link then.
set_target_properties(${qelo_provider_targets} PROPERTIES
  INSTALL_RPATH "$ORIGIN;$ORIGIN/../qelosim;${CMAKE_INSTALL_PREFIX}/${QELO_PRIVATE_DIR}")
set_target_properties(${qelo_platform_targets} PROPERTIES INSTALL_RPATH "$ORIGIN")
set_target_properties(qelosim PROPERTIES INSTALL_RPATH "$ORIGIN/../${QELO_PRIVATE_DIR}")

install(TARGETS ${qelo_provider_targets} LIBRARY DESTINATION ${QELO_PROVIDER_DIR} COMPONENT provider)
install(TARGETS ${qelo_platform_targets} LIBRARY DESTINATION ${QELO_PRIVATE_DIR}
  COMPONENT platform NAMELINK_SKIP)
install(TARGETS qelosim RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT host)

# Schema and registration go with the provider: every object manager needs them.
install(FILES schema/qualifiers.mof schema/cim_core.mof schema/qelosim.mof schema/qelosim.reg
  DESTINATION ${CMAKE_INSTALL_DATADIR}/qelosim COMPONENT provider)
install(FILES schema/pegasus/registration.mof
  DESTINATION ${CMAKE_INSTALL_DATADIR}/qelosim/pegasus COMPONENT provider)
configure_file(packaging/qelosim-register qelosim-register @ONLY)
install(PROGRAMS ${CMAKE_BINARY_DIR}/qelosim-register DESTINATION ${CMAKE_INSTALL_SBINDIR}
  COMPONENT provider)

install(FILES platform/logging/logging.conf DESTINATION ${qelo_config_dir}/qelosim
  COMPONENT platform)

configure_file(packaging/qelosim.service qelosim.service @ONLY)
install(FILES ${CMAKE_BINARY_DIR}/qelosim.service DESTINATION lib/systemd/system COMPONENT host)
install(FILES packaging/qelosim.pam DESTINATION ${qelo_config_dir}/pam.d
  RENAME qelosim COMPONENT host)
install(FILES packaging/serve.conf DESTINATION ${qelo_config_dir}/qelosim COMPONENT host)
install(FILES completion/qelosim.bash
  DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions RENAME qelosim COMPONENT host)

# qelo_manual(COMPONENT PAGE...): manual pages, compressed without a time stamp.
find_program(QELO_GZIP gzip REQUIRED)
function(qelo_manual component)
  foreach(page IN LISTS ARGN)
    string(REGEX REPLACE "^.*\\." "" section ${page})
    set(compressed ${CMAKE_BINARY_DIR}/man/${page}.gz)
    add_custom_command(OUTPUT ${compressed}
      COMMAND ${CMAKE_COMMAND} -E make_directory ${CMAKE_BINARY_DIR}/man
      COMMAND ${QELO_GZIP} -9nc ${PROJECT_SOURCE_DIR}/docs/man/${page} > ${compressed}
      DEPENDS ${PROJECT_SOURCE_DIR}/docs/man/${page} VERBATIM)
    add_custom_target(man_${page} ALL DEPENDS ${compressed})
    install(FILES ${compressed} DESTINATION ${CMAKE_INSTALL_MANDIR}/man${section}
      COMPONENT ${component})
  endforeach()
endfunction()
qelo_manual(host qelosim.1 qelosim-serve.8)
qelo_manual(provider qelosim-register.8)
qelo_manual(platform qelosim-logging.conf.5)
