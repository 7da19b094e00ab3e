# Where an install puts things, below any prefix (/usr for the Debian package):
#   bin/                  the programs, whose run path is $ORIGIN/../lib/wyxprogress
#   lib/wyxprogress/      the product's shared libraries, private to it (run path $ORIGIN)
#   share/wyxprogress/    read-only defaults: WyxConfig.cfg, wyx_folder.ico, LocalizedStrings/
#   share/applications/, share/icons/hicolor/   the menu entry and its icons
# The program looks for its files beside itself first (the build folder), then
# in ../share/wyxprogress, so that an install to any prefix, or a package
# unpacked anywhere, runs as it is.
set(WYX_INSTALL_BINDIR bin)
set(WYX_INSTALL_LIBDIR lib/wyxprogress)
set(WYX_INSTALL_DATADIR share/wyxprogress)

set(CMAKE_INSTALL_RPATH "$ORIGIN/../${WYX_INSTALL_LIBDIR}")
set(CMAKE_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
    OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)

# wyx_install_program(target): a program, in bin/.
function(wyx_install_program target)
    install(TARGETS ${target} RUNTIME DESTINATION ${WYX_INSTALL_BINDIR})
endfunction()

# wyx_install_library(target): a shared library of the product, beside the
# others in lib/wyxprogress; it finds its neighbours through its own folder.
function(wyx_install_library target)
    install(TARGETS ${target} LIBRARY DESTINATION ${WYX_INSTALL_LIBDIR})
    set_target_properties(${target} PROPERTIES INSTALL_RPATH "$ORIGIN")
endfunction()

# wyx_configure_package(): the Debian package (cpack -G DEB in the build
# folder). Called last, once every install rule is known.
function(wyx_configure_package)
    set(CPACK_GENERATOR DEB)
    set(CPACK_PACKAGE_NAME wyxprogress)
    set(CPACK_PACKAGE_VERSION ${PROJECT_VERSION})
    set(CPACK_PACKAGE_VENDOR "Kelvo Systems")
    set(CPACK_PACKAGE_CONTACT "WyxProgress maintainers <maintainers@users.noreply.c-seed-6155ce6f.example>")
    set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "status and log window of a hot-folder print job service")
    set(CPACK_PACKAGING_INSTALL_PREFIX /usr)
    set(CPACK_STRIP_FILES ON)
    set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
    set(CPACK_DEBIAN_PACKAGE_SECTION misc)
    set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
    # The synopsis is the summary above; this is the extended description.
    string(CONCAT CPACK_DEBIAN_PACKAGE_DESCRIPTION
        "WyxProgress shows, live, the jobs a hot-folder service is converting and\n"
        "sending to print servers, and the log of the finished ones with the\n"
        "details of the failed jobs. It reads the service's two journals in\n"
        "/var/lib/Corvane/HotFolders. The package also holds wyx-journal, which\n"
        "reads and writes those journals, the service stand-in wyx-simulator and\n"
        "wyx-inspect, which reads the window's tables over the accessibility bus.")
    # The libraries come from the programs themselves; wyx-inspect is a Python
    # script reading the accessibility bus.
    set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
    set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS_PRIVATE_DIRS ${CMAKE_BINARY_DIR}/bin)
    set(CPACK_DEBIAN_PACKAGE_DEPENDS "python3, python3-gi, gir1.2-atspi-2.0")
    set(CPACK_DEBIAN_PACKAGE_HOMEPAGE "https://kelvo.example/wyxprogress")
    include(CPack)
endfunction()
