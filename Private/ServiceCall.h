// The shape of every call of a service, from the emptied output to the status.
//
//     ServiceCall<Operation::getTitleListing> call("ZV_WS_getTitleListing", handle, listing);
//     if (!call.Accepts()) return call.Refusal();
//     call->TitleID = titleID;
//     return call.Into(listing, ZVUtilities::ZV1__TitleListingResponse2ZV_WS_TitleListingResponse);
//
// The first line empties and tags the output, so that it can be released however the call ends. Then the call's own argument
// checks, the request's children, and the conversion of the answer's result into the output. Into sends the request, once more when a
// connection kept from an earlier call turns out to be dead and the operation changes nothing, converts, cleans up, writes the log
// line and maps the status. Nothing is thrown through it.
#pragma once

#include <utility>

#include "Operations.h"
#include "Records.h"
#include "ZVUtilities.h"

namespace CallDetail {

template <class Record, class = void>
struct ResponseCode {
    static int Of(const Record&) { return 0; }
};
template <class Record>
struct ResponseCode<Record, std::void_t<decltype(Record::ResponseCode)>> {
    static int Of(const Record& record) { return record.ResponseCode; }
};

}  // namespace CallDetail

/// The part that does not depend on the operation.
class ServiceCallBase {
public:
    /// Whether the call can be made: there is a session, the output is tagged, and the call's own `arguments` are right.
    bool Accepts(bool arguments = true) const { return arguments && m_Session && m_Tagged; }

    /// The status of a call that cannot be made.
    ZV_WS_Status Refusal() const { return m_Tagged ? ZV_WS_Status_invalid_param : ZV_WS_Status_general_error; }

protected:
    ServiceCallBase(const char* function, const ZV_WS_Session* handle);

    /// Runs `send` between Setup and the rules for kept connections, a second time where that is safe. `send` returns the SOAP
    /// runtime's result.
    template <class Service, class Send>
    int Exchange(Service& service, const char* operation, bool changes, Send&& send);

    /// Frees the context's temporary data, logs, and maps the status. `answered` tells whether an answer came with a result.
    ZV_WS_Status Finish(soap& context, int result, bool answered, int responseCode);

    static void LogProxy(const char* verb, const char* proxy, const char* operation);

    const char* m_Function;
    SessionImpl* m_Session;
    bool m_Tagged = true;
};

template <class Op>
class ServiceCall : public ServiceCallBase {
public:
    /// `function` is the ZV_WS_ function's name; `out` a record, or a plain value, which becomes zero.
    template <class Output>
    ServiceCall(const char* function, const ZV_WS_Session* handle, Output* out) : ServiceCallBase(function, handle)
    {
        ZV_ASSERT(out != 0);
        if constexpr (Records::kIsRecord<Output>) {
            try {
                Records::Tag(*out);
            } catch (const std::bad_alloc&) {
                m_Tagged = false;
            }
        } else {
            *out = Output();
        }
    }

    /// The request.
    typename Op::Request* operator->() { return &m_Request; }

    /// Makes the call. `convert(result, output)` gets the answer's result, never null.
    template <class Output, class Convert>
    ZV_WS_Status Into(Output* out, Convert&& convert)
    {
        auto& service = Op::Service(*m_Session);
        const int result = Exchange(service, Op::kName, Op::kChanges,
                                    [&] { return Op::Send(*m_Session, m_Request, m_Response); });
        const auto* answer = result == SOAP_OK ? Op::Result(m_Response) : nullptr;
        bool converted = answer != nullptr;
        try {
            if (answer) convert(answer, *out);
        } catch (const std::bad_alloc&) {
            converted = false;
        }
        return Finish(service, result, converted, CallDetail::ResponseCode<Output>::Of(*out));
    }

private:
    typename Op::Request m_Request;
    typename Op::Response m_Response;
};

template <class Service, class Send>
int ServiceCallBase::Exchange(Service& service, const char* operation, bool changes, Send&& send)
{
    SigpipeGuard guard;
    Transport& transport = service.transport();
    LogProxy("Entering", service.ProxyName(), operation);
    int result = SOAP_OK;
    bool mayRetry = !changes;
    do {
        transport.BeginExchange();
        result = service.Setup(operation);
        if (result == SOAP_OK) result = send();
        transport.EndExchange(result);
    } while (result == SOAP_EOF && transport.KeptConnectionDied() && std::exchange(mayRetry, false));
    LogProxy("Exiting", service.ProxyName(), operation);
    return result;
}
