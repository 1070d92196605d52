// What keeps exceptions of the standard library inside the library.
#pragma once

#include <new>

#include "ZV_WS_Status.h"

/// Whether `act()` came to its end; false when memory was exhausted in it.
template <class Act>
bool WithinMemory(Act&& act)
{
    try {
        act();
    } catch (const std::bad_alloc&) {
        return false;
    }
    return true;
}

/// The result of `call()`; ZV_WS_Status_general_error when memory was exhausted in it.
template <class Call>
ZV_WS_Status GuardCall(Call&& call)
{
    ZV_WS_Status status = ZV_WS_Status_general_error;
    WithinMemory([&] { status = call(); });
    return status;
}
