# Run by CPack on what is installed, before it is packed: Debian wants manual pages and changelogs compressed, and
# programs without what only debuggers read.
file(GLOB_RECURSE files LIST_DIRECTORIES false ${CPACK_TEMPORARY_DIRECTORY}/*)
foreach(file IN LISTS files)
  if(IS_SYMLINK ${file})
    continue()
  endif()
  if(file MATCHES "/man1/[^/]+\\.1$|/changelog$")
    execute_process(COMMAND gzip -9nf ${file} COMMAND_ERROR_IS_FATAL ANY)
  elseif(file MATCHES "/bin/[^/]+$|\\.so\\.[0-9.]+$")
    execute_process(COMMAND strip --strip-unneeded --remove-section=.comment ${file} COMMAND_ERROR_IS_FATAL ANY)
  endif()
endforeach()
