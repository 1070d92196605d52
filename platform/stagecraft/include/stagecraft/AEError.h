// AEError: the runtime's result value. A plain value: copied freely, used on any thread, allocates nothing.
#pragma once

#include <cstdint>
#include <cstring>

class AEError {
public:
    enum { kMaxName = 32 };

    enum GlobalErrors : uint32_t {
        OK = 0,
        NoMemory = 1,
        Timeout = 2,
        Generic = 3,
        NotFound = 4,
        Usage = 5,
        InvalidParameters = 6,
        Uninitialized = 0xFFFFFFFFu,
    };

    AEError() : AEError("Uninitialized", Uninitialized) {}

    // The name is cut to kMaxName - 1 bytes; null is the empty name.
    AEError(const char* pName, uint32_t value) : m_errorName{}, m_nErrorValue(value)
    {
        if (pName) memcpy(m_errorName, pName, strnlen(pName, kMaxName - 1));
    }

    AEError(const AEError&) = default;
    AEError& operator=(const AEError&) = default;
    virtual ~AEError() {}

    // Two errors are the same when their values are; names are for people.
    bool operator==(const AEError& other) const { return m_nErrorValue == other.m_nErrorValue; }
    bool operator!=(const AEError& other) const { return !(*this == other); }

    char m_errorName[kMaxName];
    uint32_t m_nErrorValue;
};

// The host defines these at static initialisation. The runtime library must not refer to them: nothing of the host is
// visible to it.
extern const AEError AEError_OK;
extern const AEError AEError_NoMemory;
extern const AEError AEError_Timeout;
extern const AEError AEError_Generic;
extern const AEError AEError_NotFound;
extern const AEError AEError_Usage;
extern const AEError AEError_InvalidParameters;
