// How much a SOAP context reads before it gives up, from the network and from the cache alike.
#pragma once

#include <stdsoap2.h>

/// The largest page of titles is below 100 KiB; what is larger than this is an attack or a fault.
inline void LimitReading(soap& context)
{
    context.recv_maxlength = 4u << 20;  // bytes of a message, inflated ones too
    context.maxlength = 1l << 20;       // bytes of a string
    context.maxoccurs = 4096;           // elements of an array
    context.maxlevel = 64;
}
