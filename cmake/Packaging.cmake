# Installs what makes the programs system tools (man pages, bash completion,
# documentation, copyright and changelog) and describes the Debian package
# built by `cpack -G DEB`. The programs themselves are installed by their own
# targets (orvocfg-vswitch in sbin, tarnhost in bin).
#
# tarnhost's page and completion go with the tarnhost target: when that
# program is not built, neither is installed.

set(ORVO_PKG_PAGES orvocfg-vswitch)
set(ORVO_PKG_COMMANDS orvocfg-vswitch)
if(TARGET tarnhost)
  list(APPEND ORVO_PKG_PAGES tarnhost)
  list(APPEND ORVO_PKG_COMMANDS tarnhost)
endif()

# Compressed copies of installed text files, made at build time when gzip is
# there (-n: no name or time stamp inside, so the package is the same from
# build to build). Sets the variable named `output` to the file to install.
find_program(GZIP_EXECUTABLE gzip)
function(orvo_compressed source output)
  if(GZIP_EXECUTABLE)
    set(compressed ${source}.gz)
    add_custom_command(
      OUTPUT ${compressed}
      COMMAND ${GZIP_EXECUTABLE} -9 -n -k -f ${source}
      DEPENDS ${source}
      VERBATIM)
    set(${output} ${compressed} PARENT_SCOPE)
  else()
    set(${output} ${source} PARENT_SCOPE)
  endif()
endfunction()

# Man pages, section 8, with the version on their .TH line (the sources hold
# @PROJECT_VERSION@).
set(ORVO_MAN_OUTPUTS)
foreach(page IN LISTS ORVO_PKG_PAGES)
  set(stamped ${PROJECT_BINARY_DIR}/man/${page}.8)
  configure_file(${PROJECT_SOURCE_DIR}/docs/man/${page}.8.in ${stamped} @ONLY)
  orvo_compressed(${stamped} output)
  list(APPEND ORVO_MAN_OUTPUTS ${output})
endforeach()
install(FILES ${ORVO_MAN_OUTPUTS} DESTINATION ${CMAKE_INSTALL_MANDIR}/man8)

# The copyright and the changelog, where Debian keeps them for every package
# (a package with no revision of its own has changelog.gz). The changelog is
# compressed from a copy in the build tree.
configure_file(${PROJECT_SOURCE_DIR}/packaging/changelog ${PROJECT_BINARY_DIR}/changelog COPYONLY)
orvo_compressed(${PROJECT_BINARY_DIR}/changelog changelog)
add_custom_target(compressed_docs ALL DEPENDS ${ORVO_MAN_OUTPUTS} ${changelog})
install(FILES ${PROJECT_SOURCE_DIR}/packaging/copyright ${changelog}
        DESTINATION ${CMAKE_INSTALL_DOCDIR})

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
set(CPACK_DEBIAN_PACKAGE_SUGGESTS bash-completion)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
# Stripped programs, root's host directory (removed on purge by postrm) and
# the lintian overrides: see DebStaging.cmake.
set(CPACK_PRE_BUILD_SCRIPTS ${PROJECT_SOURCE_DIR}/cmake/DebStaging.cmake)
set(CPACK_ORVO_STRIP ${CMAKE_STRIP})
set(CPACK_ORVO_SOURCE_DIR ${PROJECT_SOURCE_DIR})
set(CPACK_DEBIAN_PACKAGE_CONTROL_EXTRA ${PROJECT_SOURCE_DIR}/packaging/postrm)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
include(CPack)
