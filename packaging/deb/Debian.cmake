# The Debian packages: qelwatch (component viewer), basebandd (service) and qelwatch-collect (collect).

function(qel_install_documents component QEL_PACKAGE)
  set(documents ${CMAKE_INSTALL_DATADIR}/doc/${QEL_PACKAGE})
  qel_install(${component} ${documents} deb/copyright)
  qel_install_compressed(${component} deb/changelog.Debian ${documents})
endfunction()
qel_install_documents(viewer qelwatch)
qel_install_documents(service basebandd)
qel_install_documents(collect qelwatch-collect)

set(CPACK_GENERATOR DEB)
set(CPACK_COMPONENTS_ALL viewer service)
if(BUILD_COLLECTOR)
  list(APPEND CPACK_COMPONENTS_ALL collect)
endif()
set(CPACK_SET_DESTDIR ON)  # some files go to /etc
set(CPACK_INSTALL_PREFIX /usr)
set(CPACK_STRIP_FILES ON)
set(CPACK_PACKAGE_DESCRIPTION_SUMMARY "")  # each package has its own
set(CPACK_PACKAGE_CONTACT "The qelwatch authors <qelwatch@users.noreply.invalid>")
set(CPACK_INSTALL_DEFAULT_DIRECTORY_PERMISSIONS
  OWNER_READ OWNER_WRITE OWNER_EXECUTE GROUP_READ GROUP_EXECUTE WORLD_READ WORLD_EXECUTE)

set(CPACK_DEB_COMPONENT_INSTALL ON)
if(CMAKE_CROSSCOMPILING)  # else it is the builder's
  execute_process(COMMAND dpkg-architecture -t ${CMAKE_LIBRARY_ARCHITECTURE} -q DEB_HOST_ARCH
                  OUTPUT_VARIABLE CPACK_DEBIAN_PACKAGE_ARCHITECTURE OUTPUT_STRIP_TRAILING_WHITESPACE)
endif()
set(CPACK_DEBIAN_FILE_NAME DEB-DEFAULT)
set(CPACK_DEBIAN_PACKAGE_RELEASE 1)
set(CPACK_DEBIAN_PACKAGE_SECTION comm)
set(CPACK_DEBIAN_PACKAGE_PRIORITY optional)
set(CPACK_DEBIAN_PACKAGE_SHLIBDEPS ON)
set(CPACK_DEBIAN_PACKAGE_CONTROL_STRICT_PERMISSION ON)
set(CPACK_DEBIAN_COMPRESSION_TYPE xz)

# The modules that the interface imports, and the way to a phone's compositor; programs link none of them.
set(CPACK_DEBIAN_VIEWER_PACKAGE_NAME qelwatch)
set(CPACK_DEBIAN_VIEWER_PACKAGE_DEPENDS
  "qml6-module-qtquick, qml6-module-qtqml, qml6-module-qtqml-models, qml6-module-qtqml-workerscript, qt6-wayland")
set(CPACK_DEBIAN_VIEWER_PACKAGE_RECOMMENDS "basebandd")
set(CPACK_COMPONENT_VIEWER_DESCRIPTION
"cellular diagnostics viewer for phones
qelwatch sits beside the phone's baseband manager service and shows what the
modem reports about LTE, UMTS and GSM: serving cell, neighbours, signal,
transmit power, RRC states, carrier aggregation, reselection parameters, NAS
contexts, bearers and SIM files.

The package has the viewer, for touch and for desktops, and qelctl, which
shows, records and replays the same values on the command line. Both also
work without a modem: on a simulated drive or on a recording.")

set(CPACK_DEBIAN_SERVICE_PACKAGE_NAME basebandd)
set(CPACK_DEBIAN_SERVICE_PACKAGE_DEPENDS "adduser, default-dbus-system-bus | dbus-system-bus")
set(CPACK_DEBIAN_SERVICE_PACKAGE_RECOMMENDS "modemmanager, polkitd")
set(CPACK_DEBIAN_SERVICE_PACKAGE_CONTROL_EXTRA
  ${CMAKE_CURRENT_LIST_DIR}/basebandd/postinst ${CMAKE_CURRENT_LIST_DIR}/basebandd/prerm
  ${CMAKE_CURRENT_LIST_DIR}/basebandd/postrm ${CMAKE_CURRENT_LIST_DIR}/basebandd/conffiles)
set(CPACK_COMPONENT_SERVICE_DESCRIPTION
"baseband manager service
basebandd offers what a phone's modem reports about its cells to programs on
the system bus that are run by root or by members of the group baseband. It
reads a modem through ModemManager, with the rights that this package gives
it, a recording or a simulated phone.")

set(CPACK_DEBIAN_COLLECT_PACKAGE_NAME qelwatch-collect)
set(CPACK_DEBIAN_COLLECT_PACKAGE_RECOMMENDS qelwatch)  # its qelctl, not its viewer
set(CPACK_DEBIAN_COLLECT_PACKAGE_SUGGESTS "mosquitto, postgresql")
set(CPACK_COMPONENT_COLLECT_DESCRIPTION
"what many phones report, in a PostgreSQL database
With this package the subcommand collect of qelctl stores what phones send to
an MQTT broker in tables, each event once. As many collectors as needed share
the load. It is for whoever runs a fleet; phones need it not.")

include(CPack)
