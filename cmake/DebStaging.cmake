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

# lintian's findings that are not faults, each with its reason: those of
# SQLite, when it is linked in (its file header text is in the programs).
set(sqlite_header)
if(programs)
  list(GET programs 0 program)
  file(STRINGS ${program} sqlite_header LIMIT_COUNT 1 REGEX "^SQLite format 3")
endif()
if(sqlite_header)
  configure_file(${CPACK_ORVO_SOURCE_DIR}/packaging/lintian-overrides
                 ${root}/usr/share/lintian/overrides/orvocfg-vswitch COPYONLY)
endif()
