# What a program that stands on Qt needs beside itself on Windows: Qt's and the compiler's libraries, and Qt's plugins.
# The build's folder of programs has links to them; installed, they are copied.
get_target_property(qt_core Qt6::Core IMPORTED_LOCATION_RELEASE)
get_filename_component(qt_libraries "${qt_core}" DIRECTORY)
set(runtime_libraries)
foreach(module Core Gui Network Widgets)
  list(APPEND runtime_libraries "${qt_libraries}/Qt6${module}.dll")
endforeach()
foreach(library libgcc_s_seh-1.dll libstdc++-6.dll libwinpthread-1.dll)
  execute_process(COMMAND "${CMAKE_CXX_COMPILER}" "-print-file-name=${library}"
    OUTPUT_VARIABLE path OUTPUT_STRIP_TRAILING_WHITESPACE COMMAND_ERROR_IS_FATAL ANY)
  if(NOT IS_ABSOLUTE "${path}")  # the compiler does not know where it is
    find_file(${library} ${library} PATHS /usr/x86_64-w64-mingw32/lib REQUIRED NO_CACHE)
    set(path "${${library}}")
  endif()
  list(APPEND runtime_libraries "${path}")
endforeach()
set(runtime_plugins platforms/qwindows.dll styles/qwindowsvistastyle.dll)

install(FILES ${runtime_libraries} DESTINATION "${CMAKE_INSTALL_BINDIR}")
foreach(plugin ${runtime_plugins})
  get_filename_component(kind "${plugin}" DIRECTORY)
  install(FILES "${qt_libraries}/../plugins/${plugin}" DESTINATION "${CMAKE_INSTALL_BINDIR}/${kind}")
endforeach()

# The tests use these besides.
list(APPEND runtime_libraries "${qt_libraries}/Qt6Test.dll")
list(APPEND runtime_plugins platforms/qoffscreen.dll)
file(MAKE_DIRECTORY "${CMAKE_RUNTIME_OUTPUT_DIRECTORY}")
foreach(library ${runtime_libraries})
  get_filename_component(name "${library}" NAME)
  file(CREATE_LINK "${library}" "${CMAKE_RUNTIME_OUTPUT_DIRECTORY}/${name}" SYMBOLIC)
endforeach()
foreach(plugin ${runtime_plugins})
  get_filename_component(kind "${plugin}" DIRECTORY)
  file(MAKE_DIRECTORY "${CMAKE_RUNTIME_OUTPUT_DIRECTORY}/${kind}")
  file(CREATE_LINK "${qt_libraries}/../plugins/${plugin}" "${CMAKE_RUNTIME_OUTPUT_DIRECTORY}/${plugin}" SYMBOLIC)
endforeach()
