// The shape of every call of a service, from the emptied output to the status.
//
//     ServiceCall<Operation::getTitlesByNavigation> call(__func__, handle, titles);
//     if (!call.Accepts(IsPage(page))) return call.Refusal();
//     call.CacheAs(ZV_WS_CacheParam::CacheData_Metadata, genreID, page->CurrentPageNumber, page->ItemsPerPage);
//     call->GenreID = genreID;
//     SetPage(call, *page);
//     return call.Into(titles);
//
// The first line empties and tags the output, so that it can be released however the call ends. Then come the checks of
// arguments that the call itself looks into, where the cache keeps the answer (if it does), and the request's children;
// texts and enumerations go through SetText and SetEnum, which notice what no request can carry. Into refuses that, and
// a call without a session; looks into the cache, or sends the request, once more when a connection kept from an
// earlier call turns out to be dead and the operation allows it, or when the service refuses it for a wrong clock;
// converts the answer's result (Conversion.h), cleans up, writes the log line and maps the status. Nothing is thrown
// through it.
#pragma once

#include <ctype.h>
#include <limits.h>
#include <string.h>

#include <utility>

#include "AnswerCache.h"
#include "CallGuard.h"
#include "Conversion.h"
#include "Operations.h"
#include "Records.h"
#include "SigpipeGuard.h"
#include "ZVUtilities.h"
#include "soapH.h"

namespace CallDetail {

// Whether the contract has a text for an enumeration's number; for the others the generated function writes digits.
#define ZV_SENT_ENUM(name)                                         \
    inline bool IsListed(soap& context, ZV1__##name value)         \
    {                                                              \
        const char first = *soap_ZV1__##name##2s(&context, value); \
        return first != '-' && !isdigit(first);                    \
    }
ZV_SENT_ENUM(AudioProfile)
ZV_SENT_ENUM(BonusAssetType)
ZV_SENT_ENUM(FileProfile)
ZV_SENT_ENUM(StreamAPIPurchaseType)
ZV_SENT_ENUM(StreamStatus)
ZV_SENT_ENUM(TitleTypeFilter)
ZV_SENT_ENUM(WatchStatus)
#undef ZV_SENT_ENUM

// The response code of answers that have one; the other answers are no refusals.
template <class Answer>
auto ResponseCodeOf(const Answer& answer, int) -> decltype(answer.ResponseCode)
{
    return answer.ResponseCode;
}
template <class Answer>
int ResponseCodeOf(const Answer&, long)
{
    return 0;
}

}  // namespace CallDetail

/// The part that does not depend on the operation.
class ServiceCallBase {
public:
    /// Whether the call can be made: there is a session, the output is tagged, and the call's own `arguments` are
    /// right.
    bool Accepts(bool arguments = true) const { return arguments && m_Session && m_Tagged; }

    /// The status of a call that cannot be made.
    ZV_WS_Status Refusal() const { return m_Tagged ? ZV_WS_Status_invalid_param : ZV_WS_Status_general_error; }

    /// Children of the request. One that no request can carry makes Into refuse the call: a text that XML cannot hold,
    /// or a number that the contract's list of texts does not have. Texts are borrowed.
    void SetText(char*& to, const char* text)
    {
        to = const_cast<char*>(text);
        m_IsSendable &= !text || ZVUtilities::IsXmlText(text);
    }
    template <class Wire, class Value>
    void SetEnum(Wire& to, Value value)
    {
        to = static_cast<Wire>(value);
        m_IsSendable &= m_Session && CallDetail::IsListed(m_Session->m_Browse, to);
    }
    void SetSortOrder(int& to, ZV_WS_SortOrder order)
    {
        to = ZVUtilities::SortOrder2Int(order);
        m_IsSendable &= order >= SORT_ORDER_DATEADDED && order <= SORT_ORDER_USERRATING;
    }

    /// The status shall tell of the transport only: the service's response code stays in the record.
    void IgnoreResponseCode() { m_UsesResponseCode = false; }

