# Runs soapcpp2, which writes its files and ends with 0 even after some errors: its output decides as well.
execute_process(
    COMMAND ${SOAPCPP2} -1 -i -C -L -x -w -I${IMPORT} -d${OUTPUT} ${CONTRACT}
    RESULT_VARIABLE result OUTPUT_VARIABLE output ERROR_VARIABLE output)
if(result OR NOT output MATCHES "Compilation successful" OR output MATCHES "\\*(WARNING|ERROR)\\*|[Ee]rror:")
    message(FATAL_ERROR "soapcpp2 does not accept the contract:\n${output}")
endif()

# Numbers outside of an enumeration's list occur (a script's argument, a newer service): with a fixed type they are values
# like others. soapcpp2 has no way to say so.
file(READ ${OUTPUT}/soapStub.h stub)
string(REGEX REPLACE "\nenum (ZV1__[A-Za-z]+)[ \n]*{" "\nenum \\1 : int {" stub "${stub}")
file(WRITE ${OUTPUT}/soapStub.h "${stub}")
