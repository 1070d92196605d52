#include "Discovery.h"

#include <stdio.h>

#include <string>

#include "Deployment.h"
#include "RawHttp.h"
#include "Url.h"
#include "ZVAssert.h"

namespace {

// The environment in an answer: the one byte of its body, or production for everything that is not that one byte.
int EnvironmentIn(const RawHttp& http)
{
    const char* body = nullptr;
    size_t length = 0;
    ZVString bodyLength;
    const bool usable = http.StatusIs("HTTP/1.1 200 OK") && http.Header("Content-Length", bodyLength) &&
                        bodyLength == "1" && http.BodyStart(body, length) && length > 0;
    return usable ? body[0] - '0' : int(ENVID_PRODUCTION);
}

}  // namespace

namespace ZVUtilities {

const char* QueryServiceBaseURL(ContentType type, soap* context, const char* destinationUniqueID, int destinationTypeID,
                                ZV_WS_EnvNum envNum, ZV_WS_EnvID& envID)
{
    const Deployment& deployment = context ? Transport::Of(context).deployment() : Deployment::Current();
    if (envNum >= ENVNUM_APISTG && envNum <= ENVNUM_PRODUCTION) {
        envID = static_cast<ZV_WS_EnvID>(envNum);
        const char* url = deployment.BaseUrl(type, envID);
        printf("\n=======>Content type:%d, envID:%d, endpoint URL:%s\n", type, envID, url);
        return url;
    }
    ZV_ASSERT(context != 0);
    ZV_ASSERT(destinationUniqueID != 0);
    const ZVString id = UrlEncode(destinationUniqueID);
    const ZVString path = ZVString("/device/env/?d=") + id + "&dt=" + std::to_string(destinationTypeID).c_str();
    const ZVString& host = deployment.production_host;

    RawHttp http(Transport::Of(context));
    if (!http.Connect(ZVString("https://") + host + path)) return "";
    int environment = ENVID_PRODUCTION;
    if (http.SendGet(path, host, RawHttp::Order::AgentFirst) && http.ReceiveHead()) environment = EnvironmentIn(http);
    envID = static_cast<ZV_WS_EnvID>(environment);
    const char* url = deployment.BaseUrl(type, environment);
    printf("\n---> End-Point URL: %s <---\n\n", url);
    return url;
}

}  // namespace ZVUtilities
