# The licences of the libraries that are installed for Windows. scripts/qt-windows puts them beside Qt. Qt from elsewhere
# comes with licences of its own.
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