    /// The answer is looked for in the session's cache, under the function's name, before the service is asked, and
    /// kept there when the service says success. The key is made of all the arguments, numbers and texts.
    template <class... Arguments>
    void CacheAs(ZV_WS_CacheParam::CacheData kind, const Arguments&... arguments)
    {
        // Without memory for the key the answer is not cached.
        WithinMemory([&] { m_Entry = {kind, m_Function + strlen("ZV_WS_"), arguments...}; });
    }

    /// Only when the call can be made.
    SessionImpl& session() { return *m_Session; }

    /// What is known, once the call was made, of the change that it asked for.
    enum class Change {
        None,     ///< The service refused it, or never saw it.
        Made,     ///< It said so.
        Unknown,  ///< It may have been made: the answer never came, or said nothing.
    };
    Change change() const { return m_Change; }

protected:
    ServiceCallBase(const char* function, const ZV_WS_Session* handle);

    /// Runs `send` between Setup and the rules for kept connections, a second time where that is safe. `send` returns
    /// the SOAP runtime's result.
    template <class Service, class Send>
    int Exchange(Service& service, const char* operation, bool once, Send&& send);

    struct Outcome {
        int result = SOAP_OK;   ///< The SOAP runtime's.
        bool answered = false;  ///< An answer came with a result, and the output has it.
        int responseCode = 0;
    };

    /// Frees the context's temporary data, logs, and maps the status.
    ZV_WS_Status Finish(soap& context, const Outcome& outcome);

    /// When the answer was right but for a value that cannot be read: which.
    static void LogUnreadable(const soap& context, const char* operation, int result);
    static void LogProxy(const char* verb, const char* proxy, const char* operation);

    const char* m_Function;
    SessionImpl* m_Session;
    bool m_Tagged = true;
    Change m_Change = Change::None;
    bool m_IsSendable = true;
    bool m_UsesResponseCode = true;
    bool m_ClockIsWrong = false;
    AnswerCache::Entry m_Entry;
};

template <class Op>
class ServiceCall : public ServiceCallBase {
public:
    using Answer = std::remove_pointer_t<decltype(Op::Result(std::declval<typename Op::Response>()))>;

    /// `function` is the ZV_WS_ function's name; `out` a record, or a plain value, which becomes zero.
    template <class Output>
    ServiceCall(const char* function, const ZV_WS_Session* handle, Output* out) : ServiceCallBase(function, handle)
    {
        ZV_ASSERT(out != 0);
        m_Tagged = WithinMemory([&] { Records::Empty(*out); });
    }

    /// The request.
    typename Op::Request* operator->() { return &m_Request; }

    /// Makes the call.
    template <class Output>
    ZV_WS_Status Into(Output* out)
    {
        return Into([out](const Answer* answer) { ZVUtilities::Convert(answer, *out); });
    }

    /// Makes the call and hands the answer's result, never null, to `convert(result)`, which may say with false that
    /// the result cannot be read.
    template <class Convert, class = std::enable_if_t<!std::is_pointer_v<Convert>>>
    ZV_WS_Status Into(Convert convert)
    {
        if (!Accepts() || !m_IsSendable) return Refusal();
        auto& service = Op::Service(*m_Session);
        Outcome outcome;
        if (!WithinMemory([&] { Make(service, convert, outcome); }))
            service.transport().Close();  // left in the middle of something
        if (outcome.answered) {
            m_Change = outcome.responseCode == 0 ? Change::Made : Change::None;
        } else {
            m_Change = service.transport().HasSent() ? Change::Unknown : Change::None;
        }
        return Finish(service, outcome);
    }

private:
    template <class Service, class Convert>
    void Make(Service& service, Convert& convert, Outcome& outcome)
    {
        AnswerCache cache(*m_Session, m_Entry);
        const bool isCached =
            cache.Find(m_Response, [](const auto& response) { return Op::Result(response) != nullptr; });
        Answer* answer = isCached ? Op::Result(m_Response) : nullptr;
        if (!isCached) {
            outcome.result =
                Exchange(service, Op::kName, Op::kOnce, [&] { return Op::Send(*m_Session, m_Request, m_Response); });
            answer = outcome.result == SOAP_OK ? Op::Result(m_Response) : nullptr;
        }
        if (!answer) return;
        outcome.responseCode = CallDetail::ResponseCodeOf(*answer, 0);
        if constexpr (std::is_same_v<decltype(convert(answer)), bool>) {
            outcome.answered = convert(answer);
        } else {
            convert(answer);
            outcome.answered = true;
        }
        if (!outcome.answered) return;
        if (!isCached && outcome.responseCode == 0) cache.Store(m_Response);
    }

