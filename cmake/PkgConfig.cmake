# Writes vantel_bc.pc into a folder, with what a host is built with. Hosts load the plug-in: they link
# nothing, and export functions to it.
function(vantel_write_pkg_config folder prefix libraries headers)
  set(libdir "\${prefix}")
  set(includedir "\${prefix}")
  # Either may be absolute, and then stands for itself.
  cmake_path(APPEND libdir "${libraries}")
  cmake_path(APPEND includedir "${headers}")
  configure_file(${PROJECT_SOURCE_DIR}/cmake/vantel_bc.pc.in ${folder}/vantel_bc.pc @ONLY)
endfunction()
