// What keeps exceptions of the standard library inside the library.
#pragma once

#include <new>

#include "ZV_WS_Status.h"

/// The result of `call()`; ZV_WS_Status_general_error when memory was exhausted in it.
template <class Call>
ZV_WS_Status GuardCall(Call&& call)
{
    try {
        return call();
    } catch (const std::bad_alloc&) {
        return ZV_WS_Status_general_error;
    }
}
