# Run by `cpack -G DEB` on the installed files before they are packed: what
# only the Debian package has.
set(root ${CPACK_TEMPORARY_DIRECTORY})

# The programs, stripped as Debian strips them: no symbols, no compiler notes.
file(GLOB programs ${root}/usr/bin/* ${root}/usr/sbin/*)
foreach(program IN LISTS programs)
  execute_process(
    COMMAND ${CPACK_ORVO_STRIP} --remove-section=.comment --remove-section=.note ${program}
    COMMAND_ERROR_IS_FATAL ANY)
endforeach()

# Root's default host lives here; postrm removes it with the host on purge.
file(MAKE_DIRECTORY ${root}/var/lib/tarnhost)

# lintian's findings that are not faults, each with its reason.
configure_file(${CPACK_ORVO_SOURCE_DIR}/packaging/lintian-overrides
               ${root}/usr/share/lintian/overrides/orvocfg-vswitch COPYONLY)
