# The Debian package that scripts/package makes.
set(CPACK_GENERATOR DEB)
set(CPACK_PACKAGE_NAME kestrum)
set(CPACK_PACKAGE_CONTACT "Kestrum developers <developers@kestrum.invalid>")
set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
    OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_SECTION comm)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "field-test display for cellular handsets")
set(CPACK_DEBIAN_PACKAGE_DESCRIPTION
"Kestrum connects to a telephony service, subscribes to the modem's diagnostic
log and decodes it, live, into named tables of radio measurements and protocol
states: GSM/GPRS/UMTS/HSDPA, LTE, UTRAN and CDMA2000. Snapshots are saved and
read back offline.
.
It holds the display for a window and for a terminal, the telephony service
voxd, which shows the machine's own modem, replays captures and simulates
drives, and the decoder kestrum-decode, which turns captures into trees, JSON
and CSV.")

set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
# Dependencies that no program is linked to: Qt's plug-in for the SVG icon, and the window's typeface. The second
# names are those in Debian 12.
set(CPACK_DEBIAN_PACKAGE_DEPENDS
    "qt6-svg-plugins | libqt6svg6 (<< 6.8), fonts-liberation (>= 1:2) | fonts-liberation2")
set(CPACK_DEBIAN_PACKAGE_RECOMMENDS qt6-wayland)
# For voxd --modem and voxd --position.
set(CPACK_DEBIAN_PACKAGE_SUGGESTS "modemmanager, gpsd")

set(CPACK_PRE_BUILD_SCRIPTS ${CMAKE_SOURCE_DIR}/cmake/DebianDocuments.cmake)
include(CPack)
