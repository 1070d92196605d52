// An answer in the cache. The input's first line names the call, the rest is what the cache holds for it.
#include "Calls.h"
#include "Peer.h"
#include "Target.h"

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size)
{
    std::string_view input = AsText(data, size);
    const std::string name = TakeLine(input);
    Peer nobody("");
    PeerSession session;
    session.cache().Preset(input);
    CallResult result;
    MakeCall(name, session.handle(), result);
    return 0;
}
