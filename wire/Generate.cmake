# Makes the serializers and proxies.
include(${CMAKE_CURRENT_LIST_DIR}/../cmake/Soapcpp2.cmake)
zv_soapcpp2(${CONTRACT} ${OUTPUT} ${IMPORT} -w)

# Numbers outside of an enumeration's list occur (a script's argument, a newer service): with a fixed type they are values
# like others. soapcpp2 has no way to say so.
file(READ ${OUTPUT}/soapStub.h stub)
string(REGEX REPLACE "\nenum (ZV1__[A-Za-z]+)[ \n]*{" "\nenum \\1 : int {" stub "${stub}")
file(WRITE ${OUTPUT}/soapStub.h "${stub}")
