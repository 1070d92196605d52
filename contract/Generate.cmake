# Makes the WSDL of each service and the schema of their common namespace out of WIRE, in OUTPUT. Run by the build.
#
# soapcpp2 writes both. Around it: a run for each service, since one run for all leaves out the messages that two services
# share; what each operation is for, from the comment above its request in WIRE; the header blocks of every request; and
# afterwards one schema file for the three WSDLs in the place of a copy in each, which imports what the blocks need from
# the files beside it instead of from the network.
include(${CMAKE_CURRENT_LIST_DIR}/../cmake/Soapcpp2.cmake)

set(api http://api.zorvane.example/api/)
set(wsse http://docs.oasis-open.org/wss/2004/01/oasis-200401-wss-wssecurity-secext-1.0.xsd)
set(wsa http://schemas.xmlsoap.org/ws/2004/08/addressing)
set(soap http://schemas.xmlsoap.org/soap/envelope/)

# The services: WSDL, file of WIRE, the device's settings block.
set(services RealTimeBrowse DownloadAPI StreamAPI)
set(file_RealTimeBrowse browse.h)
set(file_DownloadAPI account.h)
set(file_StreamAPI stream.h)
set(settings_RealTimeBrowse DeviceSettings)
set(settings_DownloadAPI DownloadDeviceRequestSettings)
set(settings_StreamAPI StreamDeviceRequestSettings)
set(blocks wsse__Security wsa__MessageID wsa__ReplyTo wsa__To wsa__Action)

set(messages "")
foreach(service ${services})
    file(READ ${WIRE}/${file_${service}} text)
    string(APPEND messages "\n${text}")
endforeach()

# The comment above an operation's request.
function(find_documentation operation result)
    if(NOT messages MATCHES "((// [^\n]*\n)+)class _ZV1__${operation} {")
        message(FATAL_ERROR "no comment above class _ZV1__${operation} says what the operation is for")
    endif()
    string(REGEX REPLACE "// ([^\n]*)\n" " \\1" text "${CMAKE_MATCH_1}")
    string(STRIP "${text}" text)
    set(${result} "${text}" PARENT_SCOPE)
endfunction()

# The files of WIRE for a service alone, in FOLDER: with its own operations, documented and with their header blocks, and
# with the messages only of the others.
function(write_input service folder)
    foreach(other ${services})
        file(READ ${WIRE}/${file_${other}} text)
        if(other STREQUAL service)
            string(REGEX MATCH "^// ([^\n]*)" purpose "${text}")
            set(purpose "${CMAKE_MATCH_1}")
            string(REGEX MATCH "//gsoap (ZV[0-9]) service name" prefix "${text}")
            set(directive "//gsoap ${CMAKE_MATCH_1} service")
            string(APPEND text "${directive} documentation: ${purpose}\n")
            string(REGEX MATCHALL "method-action: [A-Za-z0-9_]+" operations "${text}")
            list(TRANSFORM operations REPLACE "method-action: " "")
            foreach(operation ${operations})
                find_documentation(${operation} documentation)
                string(APPEND text "${directive} method-documentation: ${operation} ${documentation}\n")
                foreach(block ${blocks} ZV1__${settings_${service}}_)
                    string(APPEND text "${directive} method-input-header-part: ${operation} ${block}\n")
                endforeach()
            endforeach()
        else()
            string(REGEX REPLACE "(//gsoap|int __)[^\n]*\n" "" text "${text}")
        endif()
        file(WRITE ${folder}/${file_${other}} "${text}")
    endforeach()
endfunction()

# The text without namespaces that nothing in it names.
function(drop_unused_prefixes text result)
    string(REGEX REPLACE "\n *xmlns:(SOAP-ENC|xsi|c14n|wsu|xenc|wsc|ds|HTTP|MIME|DIME|WSDL|ZV[2-5])=\"[^\"]*\"" ""
           text "${text}")
    set(${result} "${text}" PARENT_SCOPE)
endfunction()

function(write_wsdl service folder)
    file(READ ${folder}/${service}Soap12.wsdl text)
    string(FIND "${text}" "<types>" begin)
    string(FIND "${text}" "</types>" end)
    string(SUBSTRING "${text}" 0 ${begin} head)
    string(SUBSTRING "${text}" ${end} -1 rest)
    drop_unused_prefixes("${head}" head)
    string(REGEX REPLACE "\n *xmlns:SOAP-ENV=\"[^\"]*\"" "" head "${head}")
    # The header message lists every block that any service knows.
    string(REGEX MATCHALL "  <part name=\"[A-Za-z]+\" element=\"(wsse|wsa|ZV1):[A-Za-z]+\"/>\n" parts "${rest}")
    foreach(part ${parts})
        string(REGEX REPLACE "  <part name=\"([A-Za-z]+)\".*" "\\1" name "${part}")
        if(NOT name STREQUAL Body AND NOT rest MATCHES "<SOAP:header [^\n]*part=\"${name}\"")
            string(REPLACE "${part}" "" rest "${rest}")
        endif()
    endforeach()
    file(WRITE ${OUTPUT}/${service}.wsdl "${head}<types>
  <xsd:schema targetNamespace=\"${api}${service}Soap12\">
    <xsd:import namespace=\"${api}\" schemaLocation=\"api.xsd\"/>
    <xsd:import namespace=\"${wsse}\" schemaLocation=\"security.xsd\"/>
    <xsd:import namespace=\"${wsa}\" schemaLocation=\"addressing.xsd\"/>
  </xsd:schema>
${rest}")
endfunction()

function(write_schema folder)
    file(READ ${folder}/ZV1.xsd text)
    drop_unused_prefixes("${text}" text)
    string(REGEX REPLACE "\n *<import [^\n]*" "" text "${text}")
    string(REPLACE "attributeFormDefault=\"unqualified\">"
           "attributeFormDefault=\"unqualified\">\n    <import namespace=\"${soap}\" schemaLocation=\"soap.xsd\"/>"
           text "${text}")
    # Only the settings blocks have open attributes.
    string(REPLACE "<anyAttribute"
           "<attribute ref=\"SOAP-ENV:mustUnderstand\" use=\"required\" fixed=\"1\"/>\n          <anyAttribute"
           text "${text}")
    string(REGEX REPLACE " (min|max)Occurs=\"1\"" "" text "${text}")
    file(WRITE ${OUTPUT}/api.xsd "${text}")
endfunction()

foreach(service ${services})
    set(folder ${WORK}/${service})
    file(MAKE_DIRECTORY ${folder})
    write_input(${service} ${folder})
    zv_soapcpp2(${WIRE}/zv.h ${folder} ${folder}:${IMPORT} -u)
    write_wsdl(${service} ${folder})
endforeach()
file(MAKE_DIRECTORY ${WORK}/all)
zv_soapcpp2(${WIRE}/zv.h ${WORK}/all ${IMPORT} -u)
write_schema(${WORK}/all)
