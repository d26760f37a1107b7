# A Debian of another architecture builds for $QEL_TRIPLET: with the cross compiler and with the
# libraries of that architecture, which Debian installs beside the builder's own. What runs while
# building (moc, protoc, our generators) is the builder's; what was built runs under qemu.
set(CMAKE_SYSTEM_NAME Linux)
set(CMAKE_LIBRARY_ARCHITECTURE ${QEL_TRIPLET})
set(CMAKE_C_COMPILER ${QEL_TRIPLET}-gcc)
set(CMAKE_CXX_COMPILER ${QEL_TRIPLET}-g++)

execute_process(COMMAND dpkg-architecture -qDEB_BUILD_MULTIARCH
                OUTPUT_VARIABLE QEL_BUILDER OUTPUT_STRIP_TRAILING_WHITESPACE)
set(CMAKE_PREFIX_PATH /usr/lib/${QEL_TRIPLET}/cmake)
set(CMAKE_IGNORE_PREFIX_PATH /usr/lib/${QEL_BUILDER})
set(QT_HOST_PATH /usr)
set(QT_HOST_PATH_CMAKE_DIR /usr/lib/${QEL_BUILDER}/cmake)

# What pkg-config knows is that architecture's too.
set(ENV{PKG_CONFIG_LIBDIR} ${CMAKE_SYSROOT}/usr/lib/${QEL_TRIPLET}/pkgconfig:${CMAKE_SYSROOT}/usr/share/pkgconfig)
