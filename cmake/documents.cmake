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

# tendril_page(<document> [<page>=<text> ...]): docs/<document>.md as a page, with these links above and below. A page is
# named without its suffix.
set(made)
function(tendril_page document)
  set(input "${documents}/${document}.md")
  set(page "${CMAKE_BINARY_DIR}/docs/${document}.html")
  set(template "${PROJECT_SOURCE_DIR}/packaging/page.html.in")
  set(script "${PROJECT_SOURCE_DIR}/cmake/page.cmake")
  add_custom_command(OUTPUT "${page}" DEPENDS "${input}" "${template}" "${script}"
    COMMAND "${CMAKE_COMMAND}" "-DCMARK=${TENDRIL_CMARK}" "-DTEMPLATE=${template}" "-DINPUT=${input}" "-DOUTPUT=${page}"
            "-DLINKS=${ARGN}" -P "${script}"
    COMMENT "Writing ${document}.html" VERBATIM)
  cmake_path(GET document PARENT_PATH folder)
  install(FILES "${page}" DESTINATION "${CMAKE_INSTALL_DOCDIR}/${folder}" COMPONENT utility)
  set(made ${made} "${page}" PARENT_SCOPE)
endfunction()

# The chapters are those that the contents link to. Each leads to the next one.
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS "${documents}/manual/index.md")
file(STRINGS "${documents}/manual/index.md" chapters REGEX "^[0-9]+\\. ")
list(TRANSFORM chapters REPLACE "^[0-9]+\\. .(.*)\\]\\((.*)\\.md\\)$" "\\2=\\1")
list(REVERSE chapters)
set(next)
foreach(chapter IN LISTS chapters)
  string(REGEX REPLACE "=.*" "" name "${chapter}")
  tendril_page(manual/${name} "index=Contents" ${next})
  string(REPLACE "=" "=Next: " next "${chapter}")
endforeach()
tendril_page(manual/index)
tendril_page(configuration-format "manual/index=Manual")

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
