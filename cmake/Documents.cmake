# What people read: pages and completions of the command, documents, examples, terms.
set(MRTU_DOCUMENT_DIR share/doc/mrtu)

if(MRTU_TOOLS)
  install(DIRECTORY "${MRTU_MANUAL_FOLDER}/man1" COMPONENT runtime DESTINATION share/man
    FILES_MATCHING PATTERN "*.1.gz")
  set(completions "${MRTU_MANUAL_FOLDER}/completions")
  install(FILES "${completions}/mrtu.bash" COMPONENT runtime RENAME mrtu
    DESTINATION share/bash-completion/completions)
  # Where Debian's zsh looks for what packages bring.
  install(FILES "${completions}/_mrtu" COMPONENT runtime DESTINATION share/zsh/vendor-completions)
  install(FILES "${completions}/mrtu.fish" COMPONENT runtime
    DESTINATION share/fish/vendor_completions.d)
endif()

# The folders as in the source tree, so that the links in the texts lead somewhere.
install(FILES README.md CHANGELOG.md CONTRIBUTING.md COMPONENT runtime
  DESTINATION ${MRTU_DOCUMENT_DIR})
install(DIRECTORY docs COMPONENT runtime DESTINATION ${MRTU_DOCUMENT_DIR}
  FILES_MATCHING PATTERN "*.md")
install(DIRECTORY examples COMPONENT development DESTINATION ${MRTU_DOCUMENT_DIR}
  REGEX "examples/CMakeLists.txt$" EXCLUDE)
install(FILES cmake/package/copyright COMPONENT runtime DESTINATION ${MRTU_DOCUMENT_DIR})

# The terms of what is compiled in, as this machine's packages state them.
string(REGEX MATCH "^[0-9]+" compiler_version "${CMAKE_CXX_COMPILER_VERSION}")
foreach(package libcli11-dev nlohmann-json3-dev gcc-${compiler_version}-base)
  if(EXISTS "/usr/share/doc/${package}/copyright")
    install(FILES "/usr/share/doc/${package}/copyright" COMPONENT runtime RENAME ${package}
      DESTINATION ${MRTU_DOCUMENT_DIR}/licenses)
  endif()
endforeach()