    typename Op::Request m_Request;
    typename Op::Response m_Response;
};

/// A whole call of an operation without arguments, whose answer is kept in the cache among those of a kind when one is
/// named.
template <class Op, class Output>
ZV_WS_Status Ask(const char* function, const ZV_WS_Session* handle, Output* out, ZV_WS_CacheParam::CacheData kind = {})
{
    ServiceCall<Op> call(function, handle, out);
    if (kind) call.CacheAs(kind, 0);
    return call.Into(out);
}

/// Likewise of the operation whose request's only child is that number.
template <class Request, class Output>
ZV_WS_Status AskAbout(int Request::*child, int id, const char* function, const ZV_WS_Session* handle, Output* out,
                      ZV_WS_CacheParam::CacheData kind = {})
{
    ServiceCall<decltype(Operation::Of(std::declval<Request*>()))> call(function, handle, out);
    if (kind) call.CacheAs(kind, id);
    (call.operator->())->*child = id;
    return call.Into(out);
}

/// Fills the children by which all requests for a page name it.
template <class Call>
void SetPage(Call& call, const ZV_WS_Pagination& page)
{
    call->CurrentPageNumber = static_cast<int>(page.CurrentPageNumber);
    call->ItemsPerPage = static_cast<int>(page.ItemsPerPage);
}

/// Whether that is an array which a request can carry: its size is a number of the contract.
inline bool IsArray(const int* numbers, unsigned int count)
{
    return (numbers || count == 0) && count <= INT_MAX;
}

/// Likewise a page.
inline bool IsPage(const ZV_WS_Pagination* page)
{
    return page && page->CurrentPageNumber <= INT_MAX && page->ItemsPerPage <= INT_MAX;
}

/// An array of numbers for a request, as long as `numbers` lives.
inline ZV1__ArrayOfInt BorrowedInts(const int* numbers, unsigned int count)
{
    ZV1__ArrayOfInt array;
    array.__sizeint_ = static_cast<int>(count);
    array.int_ = const_cast<int*>(numbers);
    return array;
}

/// After a call that changes the user's data: drops what the cache has under that name, unless the service has
/// certainly changed nothing, and does `more` with the cache in the same step.
void DropStale(ServiceCallBase& call, const char* table, const std::function<bool(CacheInterface&)>& more = nullptr);

/// The line with which every call ends.
void LogCall(const char* function, int result, int responseCode);

/// The same for a call that asks no operation; returns its status.
ZV_WS_Status LogStatus(const char* function, ZV_WS_Status status);

/// Logs the answer of a yes-or-no call; returns its status. The answer is a reference since the call that gives it may
/// be an argument, too.
ZV_WS_Status LogAnswer(const char* function, ZV_WS_Status status, const bool& answer);

template <class Service, class Send>
int ServiceCallBase::Exchange(Service& service, const char* operation, bool once, Send&& send)
{
    SigpipeGuard guard;
    Transport& transport = service.transport();
    LogProxy("Entering", service.ProxyName(), operation);
    int result = SOAP_OK;
    bool mayReconnect = !once, mayResign = true;
    const auto isToRepeat = [&] {
        // What is refused for the time in its header has changed nothing.
        if (transport.ClockVerdict() == Clock::Verdict::Learned) return std::exchange(mayResign, false);
        return result == SOAP_EOF && transport.KeptConnectionDied() && std::exchange(mayReconnect, false);
    };
    do {
        transport.BeginExchange();
        result = service.Setup(operation);
        if (result == SOAP_OK) result = send();
        transport.EndExchange(result);
    } while (isToRepeat());
    m_ClockIsWrong = transport.ClockVerdict() == Clock::Verdict::Wrong;
    LogProxy("Exiting", service.ProxyName(), operation);
    LogUnreadable(service, operation, result);
    return result;
}
