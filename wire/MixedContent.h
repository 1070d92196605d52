// Read before the generated serializers. They take text between the elements of a record for its end, and leave out what
// follows; it means nothing.
#pragma once

#include <stdsoap2.h>

/// At a place where there is no element: true when that is because of text, which is read over.
inline bool SkippedText(soap* context)
{
    constexpr soap_wchar kEnd = -1, kStartTag = -2, kEndTag = -3;  // the runtime's own numbers
    soap_wchar next = soap_get(context);
    const auto isText = [&] { return next != kEnd && next != kStartTag && next != kEndTag; };
    const bool skips = isText();
    while (isText())
        next = soap_get(context);
    soap_unget(context, next);
    if (!skips) return false;
    context->peeked = 0;
    context->error = SOAP_OK;
    return true;
}
