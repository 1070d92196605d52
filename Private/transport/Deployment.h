// Where the services are and whom to trust: the values that differ between a store in production and one on a desk.
#pragma once

#include <stdint.h>

#include "ZVString.h"
#include "ZVWSLib.h"

/// Hosts are "host" or "host:port". Compiled-in defaults stand unless the file named by the environment variable
/// ZV_DEPLOYMENT replaces them; docs/deployment.md lists the keys.
struct Deployment {
    ZVString production_host;
    ZVString api_staging_host;
    ZVString internal_staging_host;
    ZVString adult_production_host;
    ZVString adult_staging_host;
    ZVString image_host;
    ZVString web_host;
    ZVString ca_file;
    ZVString device_key_file;
    ZVString clock_file;
    ZVString connection_idle_limit;

    /// How long a connection may have rested to be used again, in milliseconds.
    uint64_t ConnectionIdleLimit() const;

    /// The services' base URL for a content type and an environment; production for any other environment.
    const char* BaseUrl(ContentType type, int environment) const;

    /// The defaults with what the file (null: none) replaces. False after one line on the error stream.
    static bool Read(const char* fileName, Deployment& values);

    /// Reads the values anew and makes them the current ones. Null after one line on the error stream when the file
    /// cannot be read or holds a mistake; the current ones stay. The object lives as long as the process. Any thread.
    static const Deployment* Load();

    /// The values of the last successful Load; those of a first Load, or the defaults if that fails, before any.
    static const Deployment& Current();

private:
    static constexpr int kEnvironments = 3;
    friend struct DeploymentRegistry;
    void MakeBaseUrls();

    ZVString m_BaseUrls[2 * kEnvironments];
};
