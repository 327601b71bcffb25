# How scripts/qt-windows builds Qt for Windows: what the programs and their tests need, with nothing from outside.
set(CMAKE_BUILD_TYPE Release CACHE STRING "")
set(QT_BUILD_EXAMPLES OFF CACHE BOOL "")
set(QT_BUILD_TESTS OFF CACHE BOOL "")
foreach(feature
    concurrent dbus printsupport sql xml  # modules
    direct2d1_1 directwrite3 gif jpeg networklistmanager pdf pkg_config schannel ssl system_zlib tuiotouch vulkan zstd
    tabletevent)  # Debian's source has no wintab.h
  set(FEATURE_${feature} OFF CACHE BOOL "")
endforeach()
set(INPUT_opengl no CACHE STRING "")
set(INPUT_openssl no CACHE STRING "")
# Made again, the libraries are the same to the byte.
set(CMAKE_SHARED_LINKER_FLAGS "-Wl,--no-insert-timestamp" CACHE STRING "")
set(CMAKE_MODULE_LINKER_FLAGS "-Wl,--no-insert-timestamp" CACHE STRING "")
