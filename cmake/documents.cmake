# What the user reads, installed beside the programs: the manual and the format of the files. With cmark-gfm they are
# pages for a browser, made in the folder of the build; without it they stay Markdown.
find_program(TENDRIL_CMARK cmark-gfm)
set(documents "${PROJECT_SOURCE_DIR}/docs")
install(DIRECTORY docs/pictures DESTINATION "${CMAKE_INSTALL_DOCDIR}" COMPONENT utility)
install(FILES docs/configuration.schema.json docs/tendril-ctl.schema.json
  DESTINATION "${CMAKE_INSTALL_DOCDIR}" COMPONENT utility)

# The folder of the manual's chapters before they are installed, and what their file names end in.
if(NOT TENDRIL_CMARK)
  set(TENDRIL_MANUAL "${documents}/manual")
  set(TENDRIL_MANUAL_SUFFIX .md)
  install(DIRECTORY docs/manual DESTINATION "${CMAKE_INSTALL_DOCDIR}" COMPONENT utility)
  install(FILES docs/configuration-format.md DESTINATION "${CMAKE_INSTALL_DOCDIR}" COMPONENT utility)
  return()
endif()
set(TENDRIL_MANUAL "${CMAKE_BINARY_DIR}/docs/manual")
set(TENDRIL_MANUAL_SUFFIX .html)

# The contents, and the chapters that they link to.
set(contents "${documents}/manual/index.md")
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS "${contents}")
file(STRINGS "${contents}" chapters REGEX "^[0-9]+\\. ")
list(TRANSFORM chapters REPLACE "^.*\\((.*)\\.md\\).*$" "\\1")
list(PREPEND chapters index)
list(TRANSFORM chapters PREPEND manual/)
set(template "${PROJECT_SOURCE_DIR}/packaging/page.html.in")
set(script "${PROJECT_SOURCE_DIR}/cmake/page.cmake")
set(made)
foreach(document ${chapters} configuration-format)
  set(page "${CMAKE_BINARY_DIR}/docs/${document}.html")
  add_custom_command(OUTPUT "${page}" DEPENDS "${documents}/${document}.md" "${contents}" "${template}" "${script}"
    COMMAND "${CMAKE_COMMAND}" "-DCMARK=${TENDRIL_CMARK}" "-DTEMPLATE=${template}" "-DCONTENTS=${contents}"
            "-DINPUT=${documents}/${document}.md" "-DOUTPUT=${page}" -P "${script}"
    COMMENT "Writing ${document}.html" VERBATIM)
  list(APPEND made "${page}")
  cmake_path(GET document PARENT_PATH folder)
  install(FILES "${page}" DESTINATION "${CMAKE_INSTALL_DOCDIR}/${folder}" COMPONENT utility)
endforeach()

# Beside the pages, what they link to.
file(GLOB pictures "${documents}/pictures/*.png")
set(schemas "${documents}/configuration.schema.json" "${documents}/tendril-ctl.schema.json")
set(script "${PROJECT_SOURCE_DIR}/cmake/check_links.cmake")
add_custom_command(OUTPUT "${CMAKE_BINARY_DIR}/docs/links.checked" DEPENDS ${made} ${pictures} ${schemas} "${script}"
  COMMAND "${CMAKE_COMMAND}" -E rm -rf "${CMAKE_BINARY_DIR}/docs/pictures"
  COMMAND "${CMAKE_COMMAND}" -E copy_directory "${documents}/pictures" "${CMAKE_BINARY_DIR}/docs/pictures"
  COMMAND "${CMAKE_COMMAND}" -E copy ${schemas} "${CMAKE_BINARY_DIR}/docs"
  COMMAND "${CMAKE_COMMAND}" "-DFOLDER=${CMAKE_BINARY_DIR}/docs" -P "${script}"
  COMMENT "Checking the links of the manual" VERBATIM)
add_custom_target(tendril_documents ALL DEPENDS "${CMAKE_BINARY_DIR}/docs/links.checked")
