// An answer in the cache. The input's first line names the call, the rest is what the cache holds for it.
#include "Calls.h"
#include "Peer.h"
#include "Target.h"

void TestInput(std::string_view input)
{
    const std::string name = TakeLine(input);
    Peer nobody("");
    PeerSession session;
    session.cache().Preset(input);
    CallResult result;
    MakeCall(name, session.handle(), result);
}
