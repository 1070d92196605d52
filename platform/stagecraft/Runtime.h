// The desktop runtime behind ae::stagecraft::IStagecraft.
#pragma once

#include <memory>
#include <vector>

#include "Movie.h"
#include "StopRequest.h"
#include "stagecraft/IStagecraft.h"

class Runtime final : public ae::stagecraft::IStagecraft {
public:
    using IStagecraft::RegisterExtensionClass;
    AEError RegisterExtensionClass(const char* pClassName, GetMethodsFunction getMethods,
                                   FiresEventsFunction firesEvents, ConstructInstanceFunction construct,
                                   DestructInstanceFunction destruct) override;
    AEError CreateAndConfigureStageWindowSet(AEArray<ae::stagecraft::StageWindow*>& set, int argc,
                                             const char* const* argv, int configure) override;
    AEError RunStageWindowSet(AEArray<ae::stagecraft::StageWindow*>& set) override;
    AEError DestroyStageWindowSet(AEArray<ae::stagecraft::StageWindow*>& set) override;
    void SendRequest(uint32_t code) override;

private:
    bool Holds(const AEArray<ae::stagecraft::StageWindow*>& set) const;

    std::vector<ExtensionClass> m_Classes;
    StopRequest m_Stop;
    std::unique_ptr<Movie> m_Movie;
    // The classes as they were when the movie was created: later registrations must not move what it refers to.
    std::vector<ExtensionClass> m_MovieClasses;
    bool m_WasRun = false;
};
