// Service answers as text for the cache, and back: a SOAP context that writes to and reads from a string in place of a
// connection. A local object of one call on one thread. Memory exhaustion may be thrown (std::bad_alloc).
//
//     ZVString text;
//     if (Serializer(true, false).Write(response, text)) cache.WriteMetaData(name, key, text);
//
//     Serializer serializer(true, false);
//     if (serializer.Read(text, response) && response.xResult) ...    // else ask the service
#pragma once

#include <stdsoap2.h>

#include "ZVString.h"

class Serializer : public soap {
public:
    /// `compress`: what is written is in gzip format, bytes and not characters. Both forms are read by any serializer.
    /// `indent`: written with line breaks, for people.
    Serializer(bool compress, bool indent);
    virtual ~Serializer();
    Serializer(const Serializer&) = delete;
    Serializer& operator=(const Serializer&) = delete;

    /// Writes a generated response to `text` as one element. False (and an empty text) when that fails.
    template <class Response>
    bool Write(const Response& response, ZVString& text);

    /// Fills a generated response from a text that Write has made. What the response points to belongs to this
    /// serializer and ends with it, or with its next Read. False for a text that is empty, cut short, damaged or larger
    /// than an answer can be; the response is empty then.
    template <class Response>
    bool Read(const ZVString& text, Response& response);

    // ---- The steps of both. Results are the SOAP runtime's error numbers.
    void SetXML(const ZVString& text) { xml = text; }
    ZVString GetXML() const { return xml; }
    int BeginPut();
    int EndPut();
    int BeginGet();
    int EndGet();

    ZVString xml;  ///< What was written so far; what is still to be read.

private:
    static int Serializer_fsend(soap* context, const char* data, size_t length);
    static size_t Serializer_frecv(soap* context, char* buffer, size_t size);

    static constexpr char kTag[] = "ZVWSLib";
};

template <class Response>
bool Serializer::Write(const Response& response, ZVString& text)
{
    text = ZVString();
    xml = ZVString();
    if (BeginPut() != SOAP_OK) return false;
    response.soap_serialize(this);
    if (response.soap_put(this, kTag, nullptr) != SOAP_OK || EndPut() != SOAP_OK) return false;
    text = GetXML();
    return true;
}

template <class Response>
bool Serializer::Read(const ZVString& text, Response& response)
{
    response.soap_default(this);
    SetXML(text);
    // A wrong checksum shows at the end only, after everything has been read.
    if (BeginGet() == SOAP_OK && response.soap_get(this, kTag, nullptr) && EndGet() == SOAP_OK) return true;
    response.soap_default(this);
    return false;
}
