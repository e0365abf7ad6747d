# Installs what makes the programs system tools (man pages, bash completion,
# documentation) and describes the Debian package built by `cpack -G DEB`.
# The programs themselves are installed by their own targets (sbin).
#
# tarnhost's page and completion go with the tarnhost target: when that
# program is not built, neither is installed.

set(ORVO_PKG_PAGES orvocfg-vswitch)
set(ORVO_PKG_COMMANDS orvocfg-vswitch)
if(TARGET tarnhost)
  list(APPEND ORVO_PKG_PAGES tarnhost)
  list(APPEND ORVO_PKG_COMMANDS tarnhost)
endif()

# Man pages, section 8. Compressed at build time when gzip is there (-n: no
# name or time stamp inside, so the package is the same from build to build).
find_program(GZIP_EXECUTABLE gzip)
set(ORVO_MAN_BUILD_DIR ${PROJECT_BINARY_DIR}/man)
set(ORVO_MAN_OUTPUTS)
foreach(page IN LISTS ORVO_PKG_PAGES)
  set(source ${PROJECT_SOURCE_DIR}/docs/man/${page}.8)
  if(GZIP_EXECUTABLE)
    set(output ${ORVO_MAN_BUILD_DIR}/${page}.8.gz)
    add_custom_command(
      OUTPUT ${output}
      COMMAND ${CMAKE_COMMAND} -E make_directory ${ORVO_MAN_BUILD_DIR}
      COMMAND ${CMAKE_COMMAND} -E copy ${source} ${ORVO_MAN_BUILD_DIR}/${page}.8
      COMMAND ${GZIP_EXECUTABLE} -9 -n -f ${ORVO_MAN_BUILD_DIR}/${page}.8
      DEPENDS ${source}
      COMMENT "Compressing man page ${page}.8"
      VERBATIM)
  else()
    set(output ${source})
  endif()
  list(APPEND ORVO_MAN_OUTPUTS ${output})
endforeach()
add_custom_target(man_pages ALL DEPENDS ${ORVO_MAN_OUTPUTS})
install(FILES ${ORVO_MAN_OUTPUTS} DESTINATION ${CMAKE_INSTALL_MANDIR}/man8)

# Bash completion: one file per command, named after it, where the
# bash-completion package loads it on demand.
foreach(command IN LISTS ORVO_PKG_COMMANDS)
  install(FILES ${PROJECT_SOURCE_DIR}/completions/${command}
          DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions)
endforeach()

# Documentation: the README and docs/ (the man page sources are installed
# above, in their own place).
install(FILES ${PROJECT_SOURCE_DIR}/README.md DESTINATION ${CMAKE_INSTALL_DOCDIR})
install(DIRECTORY ${PROJECT_SOURCE_DIR}/docs/ DESTINATION ${CMAKE_INSTALL_DOCDIR}
        PATTERN man EXCLUDE)

# The Debian package.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME orvocfg-vswitch)
set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
set(CPACK_PACKAGE_VENDOR "orvocfg-vswitch developers")
set(CPACK_PACKAGE_CONTACT "orvocfg-vswitch developers <dev@orvocfg.invalid>")
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY
    "configure the virtual switches of a hypervisor host")
set(CPACK_PACKAGE_DESCRIPTION
    "orvocfg-vswitch creates and deletes standard and distributed virtual\n\
switches, manages their port groups, uplinks, VLANs, teaming and discovery\n\
settings, ENS and LAG timeouts, and lists them. This package also holds\n\
tarnhost, the administration tool of the simulated host that the tool\n\
works against.")
set(CPACK_DEBIAN_PACKAGE_MAINTAINER "orvocfg-vswitch developers <dev@orvocfg.invalid>")
set(CPACK_DEBIAN_PACKAGE_ARCHITECTURE amd64)
set(CPACK_DEBIAN_PACKAGE_SECTION admin)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
# dpkg-shlibdeps (dpkg-dev) finds the shared libraries the programs need
# (with ORVO_STATIC_RUNTIME off, libsqlite3-0 and the C++ runtime too).
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
include(CPack)
