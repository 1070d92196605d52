// The deployment file.
#include "Deployment.h"

#include "MemoryFile.h"
#include "Target.h"
#include "Url.h"

void TestInput(std::string_view input)
{
    const MemoryFile file(input);
    Deployment values;
    if (!Deployment::Read(file.Path(), values)) return;
    for (const ZVString& hostPort :
         {values.production_host, values.api_staging_host, values.internal_staging_host, values.adult_production_host,
          values.adult_staging_host, values.image_host, values.web_host}) {
        ZVString host;
        int port = 0;
        Require(SplitHostPort(hostPort, 443, host, port) && port >= 1 && port <= 65535, "every host can be connected");
        Require(host.find('\n') == ZVString::npos && host.find(' ') == ZVString::npos, "and stand in a header");
    }
}
