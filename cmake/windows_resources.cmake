# tendril_windows_resources(<program> <description>): the icon, the version and the manifest of a program for Windows.
function(tendril_windows_resources program description)
  set(templates "${PROJECT_SOURCE_DIR}/packaging/windows")
  set(folder "${CMAKE_CURRENT_BINARY_DIR}/resources")
  foreach(kind manifest rc)
    configure_file("${templates}/program.${kind}.in" "${folder}/${program}.${kind}" @ONLY)
  endforeach()
  target_sources(${program} PRIVATE "${folder}/${program}.rc")
  # The resource compiler does not report what it reads.
  set_source_files_properties("${folder}/${program}.rc" PROPERTIES
    OBJECT_DEPENDS "${folder}/${program}.manifest;${PROJECT_SOURCE_DIR}/packaging/icons/tendril-utility.ico"
    INCLUDE_DIRECTORIES "${folder}")
  if(MSVC)
    target_link_options(${program} PRIVATE /MANIFEST:NO)  # or the linker adds one of its own
  endif()
endfunction()
