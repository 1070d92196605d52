// The log of what travels: everything sent and received, answers as they are once inflated, without the secrets in it.
#pragma once

#include <stddef.h>

#include "ZVString.h"

/// Registers the areas of sent, received and test messages. Called before the first session's first exchange; any
/// thread.
void soap_init_zv_log();

/// Takes secrets out of an HTTP message that comes in pieces of any size: the values of header lines and of attributes,
/// and the contents of XML elements, whose names say that they hold one (an element's also where the XML is itself the
/// text of an element). "***" stands where a secret was. A body in chunks is left out: their boundaries could hide an
/// element's name. So is the part of a compressed body that comes in the piece of the head; what follows is taken for
/// inflated.
class SecretFilter {
public:
    /// The piece without secrets.
    ZVString Filter(const char* data, size_t length);

    /// Before a new message.
    void Restart() { *this = SecretFilter(); }

private:
    enum class State { HeadLine, HeadSecret, Text, Tag, Value, Secret, SecretTag, Hidden };

    void Step(char c, ZVString& out);
    void StepHead(char c, ZVString& out);
    void EndHeadLine();
    void StepTag(char c, ZVString& out);
    void BeginValue(char quote, ZVString& out);
    void StepValue(char c, ZVString& out);
    void StepSecret(char c, ZVString& out);
    void BeginTag();
    void EndTag(char c, ZVString& out);
    bool OpensTag(char c) const;
    bool ClosesTag(char c) const;

    State m_State = State::HeadLine;
    bool m_IsInterim = false;  // another head follows this one
    bool m_IsCompressed = false;
    bool m_IsChunked = false;
    bool m_LineIsSecret = false;  // and so are those that go on with it
    ZVString m_Name;     // what has come of the header line or of the tag, without attributes that are over; cut at
                         // kLongestName
    ZVString m_Element;  // whose content is secret
    char m_Quote = 0;    // that ends the attribute's value
    bool m_ValueIsSecret = false;
    char m_Last[4] = {};  // the latest characters of a body
};

namespace TrafficLog {

void Sent(SecretFilter& filter, const char* data, size_t length);
void Received(SecretFilter& filter, const char* data, size_t length);

}  // namespace TrafficLog
