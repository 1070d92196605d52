// The media player's script class, "com.orvex.ZVPlayerLibAE". The player library supplies the handlers and the
// construction; the host supplies name, event flag and method table, and registers the class.
//
// Threads: main thread only, like every extension class. No handler blocks.
//
// An instance plays one movie at a time. Times are in milliseconds, bandwidths in bits a second. Handlers without
// another result return a code: 0 done, -1 "Initialize" was not called, -2 not in this state, -3 bad arguments
// (missing, of the wrong kind, out of range; nothing was changed). Handlers with a result return -1 and -2 in its
// place.
#pragma once

#include <memory>

#include "stagecraft/ASExtensionClass.h"

class ZVPlayerLibAE final : public ae::stagecraft::ASExtensionClass {
public:
    typedef ae::stagecraft::StageWindow StageWindow;
    typedef ae::stagecraft::ASObject ASObject;
    typedef ae::stagecraft::ASValue ASValue;
    typedef ae::stagecraft::ASValueArray ASValueArray;

    // Numbers that the script sees.
    enum PlaybackState { kNoPlayer = 0, kStopped = 1, kPlaying = 2, kPaused = 3, kEnded = 4 };
    enum Format3D { k2D = 0, kFramePacking = 1, kSideBySide = 2, kTopAndBottom = 3 };

    // ---- Host
    static const char* GetClassName();
    static bool FiresEvents();
    static void GetMethods(AEArray<Method>& methodArrayToFill);

    // ---- Player library
    static ASExtensionClass* ConstructInstance(StageWindow* pWindow, ASObject& object, ASValueArray& arguments);
    static void DestructInstance(StageWindow* pWindow, ASObject& object);

#define ZV_HANDLER(name) \
    void name(StageWindow* pWindow, ASObject& object, ASValueArray& arguments, ASValue& returnValue)

    ZV_HANDLER(Initialize);  // (): code; again is harmless
    ZV_HANDLER(Shutdown);    // (): code; releases the movie and the event handler
    ZV_HANDLER(GetVersion);  // (): text, always

    ZV_HANDLER(CreatePlayer);         // (address[, duration]): code; -2 when there is a movie already
    ZV_HANDLER(ReleasePlayer);        // (): code
    ZV_HANDLER(Play);                 // ([from]): code; without "from" goes on from a pause, else from the start
    ZV_HANDLER(Pause);                // (): code; a movie that plays or is paused
    ZV_HANDLER(Stop);                 // (): code; back to the start
    ZV_HANDLER(GetPlaybackTime);      // (): position
    ZV_HANDLER(GetPlaybackState);     // (): PlaybackState; -1
    ZV_HANDLER(GetDuration);          // (): duration
    ZV_HANDLER(GetCurrentBandwidth);  // (): bandwidth; 0 unless it plays

    // (object or null): code. From then on the object's onPlayerEvent(state, position) is called on a tick after the
    // state has changed; changes within one tick are one call. A movie that plays keeps the script running while a
    // handler is registered.
    ZV_HANDLER(RegisterEventHandler);

    ZV_HANDLER(THX_ProcessContentDescriptors);  // (descriptors: object or text): code
    ZV_HANDLER(THX_IsSupportedOnDevice);        // (): boolean, always

    ZV_HANDLER(getSupported3DFormats);  // (): array of Format3D, always
    ZV_HANDLER(getConfigured3DFormat);  // (): Format3D, always
    ZV_HANDLER(set3DMode);              // (Format3D): code

    ZV_HANDLER(SetLogAreaIDsConfig);  // (areas: array or number): code

#undef ZV_HANDLER

    void OnUpdate(StageWindow* pWindow, ASObject& object) override;
    ZVPlayerLibAE(const ZVPlayerLibAE&) = delete;
    ZVPlayerLibAE& operator=(const ZVPlayerLibAE&) = delete;
    ~ZVPlayerLibAE() override;

private:
    ZVPlayerLibAE();

    struct Impl;
    std::unique_ptr<Impl> m_pImpl;
};
