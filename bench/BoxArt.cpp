// One image from its host into memory: the library, which opens a connection for each, against libcurl.
#include <curl/curl.h>

#include "Store.h"

namespace {

constexpr ZV_WS_BoxArtSize kSize = BOX_ART_SIZE_203;
const char kPrefix[] = "ZV100";

void Library(benchmark::State& state)
{
    BenchSession session;
    while (state.KeepRunning()) {
        ZV_WS_Image image;
        const ZV_WS_Status status = ZV_WS_getBoxArtImageData(session.handle(), kSize, kPrefix, &image);
        Check(status == ZV_WS_Status_ok && image.size > 0, "ZV_WS_getBoxArtImageData");
        ZV_WS_release(&image);
    }
}

size_t Take(char* bytes, size_t, size_t length, void* image)
{
    static_cast<std::string*>(image)->append(bytes, length);
    return length;
}

void Curl(benchmark::State& state, bool keeps)
{
    const std::string url =
        "http://localhost:" + std::to_string(TheStore().HttpPort()) + "/images/boxart/203/" + kPrefix + "203.jpg";
    std::string image;
    CURL* curl = curl_easy_init();
    curl_easy_setopt(curl, CURLOPT_URL, url.c_str());
    curl_easy_setopt(curl, CURLOPT_FORBID_REUSE, keeps ? 0L : 1L);
    curl_easy_setopt(curl, CURLOPT_WRITEFUNCTION, Take);
    curl_easy_setopt(curl, CURLOPT_WRITEDATA, &image);
    while (state.KeepRunning()) {
        image.clear();
        Check(curl_easy_perform(curl) == CURLE_OK && !image.empty(), "libcurl's image");
    }
    curl_easy_cleanup(curl);
}

}  // namespace

BENCHMARK(Library)->Name("boxart/library");
BENCHMARK_CAPTURE(Curl, new, false)->Name("boxart/curl");
BENCHMARK_CAPTURE(Curl, kept, true)->Name("boxart/curl-kept");
