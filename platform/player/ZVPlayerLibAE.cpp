// Desktop stand-in: nothing is decoded or shown.
#include "player/ZVPlayerLibAE.h"

#include <math.h>

#include <new>

#include "PlaybackClock.h"

namespace {

enum Code { kDone = 0, kNotInitialized = -1, kNotNow = -2, kBadArguments = -3 };

constexpr double kUsualDuration = 2 * 60 * 60 * 1000;  // of a movie whose duration is not told
constexpr double kLongestDuration = 24 * 60 * 60 * 1000;
constexpr double kBandwidth = 8000000;

PlaybackClock::Time Now()
{
    return std::chrono::steady_clock::now();
}

const ZVPlayerLibAE::ASValue* Argument(const ZVPlayerLibAE::ASValueArray& arguments, size_t index)
{
    return index < arguments.size() ? &arguments[index] : nullptr;
}

// Leaves the number as it is when there is no such argument; false when it is no number from least to most.
bool ReadNumber(const ZVPlayerLibAE::ASValueArray& arguments, size_t index, double least, double most, double& number)
{
    const ZVPlayerLibAE::ASValue* value = Argument(arguments, index);
    if (!value || value->GetType() == ZVPlayerLibAE::ASValue::kUndefined) return true;
    number = value->GetNumber();
    return value->GetType() == ZVPlayerLibAE::ASValue::kNumber && number >= least && number <= most;
}

}  // namespace

struct ZVPlayerLibAE::Impl {
    bool initialized = false;
    PlaybackClock clock;
    Format3D format = k2D;
    ASValue eventHandler;  // an object, or undefined
    PlaybackState reported = kNoPlayer;

    bool HasPlayer() const { return clock.StateAt(Now()) != kNoPlayer; }
    // What every handler asks first that needs a movie.
    Code Ready() const { return !initialized ? kNotInitialized : !HasPlayer() ? kNotNow : kDone; }

    // The result of a handler that needs a movie: the action's, which runs only when there is one.
    template <class Action>
    ASValue WithPlayer(Action action) const
    {
        const Code code = Ready();
        return ASValue::Number(code == kDone ? static_cast<double>(action()) : static_cast<double>(code));
    }

    void AwaitUpdates(ASObject& object) const
    {
        const PlaybackState state = clock.StateAt(Now());
        if (eventHandler.IsObject() && (state == kPlaying || state != reported)) {
            object.StartUpdates();
        } else {
            object.StopUpdates();
        }
    }

    Code Create(const ASValueArray& arguments)
    {
        const ASValue* address = Argument(arguments, 0);
        double duration = kUsualDuration;
        if (!initialized) return kNotInitialized;
        if (!address || address->GetType() != ASValue::kString || address->GetString().empty()) return kBadArguments;
        if (!ReadNumber(arguments, 1, 1, kLongestDuration, duration)) return kBadArguments;
        if (HasPlayer()) return kNotNow;
        clock.Open(static_cast<int64_t>(duration));
        return kDone;
    }

    Code Play(const ASValueArray& arguments)
    {
        const PlaybackState state = clock.StateAt(Now());
        const bool goesOn = state == kPlaying || state == kPaused;
        double from = goesOn ? static_cast<double>(clock.PositionAt(Now())) : 0;
        if (!ReadNumber(arguments, 0, 0, static_cast<double>(clock.Duration()), from)) return kBadArguments;
        clock.PlayFrom(static_cast<int64_t>(from), Now());
        return kDone;
    }

    Code Pause()
    {
        const PlaybackState state = clock.StateAt(Now());
        if (state != kPlaying && state != kPaused) return kNotNow;
        clock.Pause(Now());
        return kDone;
    }
};

ZVPlayerLibAE::ZVPlayerLibAE() : m_pImpl(new Impl) {}
ZVPlayerLibAE::~ZVPlayerLibAE() = default;

ae::stagecraft::ASExtensionClass* ZVPlayerLibAE::ConstructInstance(StageWindow*, ASObject&, ASValueArray&)
{
    return new (std::nothrow) ZVPlayerLibAE;
}

void ZVPlayerLibAE::DestructInstance(StageWindow*, ASObject& object)
{
    delete object.GetExtensionInstance();
}

#define ZV_HANDLER(name)                                                      \
    void ZVPlayerLibAE::name(StageWindow*, [[maybe_unused]] ASObject& object, \
                             [[maybe_unused]] ASValueArray& arguments, ASValue& returnValue)

ZV_HANDLER(Initialize)
{
    m_pImpl->initialized = true;
    returnValue = ASValue::Number(kDone);
}

ZV_HANDLER(Shutdown)
{
    returnValue = ASValue::Number(m_pImpl->initialized ? kDone : kNotInitialized);
    *m_pImpl = Impl();
    object.StopUpdates();
}

ZV_HANDLER(GetVersion)
{
    returnValue = ASValue::String("desktop 1.0");
}

