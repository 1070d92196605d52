// A service's answer to a call. The input's first line names the call, the rest is a whole HTTP message.
#include <string.h>

#include "Calls.h"
#include "Peer.h"
#include "Target.h"

namespace {

// Which text is secret must not hang on where the network cuts it. (The part of a compressed body that comes with the
// head is left out, so there it does.)
void FilterInPieces(std::string_view text)
{
    if (strcasestr(std::string(text).c_str(), "Content-Encoding:")) return;
    SecretFilter whole, pieces;
    const size_t half = text.size() / 2;
    ZVString cut = pieces.Filter(text.data(), half);
    cut += pieces.Filter(text.data() + half, text.size() - half);
    Require(whole.Filter(text.data(), text.size()).compare(cut) == 0, "secrets are found in pieces as in one");
}

}  // namespace

void TestInput(std::string_view input)
{
    const std::string name = TakeLine(input);
    FilterInPieces(input.substr(0, input.find('\0')));
    Peer peer(input);
    PeerSession session;
    CallResult first, second;
    if (!MakeCall(name, session.handle(), first) || first.status != ZV_WS_Status_ok || session.cache().empty()) {
        return;
    }
    peer.Accept(0);
    MakeCall(name, session.handle(), second);
    Require(second == first, "what was stored answers like the service did");
}
