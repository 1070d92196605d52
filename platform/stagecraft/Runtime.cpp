#include "Runtime.h"

#include <algorithm>
#include <cerrno>
#include <cstdio>
#include <cstdlib>
#include <cstring>

#include "LastLine.h"

using namespace ae::stagecraft;

namespace {

// What goes out is made here: the named constants belong to the host.
AEError Ok()
{
    return AEError("AEError_OK", AEError::OK);
}
AEError Failed(AEError::GlobalErrors value)
{
    switch (value) {
        case AEError::NotFound:
            return AEError("AEError_NotFound", value);
        case AEError::Usage:
            return AEError("AEError_Usage", value);
        case AEError::InvalidParameters:
            return AEError("AEError_InvalidParameters", value);
        default:
            return AEError("AEError_Generic", value);
    }
}

// No part of a dotted name is empty.
bool IsDottedName(const std::string& name)
{
    return !name.empty() && name.front() != '.' && name.back() != '.' && name.find("..") == std::string::npos;
}

double TicksPerSecond()
{
    const double kDefault = 30;
    const char* pText = getenv("STAGECRAFT_FPS");
    if (!pText || !*pText) return kDefault;
    char* pEnd = nullptr;
    const double ticks = strtod(pText, &pEnd);
    if (*pEnd == '\0' && ticks >= 1 && ticks <= 1000) return ticks;
    fprintf(stderr, "stagecraft: STAGECRAFT_FPS is not a number from 1 to 1000: %s\n", pText);
    return kDefault;
}

MovieOptions ReadOptions(int argc, const char* const* argv, bool configure)
{
    MovieOptions options;
    const char* pMovie = getenv("STAGECRAFT_MOVIE");
    options.path = pMovie && *pMovie ? pMovie : argv[argc - 1];
    options.ticksPerSecond = TicksPerSecond();
    for (int i = 1; configure && i + 2 < argc; ++i) {
        if (strcmp(argv[i], "--flashvars") == 0) options.flashVars = argv[i + 1];
    }
    return options;
}

// Prints why a movie cannot be read.
bool ReadMovie(const std::string& path, std::string& text)
{
    const size_t kLargest = 64u << 20;
    const char* pReason = nullptr;
    FILE* pFile = fopen(path.c_str(), "rb");
    if (pFile) {
        char part[65536];
        size_t got;
        while ((got = fread(part, 1, sizeof(part), pFile)) > 0 && text.size() <= kLargest) {
            text.append(part, got);
        }
        if (text.size() > kLargest) {
            pReason = "it is larger than 64 MiB";
        } else if (ferror(pFile)) {
            pReason = strerror(errno);
        }
        fclose(pFile);
    } else {
        pReason = strerror(errno);
    }
    if (pReason) fprintf(stderr, "stagecraft: cannot read the movie %s: %s\n", path.c_str(), pReason);
    return !pReason;
}

}  // namespace

AEError Runtime::RegisterExtensionClass(const char* pClassName, GetMethodsFunction getMethods,
                                        FiresEventsFunction firesEvents, ConstructInstanceFunction construct,
                                        DestructInstanceFunction destruct)
{
    if (!pClassName || !IsDottedName(pClassName) || !getMethods || !firesEvents || !construct || !destruct) {
        return Failed(AEError::InvalidParameters);
    }
    ExtensionClass extension{pClassName, {}, construct, destruct};
    const bool known = std::any_of(m_Classes.begin(), m_Classes.end(),
                                   [&](const ExtensionClass& other) { return other.name == extension.name; });
    if (known) return Failed(AEError::InvalidParameters);
    firesEvents();  // this runtime has no events to fire
    getMethods(extension.methods);
    for (const ASExtensionClass::Method& method : extension.methods) {
        if (!method.m_pName || !*method.m_pName || !method.m_function) return Failed(AEError::InvalidParameters);
    }
    m_Classes.push_back(std::move(extension));
    return Ok();
}

AEError Runtime::CreateAndConfigureStageWindowSet(AEArray<StageWindow*>& set, int argc, const char* const* argv,
                                                  int configure)
{
    if (m_Movie) return Failed(AEError::Usage);
    if (!argv || argc < 1 || std::find(argv, argv + argc, nullptr) != argv + argc) {
        return Failed(AEError::InvalidParameters);
    }
    MovieOptions options = ReadOptions(argc, argv, configure == 1);
    std::string text;
    if (!ReadMovie(options.path, text)) return Failed(AEError::NotFound);

    m_MovieClasses = m_Classes;
    m_Movie = std::make_unique<Movie>(std::move(options), std::move(text), m_MovieClasses, m_Stop);
    m_WasRun = false;
    m_Stop.Reset();
    set.Append(m_Movie.get());
    return Ok();
}

bool Runtime::Holds(const AEArray<StageWindow*>& set) const
{
    return m_Movie && std::find(set.begin(), set.end(), m_Movie.get()) != set.end();
}

AEError Runtime::RunStageWindowSet(AEArray<StageWindow*>& set)
{
    if (!Holds(set) || m_WasRun) return Failed(AEError::Usage);
    m_WasRun = true;
    LastLine::MovieBegins();
    const bool succeeded = m_Movie->Run();
    LastLine::MovieEnds(m_Stop.Raised());
    return succeeded ? Ok() : Failed(AEError::Generic);
}

AEError Runtime::DestroyStageWindowSet(AEArray<StageWindow*>& set)
{
    if (Holds(set)) m_Movie.reset();
    set.RemoveAll();
    return Ok();
}

void Runtime::SendRequest(uint32_t code)
{
    if (code == kRequestStop) m_Stop.Raise();
}