ZV_HANDLER(CreatePlayer)
{
    returnValue = ASValue::Number(m_pImpl->Create(arguments));
    m_pImpl->AwaitUpdates(object);
}

ZV_HANDLER(ReleasePlayer)
{
    returnValue = m_pImpl->WithPlayer([&] {
        m_pImpl->clock.Close();
        return kDone;
    });
    m_pImpl->AwaitUpdates(object);
}

ZV_HANDLER(Play)
{
    returnValue = m_pImpl->WithPlayer([&] { return m_pImpl->Play(arguments); });
    m_pImpl->AwaitUpdates(object);
}

ZV_HANDLER(Pause)
{
    returnValue = m_pImpl->WithPlayer([&] { return m_pImpl->Pause(); });
    m_pImpl->AwaitUpdates(object);
}

ZV_HANDLER(Stop)
{
    returnValue = m_pImpl->WithPlayer([&] {
        m_pImpl->clock.Stop();
        return kDone;
    });
    m_pImpl->AwaitUpdates(object);
}

ZV_HANDLER(GetPlaybackTime)
{
    returnValue = m_pImpl->WithPlayer([&] { return m_pImpl->clock.PositionAt(Now()); });
}

ZV_HANDLER(GetPlaybackState)
{
    returnValue = ASValue::Number(m_pImpl->initialized ? static_cast<int>(m_pImpl->clock.StateAt(Now()))
                                                       : static_cast<int>(kNotInitialized));
}

ZV_HANDLER(GetDuration)
{
    returnValue = m_pImpl->WithPlayer([&] { return m_pImpl->clock.Duration(); });
}

ZV_HANDLER(GetCurrentBandwidth)
{
    returnValue = m_pImpl->WithPlayer([&] { return m_pImpl->clock.StateAt(Now()) == kPlaying ? kBandwidth : 0; });
}

ZV_HANDLER(RegisterEventHandler)
{
    const ASValue* handler = Argument(arguments, 0);
    if (!m_pImpl->initialized) {
        returnValue = ASValue::Number(kNotInitialized);
        return;
    }
    if (!handler || (!handler->IsObject() && handler->GetType() != ASValue::kNull)) {
        returnValue = ASValue::Number(kBadArguments);
        return;
    }
    m_pImpl->eventHandler = *handler;
    m_pImpl->reported = m_pImpl->clock.StateAt(Now());
    m_pImpl->AwaitUpdates(object);
    returnValue = ASValue::Number(kDone);
}

ZV_HANDLER(THX_ProcessContentDescriptors)
{
    const ASValue* descriptors = Argument(arguments, 0);
    const bool good = descriptors && (descriptors->IsObject() || descriptors->GetType() == ASValue::kString);
    returnValue = ASValue::Number(!m_pImpl->initialized ? kNotInitialized : good ? kDone : kBadArguments);
}

ZV_HANDLER(THX_IsSupportedOnDevice)
{
    returnValue = ASValue::Boolean(false);
}

ZV_HANDLER(getSupported3DFormats)
{
    ASValueArray formats;
    for (int format = k2D; format <= kTopAndBottom; ++format) {
        formats.Append(ASValue::Number(format));
    }
    ASValue array, length;
    if (object.Construct("Array", ASValueArray(), array) && array.IsObject()) {
        array.GetObject()->Call("push", formats, length);
    }
    returnValue = array;
}

ZV_HANDLER(getConfigured3DFormat)
{
    returnValue = ASValue::Number(m_pImpl->format);
}

ZV_HANDLER(set3DMode)
{
    double format = -1;
    const bool good = ReadNumber(arguments, 0, k2D, kTopAndBottom, format) && format == floor(format) && format >= k2D;
    if (m_pImpl->initialized && good) m_pImpl->format = static_cast<Format3D>(static_cast<int>(format));
    returnValue = ASValue::Number(!m_pImpl->initialized ? kNotInitialized : good ? kDone : kBadArguments);
}

ZV_HANDLER(SetLogAreaIDsConfig)
{
    const ASValue* areas = Argument(arguments, 0);
    const bool good = areas && (areas->IsObject() || areas->GetType() == ASValue::kNumber);
    returnValue = ASValue::Number(good ? kDone : kBadArguments);
}

void ZVPlayerLibAE::OnUpdate(StageWindow*, ASObject& object)
{
    const PlaybackState state = m_pImpl->clock.StateAt(Now());
    if (state != m_pImpl->reported) {
        m_pImpl->reported = state;
        const ASValue handler = m_pImpl->eventHandler;  // the script may register another meanwhile
        ASValueArray event;
        event.Append(ASValue::Number(state));
        event.Append(ASValue::Number(static_cast<double>(m_pImpl->clock.PositionAt(Now()))));
        ASValue ignored;
        if (handler.IsObject()) handler.GetObject()->Call("onPlayerEvent", event, ignored);
    }
    m_pImpl->AwaitUpdates(object);
}
