// The services of a session, each a SOAP context with a connection of its own.
#pragma once

#include "RealTimeBrowse.h"
#include "StreamDownloadAPI.h"

struct Services {
    RealTimeBrowse m_Browse;
    StreamAPI m_Stream;
    DownloadAPI m_Download;
    StreamDownloadAPI m_Facade;  ///< The operations that both the download and the stream service offer.
};
