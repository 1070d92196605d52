#include "Deployment.h"

#include <errno.h>
#include <stdio.h>
#include <stdlib.h>
#include <string.h>

#include <fstream>
#include <list>
#include <string>

#include "Url.h"
#include "ZVMutex.h"

namespace {

enum class Kind { Host, File, Seconds };

struct Key {
    const char* name;
    ZVString Deployment::*value;
    Kind kind;
    const char* standard;
};

const Key kKeys[] = {
    {"production_host", &Deployment::production_host, Kind::Host, "api.zorvane.example"},
    {"api_staging_host", &Deployment::api_staging_host, Kind::Host, "apistg.zorvane.example"},
    {"internal_staging_host", &Deployment::internal_staging_host, Kind::Host, "stg.zorvane.example"},
    {"adult_production_host", &Deployment::adult_production_host, Kind::Host, "kac.zorvane.example"},
    {"adult_staging_host", &Deployment::adult_staging_host, Kind::Host, "kacstg.zorvane.example"},
    {"image_host", &Deployment::image_host, Kind::Host, "images.zorvane.example"},
    {"web_host", &Deployment::web_host, Kind::Host, "www.zorvane.example"},
    {"ca_file", &Deployment::ca_file, Kind::File, ""},
    {"device_key_file", &Deployment::device_key_file, Kind::File, ""},
    {"clock_file", &Deployment::clock_file, Kind::File, ""},
    {"connection_idle_limit", &Deployment::connection_idle_limit, Kind::Seconds, "30"},
};

Deployment Defaults()
{
    Deployment values;
    for (const Key& key : kKeys)
        values.*key.value = key.standard;
    return values;
}

ZVString Trimmed(ZVString text)
{
    text.trim();
    return text;
}

bool IsSeconds(const ZVString& value)
{
    const std::string text = value.c_str();
    return !text.empty() && text.size() <= 5 && text.find_first_not_of("0123456789") == std::string::npos &&
           atoi(text.c_str()) <= 86400;
}

// What is wrong with the line (trimmed), or null.
const char* ReadLine(const ZVString& line, Deployment& values)
{
    if (line.empty() || line[0] == '#') return nullptr;
    const size_t equals = line.find('=');
    if (equals == ZVString::npos) return "no '=' between key and value";
    const ZVString name = Trimmed(line.substr(0, equals));
    const ZVString value = Trimmed(line.substr(equals + 1));
    for (const Key& key : kKeys) {
        if (name != key.name) continue;
        ZVString host;
        int port = 0;
        if (key.kind == Kind::Host && !SplitHostPort(value, 1, host, port)) return "not a host or host:port";
        if (key.kind == Kind::Seconds && !IsSeconds(value)) return "not a number of seconds up to 86400";
        values.*key.value = value;
        return nullptr;
    }
    return "unknown key";
}

bool ReadLines(const char* name, Deployment& values)
{
    std::ifstream file(name, std::ios::binary);
    std::string line;
    int number = 0;
    errno = 0;
    while (std::getline(file, line)) {
        ++number;
        const ZVString text = Trimmed(ZVString(line.data(), line.size()));
        if (const char* mistake = ReadLine(text, values)) {
            fprintf(stderr, "%s:%d: %s: %s\n", name, number, mistake, text.c_str());
            return false;
        }
    }
    if (file.eof() && !file.bad()) return true;
    fprintf(stderr, "%s: cannot read the deployment file: %s\n", name, strerror(errno ? errno : EIO));
    return false;
}

bool Same(const Deployment& a, const Deployment& b)
{
    for (const Key& key : kKeys) {
        if (!(a.*key.value == b.*key.value)) return false;
    }
    return true;
}

}  // namespace

// Every set of values that was ever current; there are few, and sessions and base URLs point into them.
struct DeploymentRegistry {
    ZVMutex mutex;
    std::list<Deployment> all ZV_GUARDED_BY(mutex);
    const Deployment* current ZV_GUARDED_BY(mutex) = nullptr;

    const Deployment* MakeCurrent(const Deployment& values)
    {
        ZVMutexLock lock(mutex);
        current = nullptr;
        for (const Deployment& known : all) {
            if (Same(known, values)) current = &known;
        }
        if (!current) {
            Deployment& added = all.emplace_back(values);
            added.MakeBaseUrls();
            current = &added;
        }
        return current;
    }
};

namespace {

DeploymentRegistry& TheRegistry()
{
    static auto* registry = new DeploymentRegistry;  // outlives every thread that still runs at exit
    return *registry;
}

}  // namespace

void Deployment::MakeBaseUrls()
{
    const struct {
        ZVString Deployment::*host;
        const char* path;
    } table[2 * kEnvironments] = {
        {&Deployment::api_staging_host, "/api/"},       // general catalogue: staging for the interface,
        {&Deployment::internal_staging_host, "/api/"},  // internal staging,
        {&Deployment::production_host, "/api/"},        // production
        {&Deployment::api_staging_host, "/kac/api/"},   // adult catalogue: the same three
        {&Deployment::adult_staging_host, "/api/"},    {&Deployment::adult_production_host, "/api/"},
    };
    for (int i = 0; i < 2 * kEnvironments; ++i)
        m_BaseUrls[i] = ZVString("https://") + this->*table[i].host + table[i].path;
}

uint64_t Deployment::ConnectionIdleLimit() const
{
    return 1000 * strtoull(connection_idle_limit.c_str(), nullptr, 10);
}

const char* Deployment::BaseUrl(ContentType type, int environment) const
{
    if (environment < 0 || environment >= kEnvironments) environment = ENVID_PRODUCTION;
    return m_BaseUrls[(type == ContentType_KAC ? kEnvironments : 0) + environment].c_str();
}

bool Deployment::Read(const char* fileName, Deployment& values)
{
    values = Defaults();
    return !fileName || ReadLines(fileName, values);
}

const Deployment* Deployment::Load()
{
    Deployment values;
    return Read(getenv("ZV_DEPLOYMENT"), values) ? TheRegistry().MakeCurrent(values) : nullptr;
}

const Deployment& Deployment::Current()
{
    DeploymentRegistry& registry = TheRegistry();
    {
        ZVMutexLock lock(registry.mutex);
        if (registry.current) return *registry.current;
    }
    const Deployment* loaded = Load();
    return loaded ? *loaded : *registry.MakeCurrent(Defaults());
}
