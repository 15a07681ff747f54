# What `cmake --install` puts where, and the Debian packages that tools/package makes of it: one for
# each program. Everything that a package holds is listed in the file `contents` beside its scripts;
# tools/package compares.

include(GNUInstallDirs)

set(units_dir /lib/systemd/system)

# The service goes where Debian has its programs, whatever the preset.
install(TARGETS orvala-service RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT orvala-service)
install(FILES service/packaging/orvala-service.service DESTINATION ${units_dir}
        COMPONENT orvala-service)
install(FILES service/packaging/orvala-service.conf DESTINATION /etc/orvala
        COMPONENT orvala-service)
install(FILES README.md docs/configuration.md DESTINATION share/doc/orvala-service
        COMPONENT orvala-service)

# The browser goes where it was built to look for its files. A build for the desktop looks below its
# own build folder: there is nothing to install.
string(FIND "${ORVALA_CONFIG_FILE}" "${CMAKE_BINARY_DIR}" below_build_folder)
if(below_build_folder EQUAL -1)
  cmake_path(GET ORVALA_CONFIG_FILE PARENT_PATH config_dir)
  cmake_path(GET ORVALA_CONFIG_FILE FILENAME config_name)
  cmake_path(GET ORVALA_PROXY_FILE PARENT_PATH state_dir)
  install(TARGETS orvala RUNTIME DESTINATION ${CMAKE_INSTALL_BINDIR} COMPONENT orvala)
  install(TARGETS orvala_signin LIBRARY DESTINATION ${ORVALA_PLUGIN_DIR} COMPONENT orvala
          PERMISSIONS OWNER_READ OWNER_WRITE GROUP_READ WORLD_READ)
  install(FILES config/device.ini DESTINATION ${config_dir} RENAME ${config_name} COMPONENT orvala)
  install(FILES src/packaging/orvala.service DESTINATION ${units_dir} COMPONENT orvala)
  install(DIRECTORY DESTINATION ${state_dir} COMPONENT orvala)
  install(FILES README.md docs/configuration.md DESTINATION share/doc/orvala COMPONENT orvala)

  # The interface's font under the name that the device has it; the font itself is Debian's.
  cmake_path(GET ORVALA_FONT_FILE PARENT_PATH font_dir)
  cmake_path(GET ORVALA_FONT_FILE FILENAME font_name)
  set(font_link ${CMAKE_BINARY_DIR}/generated/${font_name})
  file(CREATE_LINK /usr/share/fonts/opentype/inter/Inter-Regular.otf ${font_link} SYMBOLIC)
  install(FILES ${font_link} DESTINATION ${font_dir} COMPONENT orvala)
endif()

# Which files of a package its administrator may edit: dpkg keeps them over an upgrade.
file(WRITE ${CMAKE_BINARY_DIR}/generated/orvala/conffiles "${ORVALA_CONFIG_FILE}\n")
file(WRITE ${CMAKE_BINARY_DIR}/generated/orvala-service/conffiles
     "/etc/orvala/orvala-service.conf\n")

set(CPACK_GENERATOR DEB)
set(CPACK_SET_DESTDIR ON)
set(CPACK_INSTALL_PREFIX ${CMAKE_INSTALL_PREFIX})
set(CPACK_STRIP_FILES ON)
set(CPACK_PACKAGE_NAME orvala)
set(CPACK_PACKAGE_VENDOR Orvala)
set(CPACK_PACKAGE_CONTACT "Orvala <packages@orvala.example>")
set(CPACK_COMPONENTS_ALL orvala orvala-service)
set(CPACK_COMPONENTS_GROUPING IGNORE)
set(CPACK_DEB_COMPONENT_INSTALL ON)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)

set(CPACK_DEBIAN_ORVALA_PACKAGE_NAME orvala)
set(CPACK_DEBIAN_ORVALA_PACKAGE_SECTION graphics)
set(CPACK_COMPONENT_ORVALA_DESCRIPTION
    "Photo albums on the television\n Full-screen browser for the photos of an album service, driven by the remote control alone.")
# Loaded when the program runs, so that no library names them.
set(CPACK_DEBIAN_ORVALA_PACKAGE_DEPENDS
    "adduser, ca-certificates, fonts-inter, init-system-helpers, libqt5sql5-sqlite, tzdata")
set(CPACK_DEBIAN_ORVALA_PACKAGE_RECOMMENDS
    "fonts-droid-fallback, fonts-nanum, fonts-noto-color-emoji, fonts-noto-core")

set(CPACK_DEBIAN_ORVALA-SERVICE_PACKAGE_NAME orvala-service)
set(CPACK_DEBIAN_ORVALA-SERVICE_PACKAGE_SECTION web)
set(CPACK_COMPONENT_ORVALA-SERVICE_DESCRIPTION
    "Album service of a home\n Serves folders of photos to the album browsers of the house over HTTPS.")
set(CPACK_DEBIAN_ORVALA-SERVICE_PACKAGE_DEPENDS "adduser, init-system-helpers, procps, tzdata")

foreach(script postinst prerm postrm)
  list(APPEND CPACK_DEBIAN_ORVALA_PACKAGE_CONTROL_EXTRA
       ${CMAKE_SOURCE_DIR}/src/packaging/${script})
  list(APPEND CPACK_DEBIAN_ORVALA-SERVICE_PACKAGE_CONTROL_EXTRA
       ${CMAKE_SOURCE_DIR}/service/packaging/${script})
endforeach()
list(APPEND CPACK_DEBIAN_ORVALA_PACKAGE_CONTROL_EXTRA
     ${CMAKE_BINARY_DIR}/generated/orvala/conffiles)
list(APPEND CPACK_DEBIAN_ORVALA-SERVICE_PACKAGE_CONTROL_EXTRA
     ${CMAKE_BINARY_DIR}/generated/orvala-service/conffiles)

include(CPack)
