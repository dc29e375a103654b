# Third-party libraries, all from Debian packages (scripts/setup.sh installs them).
find_package(PkgConfig REQUIRED)
pkg_check_modules(EXPAT REQUIRED IMPORTED_TARGET expat)
pkg_check_modules(MINIZIP REQUIRED IMPORTED_TARGET minizip)
pkg_check_modules(QPDF REQUIRED IMPORTED_TARGET libqpdf)
find_package(pugixml REQUIRED)
find_package(ZLIB REQUIRED)
