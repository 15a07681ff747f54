# The program has no command line and reads no environment variable: where it finds the device's
# files is settled here, when it is built. The defaults are the device's; the desktop presets put
# everything below the build folder.

set(ORVALA_CONFIG_FILE "/usr/local/bin/sns/config.ini" CACHE STRING "Configuration file")
set(ORVALA_PROXY_FILE "/var/sns/proxyaddr" CACHE STRING "Proxy address that the device's menu writes")
set(ORVALA_PLATFORM_SOCKET "/var/sns/platform.sock" CACHE STRING "Socket of the menu shell")
set(ORVALA_PLUGIN_DIR "/plugins" CACHE STRING "Folder of plug-ins")
set(ORVALA_FONT_FILE "/res/VelkaroSVDMedium_US_.ttf" CACHE STRING "Font of the interface")

configure_file(${CMAKE_SOURCE_DIR}/cmake/paths.h.in ${CMAKE_BINARY_DIR}/generated/paths.h)
