// What a session handle points to. Used by one thread at a time.
#pragma once

#include "RealTimeBrowse.h"
#include "SetupParams2.h"
#include "StreamDownloadAPI.h"

struct SessionImpl {
    static constexpr unsigned int kTag = 1;

    RealTimeBrowse m_Browse;
    StreamAPI m_Stream;
    DownloadAPI m_Download;
    StreamDownloadAPI m_Facade;
    ZV_WS_SetupParams2 m_Params;
};
