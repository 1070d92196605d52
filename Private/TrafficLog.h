// The log of what travels: everything sent and received, answers as they are once inflated, without the secrets in it.
#pragma once

#include <stddef.h>

#include "ZVString.h"

/// Registers the areas of sent, received and test messages. Called before the first session's first exchange; any
/// thread.
void soap_init_zv_log();

/// Takes secrets out of an HTTP message that comes in pieces of any size: the values of header lines that authorise,
/// the texts of XML elements that hold a secret. "***" stands where a secret was. A body in chunks is left out: their
/// boundaries could hide an element's name. So is the part of a compressed body that comes in the piece of the head;
/// what follows is taken for inflated.
class SecretFilter {
public:
    /// The piece without secrets.
    ZVString Filter(const char* data, size_t length);

    /// Before a new message.
    void Restart() { *this = SecretFilter(); }

private:
    enum class State { HeadLine, HeadSecret, Text, Tag, Secret, SecretTag, Hidden };

    void Step(char c, ZVString& out);
    void StepHead(char c, ZVString& out);
    void EndHeadLine();
    void StepTag(char c, ZVString& out);
    bool TagNamesSecret() const;

    State m_State = State::HeadLine;
    bool m_IsCompressed = false;
    bool m_IsChunked = false;
    ZVString
        m_Name;  ///< What has come of the header line or the tag, without its opening bracket; cut at kLongestName.
};

namespace TrafficLog {

void Sent(SecretFilter& filter, const char* data, size_t length);
void Received(SecretFilter& filter, const char* data, size_t length);

}  // namespace TrafficLog
