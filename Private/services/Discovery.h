// Which environment a device belongs to, and so where its services are.
#pragma once

#include "ZVWSLib.h"

struct soap;

namespace ZVUtilities {

/// The base URL of all three services: from the table for an environment named by `envNum`, else the environment is
/// asked from the production host over `context`, whose kept connection is closed before and after. "" when the service
/// cannot be reached; every unusable answer is production. `envID` gets the environment, the service's raw digit
/// included. The text lives as long as the process. `context` may be null when `envNum` names the environment.
const char* QueryServiceBaseURL(ContentType type, struct soap* context, const char* destinationUniqueID,
                                int destinationTypeID, ZV_WS_EnvNum envNum, ZV_WS_EnvID& envID);

}  // namespace ZVUtilities
