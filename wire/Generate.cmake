# Makes the serializers and proxies.
include(${CMAKE_CURRENT_LIST_DIR}/../cmake/Soapcpp2.cmake)
zv_soapcpp2(${CONTRACT} ${OUTPUT} ${IMPORT} -w)

# What soapcpp2 has no way to say is changed in its files. Code of another shape than is known here is an error.
function(change file)
    file(READ ${OUTPUT}/${file} code)
    while(ARGN)
        list(POP_FRONT ARGN pattern replacement)
        string(REGEX REPLACE "${pattern}" "${replacement}" changed "${code}")
        if(changed STREQUAL code)
            message(FATAL_ERROR "${file} does not look as expected: no ${pattern}")
        endif()
        set(code "${changed}")
    endwhile()
    file(WRITE ${OUTPUT}/${file} "${code}")
endfunction()

# Numbers outside of an enumeration's list occur (a script's argument): with a fixed type they are values like others.
change(soapStub.h "\nenum (ZV1__[A-Za-z]+)[ \n]*{" "\nenum \\1 : int {")

# Texts of an enumeration are the listed ones alone, its numbers are not. Text between elements is read over.
change(soapC.cpp
    "(\telse\n)\t{\tint n.\n\t\tif \\(soap_s2int[^\n]*\n\t(\t\treturn soap->error = SOAP_TYPE.)\n\t\t\\*a = \\(enum ZV1__[A-Za-z]+\\)n.\n\t}"
    "\\1\\2"
    "(if \\(soap->error == SOAP_NO_TAG)(\\)\n\t\t\t\tbreak)"
    "\\1 && !SkippedText(soap)\\2")
