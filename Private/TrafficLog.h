// The log of what travels: everything sent and received, without the secrets in it.
#pragma once

#include <stddef.h>

#include "ZVString.h"

/// Registers the areas of sent, received and test messages. Called before the first session's first exchange; any
/// thread.
void soap_init_zv_log();

/// Takes the texts of elements that hold secrets out of a stream of XML that comes in pieces of any size.
class SecretFilter {
public:
    /// The piece with every secret byte left out and "***" where a secret begins.
    ZVString Filter(const char* data, size_t length);

    /// Forgets where the last stream stood.
    void Restart() { *this = SecretFilter(); }

private:
    enum class State { Text, Tag, Secret };

    void Step(char c, ZVString& out);
    bool TagNamesSecret() const;

    State m_State = State::Text;
    ZVString m_Tag;  ///< What has come of the tag, without its opening bracket; cut at kLongestTag.
};

namespace TrafficLog {

void Sent(SecretFilter& filter, const char* data, size_t length);
void Received(SecretFilter& filter, const char* data, size_t length);

}  // namespace TrafficLog
