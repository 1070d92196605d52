# Every outside library the project calls, each from the distribution.
find_package(PkgConfig REQUIRED)
find_package(Threads REQUIRED)
find_package(OpenSSL REQUIRED)
find_package(SQLite3 REQUIRED)
find_package(ZLIB REQUIRED)
find_package(LibXml2 REQUIRED)
find_package(JPEG REQUIRED)
pkg_check_modules(DUKTAPE REQUIRED IMPORTED_TARGET duktape)
pkg_check_modules(GSOAP REQUIRED gsoapssl++)
if(BUILD_TESTING OR NOT DEFINED BUILD_TESTING)
    find_package(GTest REQUIRED)
endif()

# The flags decide the layout of struct soap: every file that sees stdsoap2.h must take them from here.
add_library(zv_gsoap INTERFACE)
target_compile_options(zv_gsoap INTERFACE ${GSOAP_CFLAGS})
target_link_libraries(zv_gsoap INTERFACE ${GSOAP_LINK_LIBRARIES} OpenSSL::SSL OpenSSL::Crypto ZLIB::ZLIB)
