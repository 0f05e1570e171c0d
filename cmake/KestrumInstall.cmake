# The files of `cmake --install` and their places. DESTDIR and the prefix apply.
include(GNUInstallDirs)

install(TARGETS kestrum kestrum-terminal voxd kestrum-decode)
file(GLOB templates CONFIGURE_DEPENDS resources/*.plist)
install(FILES ${templates} DESTINATION ${CMAKE_INSTALL_DATADIR}/kestrum)

install(FILES resources/kestrum.desktop DESTINATION ${CMAKE_INSTALL_DATADIR}/applications)
install(FILES resources/org.kestrum.kestrum.metainfo.xml DESTINATION ${CMAKE_INSTALL_DATADIR}/metainfo)
set(icons ${CMAKE_INSTALL_DATADIR}/icons/hicolor)
install(FILES resources/kestrum.svg DESTINATION ${icons}/scalable/apps)
foreach(size 16 22 24 32 48 64 128 256)
    install(FILES resources/icons/${size}.png DESTINATION ${icons}/${size}x${size}/apps RENAME kestrum.png)
endforeach()

# The unit contains the program's path, which depends on the prefix of this installation.
install(CODE "
    set(bindir \"\${CMAKE_INSTALL_PREFIX}/${CMAKE_INSTALL_BINDIR}\")
    configure_file(\"${CMAKE_SOURCE_DIR}/resources/voxd.service.in\" \"${CMAKE_BINARY_DIR}/voxd.service\" @ONLY)")
install(FILES ${CMAKE_BINARY_DIR}/voxd.service DESTINATION lib/systemd/user)

install(FILES docs/man/kestrum.1 docs/man/kestrum-terminal.1 docs/man/voxd.1 docs/man/kestrum-decode.1
    DESTINATION ${CMAKE_INSTALL_MANDIR}/man1)
install(FILES docs/man/kestrum-formats.5 DESTINATION ${CMAKE_INSTALL_MANDIR}/man5)

foreach(program kestrum-terminal voxd kestrum-decode)
    install(FILES resources/completions/${program}.bash
        DESTINATION ${CMAKE_INSTALL_DATADIR}/bash-completion/completions RENAME ${program})
    install(FILES resources/completions/_${program} DESTINATION ${CMAKE_INSTALL_DATADIR}/zsh/site-functions)
    install(FILES resources/completions/${program}.fish DESTINATION ${CMAKE_INSTALL_DATADIR}/fish/vendor_completions.d)
endforeach()

# Examples for administrators: in use they would change the machine's policies.
install(FILES resources/modem/kestrum-modem.conf resources/modem/50-kestrum-modem.rules
    DESTINATION ${CMAKE_INSTALL_DATADIR}/doc/kestrum/examples)
