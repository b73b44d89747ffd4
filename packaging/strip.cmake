# Run by cpack over what it has installed. Strips as Debian does; cpack's own way leaves .comment behind.
file(GLOB programs ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*/usr/bin/*
     ${CPACK_TEMPORARY_INSTALL_DIRECTORY}/*/usr/lib/*/*.so.${CPACK_PACKAGE_VERSION})
execute_process(COMMAND ${CPACK_VANTEL_STRIP} --strip-unneeded --remove-section=.comment
                        --remove-section=.note ${programs} COMMAND_ERROR_IS_FATAL ANY)
