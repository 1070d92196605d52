// Answers that are not SOAP. The input's first line is the kind of exchange and, if it shall, the most bytes that one
// receive gets; the rest is a whole HTTP message.
#include <arpa/inet.h>
#include <stdio.h>
#include <sys/socket.h>
#include <unistd.h>

#include <thread>

#include "BoxArtDownloader.h"
#include "Discovery.h"
#include "MemoryFile.h"
#include "Peer.h"
#include "Target.h"
#include "TempFolder.h"
#include "ZVUtilities.h"

namespace {

void Discovery(SessionImpl& session)
{
    ZV_WS_EnvID env = ENVID_APISTG;
    const char* url =
        ZVUtilities::QueryServiceBaseURL(ContentType_ZV, &session.m_Stream, "device/1", 48, ENVNUM_DEFAULT, env);
    Require(strncmp(url, "https://", 8) == 0, "any answer leads to a service");
}

void Bandwidth(ZV_WS_Session* handle)
{
    handle->_pSessionImpl->m_Params.Customer->SetBandwidthCheckURL("http://127.0.0.1:1/file");
    unsigned int bitsPerSecond = 0;
    const ZV_WS_Status status = ZV_WS_checkBandwidth(handle, &bitsPerSecond);
    Require((status == ZV_WS_Status_ok) == (bitsPerSecond != 0), "a measure is a number above 0");
}

void ImageToMemory(ZV_WS_Session* handle)
{
    ZV_WS_Image image;
    const ZV_WS_Status status = ZV_WS_getBoxArtImageData(handle, BOX_ART_SIZE_95, "ZV00001", &image);
    Require((status == ZV_WS_Status_ok) == (image.size != 0), "an image has bytes");
    ZV_WS_release(&image);
}

void ImageToFile(SessionImpl& session)
{
    const TempFolder folder;
    const std::string file = folder / "image.jpg";
    BoxArtDownloader downloader(session.m_Download.transport());
    const ZV_WS_Status status = downloader.DownloadToFile("ZV00001", BOX_ART_SIZE_95, "", file.c_str());
    const std::filesystem::directory_iterator entries(folder / "");
    Require(std::distance(begin(entries), end(entries)) == (status == ZV_WS_Status_ok),
            "a whole image is left, or nothing");
    if (status != ZV_WS_Status_ok) return;
    Require(std::filesystem::file_size(file) == downloader.GetContentLength(), "the file is whole");
}

// The clock is asked without a session, over a connection of its own.
class ClockHost {
public:
    ClockHost() : m_Listener(socket(AF_INET, SOCK_STREAM | SOCK_CLOEXEC, 0))
    {
        sockaddr_in address = {};
        address.sin_family = AF_INET;
        address.sin_addr.s_addr = htonl(INADDR_LOOPBACK);
        socklen_t size = sizeof address;
        auto* own = reinterpret_cast<sockaddr*>(&address);
        Require(
            bind(m_Listener, own, size) == 0 && listen(m_Listener, 1) == 0 && getsockname(m_Listener, own, &size) == 0,
            "a port is free");
        const MemoryFile deployment("web_host = 127.0.0.1:" + std::to_string(ntohs(address.sin_port)) + "\n");
        setenv("ZV_DEPLOYMENT", deployment.Path(), 1);
        Require(Deployment::Load() != nullptr, "the deployment is right");
    }
    ~ClockHost() { close(m_Listener); }

    void Ask(std::string_view answer) const
    {
        std::thread host([&] {
            const int connection = accept(m_Listener, nullptr, nullptr);
            send(connection, answer.data(), answer.size(), MSG_NOSIGNAL);
            shutdown(connection, SHUT_WR);
            char piece[512];
            while (recv(connection, piece, sizeof piece, 0) > 0) {
            }
            close(connection);
        });
        time_t time = 0;
        const ZV_WS_Status status = ZV_WS_getServerTime(&time);
        Require(status == ZV_WS_Status_ok || time == -1, "a failure leaves no time");
        host.join();
    }

private:
    const int m_Listener;
};

}  // namespace

void TestInput(std::string_view input)
{
    static const ClockHost clock;
    char kind[32] = "";
    unsigned int piece = 65536;
    sscanf(TakeLine(input).c_str(), "%31s %u", kind, &piece);
    const std::string name = kind;
    if (name == "clock") return clock.Ask(input);
    Peer peer(input, piece);
    PeerSession session;
    if (name == "discovery") Discovery(session.session());
    if (name == "bandwidth") Bandwidth(session.handle());
    if (name == "image-memory") ImageToMemory(session.handle());
    if (name == "image-file") ImageToFile(session.session());
}
