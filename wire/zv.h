// The service contract, as input for soapcpp2: envelope headers, records and the three bindings.
// Not C++: the build turns it into serializers and proxies. A change here changes what travels.
//
// Element and type names carry the schema prefix ZV1; ZV2 to ZV4 only name the bindings and never appear in a message.

#import "wsse.h"
#import "wsa.h"
#import "dom.h"

//gsoap ZV1 schema namespace: http://api.zorvane.example/api/
//gsoap ZV1 schema elementForm: qualified
//gsoap ZV1 schema attributeForm: unqualified

typedef char* xsd__decimal;

#import "enumerations.h"
#import "headers.h"
#import "records.h"
#import "browse.h"
#import "account.h"
#import "stream.h"
