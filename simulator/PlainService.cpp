#include "PlainService.h"

#include <algorithm>
#include <ctime>

namespace simulator {

namespace {

const char kBoxArtPath[] = "/images/boxart/";
constexpr size_t kBandwidthFile = 1000000;
const char kLastModified[] = "Mon, 02 Nov 2026 06:00:00 GMT";
const char kLaterModified[] = "Tue, 03 Nov 2026 06:00:00 GMT";

// "11/21/2026 6:30:05 AM"; the service's clock is UTC.
std::string Clock(time_t now)
{
    tm parts;
    gmtime_r(&now, &parts);
    // 13 to 23 hours become 1 to 11 PM; 12 stays, as "12 PM" would be read as midnight.
    const bool afternoon = parts.tm_hour > 12;
    char text[80];
    snprintf(text, sizeof text, "%d/%d/%d %d:%02d:%02d %s", parts.tm_mon + 1, parts.tm_mday, parts.tm_year + 1900,
             afternoon ? parts.tm_hour - 12 : parts.tm_hour, parts.tm_min, parts.tm_sec, afternoon ? "PM" : "AM");
    return text;
}

HttpResponse NotFound(LoggedRequest& log, const std::string& why)
{
    log.violation = why;
    HttpResponse response;
    response.status = 404;
    response.body = "not found: " + why;
    return response;
}

// "/images/boxart/FOLDER/PREFIXSIZE.jpg"; the folder and the size in the name belong together. Null when they are none
// of the store's.
const char* SizeOf(const std::string& folder)
{
    static const char* const kSizes[] = {"95",  "175", "65",  "77",  "102", "126",
                                         "137", "153", "177", "203", "269", "321"};
    if (folder == "135s") return "135";
    for (const char* size : kSizes) {
        if (folder == size) return size;
    }
    return nullptr;
}

HttpResponse BoxArt(const HttpRequest& request, Database& database, const Fault& fault, LoggedRequest& log)
{
    const std::string path = UrlDecode(request.Path());
    const size_t start = sizeof kBoxArtPath - 1;
    const size_t slash = std::min(path.find('/', start), path.size());
    const char* size = SizeOf(path.substr(start, slash - start));
    if (!size) return NotFound(log, "box art has no size " + path.substr(start, slash - start));
    const std::string end = std::string(size) + ".jpg";
    std::string name = path.substr(std::min(slash + 1, path.size()));
    if (name.size() <= end.size() || name.compare(name.size() - end.size(), end.size(), end) != 0)
        return NotFound(log, "box art of that size ends with " + end);
    name.resize(name.size() - end.size());
    log.operation = name;
    if (database.Int("SELECT COUNT(*) FROM title WHERE prefix = ?", {name}) == 0)
        return NotFound(log, "no title has box art " + name);
    const char* modified = kLastModified;
    bool isKnown = request.Header("if-modified-since") == kLastModified;
    if (const Picture* kind = fault.As<Picture>()) {
        switch (*kind) {
            case Picture::NotModified:
                isKnown = true;
                break;
            case Picture::Modified:
                modified = kLaterModified;
                isKnown = false;
                break;
        }
    }
    HttpResponse response;
    response.headers = {{"Last-Modified", modified}};
    if (isKnown) {
        response.status = 304;
        return response;
    }
    response.contentType = "image/jpeg";
    response.body = MakeBoxArt(name, atoi(size));
    return response;
}

HttpResponse Discovery(const HttpRequest& request, int environment, LoggedRequest& log)
{
    for (const char* name : {"d", "dt"})
        log.children.emplace_back(name, request.Parameter(name));
    HttpResponse response;
    response.body = std::to_string(environment);
    if (request.Parameter("d").empty() || request.Parameter("dt").empty())
        return NotFound(log, "discovery wants d and dt");
    return response;
}

}  // namespace

std::string PlainServiceName(const std::string& path)
{
    if (path == "/device/env/") return "discovery";
    if (path == "/device/time/") return "clock";
    if (path == "/bandwidth/test.bin") return "bandwidth";
    if (path.rfind(kBoxArtPath, 0) == 0) return "boxart";
    return "";
}

HttpResponse AnswerPlain(const std::string& service, const HttpRequest& request, Database& database, int environment,
                         time_t now, const Fault& fault, LoggedRequest& log)
{
    log.service = service;
    log.operation = service;
    if (service == "discovery") return Discovery(request, environment, log);
    if (service == "boxart") return BoxArt(request, database, fault, log);
    HttpResponse response;
    if (service == "clock") {
        response.body = Clock(now);
    } else {
        response.contentType = "application/octet-stream";
        response.body.assign(kBandwidthFile, 'b');
    }
    return response;
}

}  // namespace simulator
