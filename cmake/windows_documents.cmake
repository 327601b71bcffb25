# What is installed on Windows beside the programs: what their user reads, as pages, for no program there opens a .md file;
# and the licences of the libraries.
set(pages)
foreach(document manual configuration-format)
  set(input "${PROJECT_SOURCE_DIR}/docs/${document}.md")
  set(template "${PROJECT_SOURCE_DIR}/packaging/windows/page.html.in")
  set(script "${PROJECT_SOURCE_DIR}/cmake/page.cmake")
  set(page "${CMAKE_BINARY_DIR}/docs/${document}.html")
  add_custom_command(OUTPUT "${page}" DEPENDS "${input}" "${template}" "${script}"
    COMMAND "${CMAKE_COMMAND}" "-DCMARK=${TENDRIL_CMARK}" "-DTEMPLATE=${template}" "-DINPUT=${input}"
            "-DOUTPUT=${page}" -P "${script}"
    COMMENT "Writing ${document}.html" VERBATIM)
  list(APPEND pages "${page}")
endforeach()
add_custom_target(tendril_pages ALL DEPENDS ${pages})
install(FILES ${pages} docs/configuration.schema.json docs/tendril-ctl.schema.json DESTINATION docs)
install(DIRECTORY docs/pictures DESTINATION docs)

# scripts/qt-windows puts these beside Qt. Qt from elsewhere comes with licences of its own.
get_target_property(qt_core Qt6::Core IMPORTED_LOCATION_RELEASE)
get_filename_component(qt "${qt_core}/../.." ABSOLUTE)
if(EXISTS "${qt}/source-version")
  file(STRINGS "${qt}/source-version" qt_source_version)
  configure_file(packaging/windows/licences.txt.in "${CMAKE_BINARY_DIR}/docs/licences.txt" @ONLY NEWLINE_STYLE CRLF)
  install(FILES "${CMAKE_BINARY_DIR}/docs/licences.txt" DESTINATION licences RENAME README.txt)
  install(DIRECTORY "${qt}/licences/" DESTINATION licences)
  install(FILES cmake/qt-windows.cmake DESTINATION licences RENAME Qt-options.cmake)
  foreach(package gcc-mingw-w64-base mingw-w64-x86-64-dev)
    install(FILES "/usr/share/doc/${package}/copyright" DESTINATION licences RENAME "${package}.txt")
  endforeach()
endif()
