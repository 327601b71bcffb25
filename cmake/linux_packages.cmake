# What is installed on Linux beside the programs, and the Debian packages: one for the window, one for the terminal, one
# for the virtual bench. scripts/package makes them.
set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS CHANGELOG.md)
set(maintainer "Seed 70697a80 maintainers <maintainers@users.noreply.c-seed-70697a80.example>")  # as in the commits
include(cmake/changes.cmake)
tendril_write_changes("${maintainer}")
configure_file(packaging/linux/com.kelvane.tendril_utility.metainfo.xml.in com.kelvane.tendril_utility.metainfo.xml @ONLY)

install(FILES packaging/linux/tendril-utility.desktop packaging/linux/tendril-demo.desktop
  DESTINATION "${CMAKE_INSTALL_DATADIR}/applications" COMPONENT utility)
install(FILES "${CMAKE_BINARY_DIR}/com.kelvane.tendril_utility.metainfo.xml"
  DESTINATION "${CMAKE_INSTALL_DATADIR}/metainfo" COMPONENT utility)
if(TENDRIL_CMARK)  # it names the pages
  install(FILES packaging/linux/tendril-utility.manual
    DESTINATION "${CMAKE_INSTALL_DATADIR}/doc-base" COMPONENT utility)
endif()
set(icons "${CMAKE_INSTALL_DATADIR}/icons/hicolor")
install(FILES packaging/icons/tendril-utility.svg DESTINATION "${icons}/scalable/apps" COMPONENT utility)
foreach(size 16 32 48 64 128 256)
  install(FILES packaging/icons/tendril-utility-${size}.png
    DESTINATION "${icons}/${size}x${size}/apps" RENAME tendril-utility.png COMPONENT utility)
endforeach()

# tendril_install_compressed(<file> <name> <folder> <component>): as Debian wants its documents.
function(tendril_install_compressed file name folder component)
  set(output "${CMAKE_BINARY_DIR}/compressed/${component}/${name}.gz")
  file(MAKE_DIRECTORY "${CMAKE_BINARY_DIR}/compressed/${component}")
  execute_process(COMMAND gzip -9 -n INPUT_FILE "${file}" OUTPUT_FILE "${output}" COMMAND_ERROR_IS_FATAL ANY)
  set_property(DIRECTORY APPEND PROPERTY CMAKE_CONFIGURE_DEPENDS "${file}")
  install(FILES "${output}" DESTINATION "${folder}" COMPONENT ${component})
endfunction()

foreach(page utility/utility utility/demo ctl/ctl bench/bench)
  cmake_path(GET page PARENT_PATH component)
  cmake_path(GET page FILENAME program)
  tendril_install_compressed("${PROJECT_SOURCE_DIR}/packaging/man/tendril-${program}.1" tendril-${program}.1
    "${CMAKE_INSTALL_MANDIR}/man1" ${component})
endforeach()
foreach(component utility ctl bench)
  set(folder "${CMAKE_INSTALL_DATADIR}/doc/tendril-${component}")
  install(FILES packaging/linux/copyright DESTINATION "${folder}" COMPONENT ${component})
  tendril_install_compressed("${CMAKE_BINARY_DIR}/changelog" changelog "${folder}" ${component})
endforeach()

set(zsh_folder site-functions)
if(EXISTS /etc/debian_version)
  set(zsh_folder vendor-completions)
endif()
foreach(component ctl bench)
  install(FILES packaging/completion/tendril-${component}
    DESTINATION "${CMAKE_INSTALL_DATADIR}/bash-completion/completions" COMPONENT ${component})
  install(FILES packaging/completion/_tendril-${component}
    DESTINATION "${CMAKE_INSTALL_DATADIR}/zsh/${zsh_folder}" COMPONENT ${component})
endforeach()

set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME tendril)
set(CPACK_PACKAGE_VENDOR Kelvane)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")  # each package has its own
set(CPACK_STRIP_FILES ON)
set(CPACK_COMPONENTS_ALL utility ctl bench)
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_COMPRESSION_TYPE xz)
set(CPACK_DEBIAN_PACKAGE_MAINTAINER "${maintainer}")
set(CPACK_DEBIAN_PACKAGE_SOURCE tendril)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_UTILITY_PACKAGE_NAME tendril-utility)
set(CPACK_DEBIAN_UTILITY_PACKAGE_SECTION electronics)
set(CPACK_DEBIAN_UTILITY_PACKAGE_RECOMMENDS "tendril-ctl, qt6-wayland, xdg-utils")  # the last opens the manual
set(CPACK_DEBIAN_UTILITY_DESCRIPTION [[
setup of Tendril servo controllers, in a window
A Tendril unit is a servo controller with eight ports on a Nyx serial lighting
network. The utility sets pulse ranges, stops, neutral trim, default positions
and what happens at power-up and when communication is lost. It writes them
into the unit, reads and compares them, gives the unit its ID, and moves a
servo live.

The package has a demonstration with virtual units, too.]])
set(CPACK_DEBIAN_CTL_PACKAGE_NAME tendril-ctl)
set(CPACK_DEBIAN_CTL_PACKAGE_SECTION electronics)
set(CPACK_DEBIAN_CTL_PACKAGE_SUGGESTS tendril-bench)
set(CPACK_DEBIAN_CTL_DESCRIPTION [[
setup of Tendril servo controllers, from a terminal
A Tendril unit is a servo controller with eight ports on a Nyx serial lighting
network. The program finds units, reads and writes their configurations,
compares them with files, keeps backups, and gives a new unit its ID. It is
made for many units and for scripts, and needs no display.]])
set(CPACK_DEBIAN_BENCH_PACKAGE_NAME tendril-bench)
set(CPACK_DEBIAN_BENCH_PACKAGE_SECTION electronics)
set(CPACK_DEBIAN_BENCH_DESCRIPTION [[
virtual Tendril servo controllers on a terminal device
The bench plays Tendril units on a serial line of 19200 baud, among them units
that behave badly, and a Control Panel that holds the port. It is for trying
tendril-utility and tendril-ctl, and scripts that use it, without hardware.]])

set(CPACK_SOURCE_GENERATOR TXZ)
set(CPACK_SOURCE_PACKAGE_FILE_NAME "tendril-${PROJECT_VERSION}")
set(CPACK_SOURCE_IGNORE_FILES "/build/" "/\\\\.git(/|$)" "\\\\.swp$")
include(CPack)
