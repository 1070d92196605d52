// The customer's account: what the device may do, settings, wish list, payment and purchases.
#include "Conversion.h"
#include "ServiceCall.h"

ZV_WS_Status ZV_WS_getFileType(ZV_WS_Session* handle, ZV_WS_FileType* fileType)
{
    ServiceCall<Operation::getFileType> call("ZV_WS_getFileType", handle, fileType);
    if (!call.Accepts()) return call.Refusal();
    return call.Into(fileType, ZVUtilities::ZV1__FileType2ZV_WS_FileType);
}
