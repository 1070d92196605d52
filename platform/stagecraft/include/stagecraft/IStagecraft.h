// The script runtime: runs a movie in a set of stage windows and shows it the registered extension classes.
//
// Threads: the main thread is the one that initialises the library. Everything here belongs to it, except SendRequest.
// Order: initialise; register the classes; create, run and destroy a set; uninitialise. One set exists at a time.
#pragma once

#include "stagecraft/AEError.h"
#include "stagecraft/ASExtensionClass.h"

namespace ae {
namespace stagecraft {

class IStagecraft {
public:
    typedef void (*GetMethodsFunction)(AEArray<ASExtensionClass::Method>& methodArrayToFill);
    typedef bool (*FiresEventsFunction)();
    typedef ASExtensionClass* (*ConstructInstanceFunction)(StageWindow* pWindow, ASObject& object,
                                                           ASValueArray& arguments);
    typedef void (*DestructInstanceFunction)(StageWindow* pWindow, ASObject& object);

    // The request to end the movie. The player's software sends it twice in a row (key down, key up).
    enum { kRequestStop = 0x400100 };

    // ---- Start-up glue, carried in the host.

    // Initialises the kernel and loads the runtime; null when either failed.
    static IStagecraft* InitializeStagecraftLibrary(int argc, const char* const* argv);
    // Undoes both. Harmless after a failed initialisation.
    static void UninitializeStagecraftLibrary();

    // ---- Implemented by the runtime.

    // Makes the class known to the sets created from now on. The name is copied; GetMethods and FiresEvents are called
    // during this call, the other two for each instance. InvalidParameters for a null argument, an empty name or part
    // of a name, a name that is registered, or a method without name or handler: the class is then not registered.
    virtual AEError RegisterExtensionClass(const char* pClassName, GetMethodsFunction getMethods,
                                           FiresEventsFunction firesEvents, ConstructInstanceFunction construct,
                                           DestructInstanceFunction destruct) = 0;

    template <class T>
    AEError RegisterExtensionClass()
    {
        return RegisterExtensionClass(T::GetClassName(), &T::GetMethods, &T::FiresEvents, &T::ConstructInstance,
                                      &T::DestructInstance);
    }

    // Creates the windows for the movie that the vector describes and appends them to the set. The vector is only read
    // during the call: options start with "--", an option that takes a value is followed by it, the last entry is the
    // path of the movie. "--flashvars" takes "name=value&name=value", percent-encoded. configure 1 applies the options,
    // other values keep the defaults. No script runs yet. A movie that cannot be read is one line on the error stream
    // naming file and reason, and NotFound; Usage when a set exists. On failure the set is unchanged and needs no
    // destroying; destroying it is harmless.
    virtual AEError CreateAndConfigureStageWindowSet(AEArray<StageWindow*>& set, int argc, const char* const* argv,
                                                     int configure) = 0;

    // Runs the movie and returns when it has ended: by itself (script run, no timer and no registered object left), by
    // the script, by EndMovie, or by kRequestStop. Blocks until then. OK for all of these; Generic when an error at the
    // top level of the script ended it (it was reported on the error stream), or when a stop request had to break off
    // script code that did not return; Usage for a set that does not exist or was run before.
    virtual AEError RunStageWindowSet(AEArray<StageWindow*>& set) = 0;

    // Destructs every extension instance that is left, then frees the windows and empties the set. Harmless for an
    // empty set.
    virtual AEError DestroyStageWindowSet(AEArray<StageWindow*>& set) = 0;

    // Any thread, at any time while the module is loaded; does not block. A stop request for a set that exists and does
    // not run yet must end its movie before any script runs; without a set a request is dropped. Further requests after
    // the first, and unknown codes, do nothing. A stop request must end the movie within seconds, also when its script
    // never returns.
    virtual void SendRequest(uint32_t code) = 0;

protected:
    virtual ~IStagecraft() {}
};

}  // namespace stagecraft
}  // namespace ae
