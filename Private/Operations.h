// The operations the library calls: which service carries each, and whether it changes anything there.
//
// Operation::X has the generated request and response of operation X, sends it, and finds the result in its answer. The name given
// to the row is the operation's name on the wire.
#pragma once

#include "SessionImpl.h"

#define ZV_OPERATION(service, name, changes)                                                              \
    struct name {                                                                                         \
        using Request = _ZV1__##name;                                                                     \
        using Response = _ZV1__##name##Response;                                                          \
        static constexpr char kName[] = #name;                                                            \
        static constexpr bool kChanges = changes;                                                         \
        static auto& Service(SessionImpl& session) { return session.service; }                            \
        static int Send(SessionImpl& session, Request& request, Response& response)                       \
        {                                                                                                 \
            return session.service.name(&request, &response);                                             \
        }                                                                                                 \
        static const auto* Result(const Response& response) { return response.name##Result; }             \
    };

namespace Operation {

// clang-format off
//           service     operation                              changes
ZV_OPERATION(m_Browse,   getFileType,                           false)
ZV_OPERATION(m_Browse,   getNavigation,                         false)
ZV_OPERATION(m_Browse,   getTitlesByNavigation,                 false)
ZV_OPERATION(m_Browse,   getTitleListing,                       false)
// clang-format on

}  // namespace Operation

#undef ZV_OPERATION
