# Documents of the project in packages, where they stand elsewhere than here.

# Where a document, or what documents link to, stands in the folder of a package's documents.
function(vantel_packaged_name result file)
  string(REGEX REPLACE "^docs/(minimal_host.c)$" "examples/\\1" name ${file})
  string(REGEX REPLACE "^(docs|tools/simptp4l)/" "" name ${name})
  string(REGEX REPLACE "^README" "simptp4l" name ${name})
  string(REGEX REPLACE "^tools/host/README" "vantel-host" name ${name})
  set(${result} ${name} PARENT_SCOPE)
endfunction()

# The links of a document lead from where it stands to where the others do. One to what the package does
# not hold becomes its text.
function(vantel_relink result document)
  file(READ ${PROJECT_SOURCE_DIR}/${document} text)
  cmake_path(GET document PARENT_PATH folder)
  foreach(file IN LISTS ARGN)
    cmake_path(RELATIVE_PATH file BASE_DIRECTORY ${folder} OUTPUT_VARIABLE link)
    vantel_packaged_name(name ${file})
    string(REPLACE "](${link})" "](@${name})" text "${text}")
    string(REPLACE "](${link}#" "](@${name}#" text "${text}")
  endforeach()
  string(REPLACE "](https:" "](@https:" text "${text}")
  string(REGEX REPLACE "\\[([^][]*)\\]\\([^@#)][^)]*\\)" "\\1" text "${text}")
  string(REPLACE "](@" "](" text "${text}")
  set(${result} "${text}" PARENT_SCOPE)
endfunction()

# Installs the documents among the project's files into a package; they may link to all of the files.
function(vantel_package_documents component package)
  set(documents ${ARGN})
  list(FILTER documents INCLUDE REGEX "\\.md$")
  foreach(document IN LISTS documents)
    vantel_relink(text ${document} ${ARGN})
    vantel_packaged_name(name ${document})
    set(relinked ${CMAKE_CURRENT_BINARY_DIR}/${package}/${name})
    file(WRITE ${relinked} "${text}")
    set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS
                                           ${PROJECT_SOURCE_DIR}/${document})
    vantel_package_files(${component} share/doc/${package} ${relinked})
  endforeach()
endfunction()
