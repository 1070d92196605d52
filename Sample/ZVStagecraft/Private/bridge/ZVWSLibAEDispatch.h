// How a script call reaches the library on a worker thread and how its result comes back.
//
//   main thread    AsyncDispatch: checks, reads the arguments into a Param_ record, RunThread
//   worker         Work: calls the library with the instance's session, Publish
//   main thread    ZVWSLibAE::OnUpdate, on a later tick: the script value, "onComplete"
//
// A method that asks the library and does nothing else is one row: ZVWS_ASYNC(name, its Param_ record), which makes the
// handler and the worker ZVWSLib::name(void*) for ZV_WS_name. The library's last parameter decides the kind of result.
#pragma once

#include <memory>

#include "ServiceTrouble.h"
#include "ZVAssert.h"
#include "ZVWSAELog.h"
#include "ZVWSLibAE.h"
#include "ZVWSLibAECall.h"
#include "ZVWSLibAEParams.h"
#include "ZVWSLibAEPrefetch.h"

namespace ZVWSLib {

int LogAreaID();

/// The line with which getTitles tells its parameters; the other calls tell none.
inline void LogParameters(const Param_base&) {}
void LogParameters(const Param_getTitles& param);

/// The elements of the one argument when it is an Array of two objects.
bool ReadArguments(ae::stagecraft::ASValueArray& arguments, ae::stagecraft::ASValue& callback,
                   ae::stagecraft::ASValue& parameters);

/// Everything of an asynchronous call after the question whether the instance may make it now.
template <class Param>
ZVWSLibAE::ReturnCode StartCall(ZVWSLibAE& instance, const char* name, void (*worker)(void*), const Param& prototype,
                                ae::stagecraft::ASObject& object, ae::stagecraft::ASValueArray& arguments)
{
    ZVWSLibAE::ForegroundCall& call = instance.GetCall();
    if (call.IsBusy()) return ZVWSLibAE::kBusy;
    const bool wasInitialized = call.IsInitialized();
    ae::stagecraft::ASValue callback, parameters;
    if (!ReadArguments(arguments, callback, parameters)) return ZVWSLibAE::kWrongArguments;

    auto param = std::make_unique<Param>(prototype);
    param->pZVWSLibAE = &instance;
    PropertyReader reader(*parameters.GetObject());
    param->ReadWith(reader);
    if (!reader.Succeeded()) return ZVWSLibAE::kWrongArguments;
    // A getter of the script may have made a call of its own.
    if (call.IsBusy() || call.IsInitialized() != wasInitialized) return ZVWSLibAE::kBusy;

    LogParameters(*param);
    instance.GetPrefetcher().CallStarts(*param);
    call.RunThread(name, worker, param.release(), object, callback);
    return ZVWSLibAE::kStarted;
}

/// A whole handler.
template <class Param>
ae::stagecraft::ASValue AsyncDispatch(ZVWSLibAE& instance, const char* name, void (*worker)(void*),
                                      const Param& prototype, ae::stagecraft::ASObject& object,
                                      ae::stagecraft::ASValueArray& arguments)
{
    const ZVWSAELog scope("ZVWSLibAE", name, LogAreaID());
    if (!instance.GetCall().IsInitialized()) return ae::stagecraft::ASValue::Number(ZVWSLibAE::kNotInitialized);
    return ae::stagecraft::ASValue::Number(StartCall(instance, name, worker, prototype, object, arguments));
}

void LogStatus(const char* name, ZV_WS_Status status);

/// A worker: owns its param. Worker thread.
template <class Param, class... Parameters>
void Work(const char* name, ZV_WS_Status (*call)(ZV_WS_Session*, Parameters...), void* argument)
{
    const std::unique_ptr<Param> param(static_cast<Param*>(argument));
    ZV_ASSERT(param != nullptr);
    ZV_ASSERT(param->pZVWSLibAE != nullptr);
    ZVWSLibAE::ForegroundCall& foreground = param->pZVWSLibAE->GetCall();
    OutputOf<Parameters...> output{};
    const ZV_WS_Status status = CallLibrary(call, foreground.Session(), *param, output);
    LogStatus(name, status);
    const RetryAfter::Heard heard = TakeHeard(foreground.Session());
    if (kIsListing<Param>) param->pZVWSLibAE->GetPrefetcher().ListingEnded(status, heard);
    foreground.Publish(output, status);
}

}  // namespace ZVWSLib

/// A row whose worker calls `call`.
#define ZVWS_ASYNC_CALL(name, prototype, call)                                                           \
    namespace ZVWSLib {                                                                                  \
    void name(void* param)                                                                               \
    {                                                                                                    \
        Work<decltype(prototype)>(#name, call, param);                                                   \
    }                                                                                                    \
    }                                                                                                    \
    void ZVWSLibAE::name(ae::stagecraft::StageWindow* /*window*/, ae::stagecraft::ASObject& object,      \
                         ae::stagecraft::ASValueArray& arguments, ae::stagecraft::ASValue& returnValue)  \
    {                                                                                                    \
        returnValue = ZVWSLib::AsyncDispatch(*this, #name, ZVWSLib::name, prototype, object, arguments); \
    }

#define ZVWS_ASYNC(name, prototype) ZVWS_ASYNC_CALL(name, prototype, ZV_WS_##name)
