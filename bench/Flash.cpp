// zv_flash FOLDER [OPERATION...]: does the operations one after another, with the client's cache in the folder, while
// flash.sh counts what is written there. Prints how many images were asked from the store.
#include <stdio.h>
#include <stdlib.h>
#include <string.h>
#include <unistd.h>

#include <algorithm>
#include <memory>
#include <numeric>

#include "Store.h"

namespace {

std::string s_folder;
std::unique_ptr<BenchSession> s_session;

// The flag of one title: the session has read the wish list then, which the flags of others are found out from.
void Start()
{
    constexpr unsigned int kAll = ZV_WS_CacheParam::CacheData_Metadata | ZV_WS_CacheParam::CacheData_BoxArtImage |
                                  ZV_WS_CacheParam::CacheData_Userdata;
    s_session = std::make_unique<BenchSession>(s_folder.c_str(), kAll);
    const int title = kItems + 1;
    ZV_WS_TitlesInWishlist answer;
    Check(
        ZV_WS_checkTitlesInWishlist(s_session->handle(), &title, 1, TITLE_TYPE_FILTER_ANY, &answer) == ZV_WS_Status_ok,
        "the flag of one title");
    ZV_WS_release(&answer);
}

void Page()
{
    s_session->GetTitles();
}

void Flags()
{
    int titles[kItems];
    std::iota(std::begin(titles), std::end(titles), 1);
    ZV_WS_TitlesInWishlist answer;
    Check(ZV_WS_checkTitlesInWishlist(s_session->handle(), titles, kItems, TITLE_TYPE_FILTER_ANY, &answer) ==
              ZV_WS_Status_ok,
          "the flags of a page");
    ZV_WS_release(&answer);
}

void Image()
{
    ZV_WS_String place;
    Check(ZV_WS_getBoxArtImage(s_session->handle(), BOX_ART_SIZE_135S, "ZV00012", &place) == ZV_WS_Status_ok,
          "an image");
    ZV_WS_release(&place);
}

void Evening()
{
    RunClient(MOVIES "/evening.js", "token is valid: false");
}

void Pages()
{
    RunClient(MOVIES "/pages.js", "pages were there.");
}

const struct {
    const char* name;
    void (*run)();
} kOperations[] = {{"start", Start}, {"page", Page},       {"flags", Flags},
                   {"image", Image}, {"evening", Evening}, {"pages", Pages}};

void Do(const char* name)
{
    const auto* operation = std::find_if(std::begin(kOperations), std::end(kOperations),
                                         [&](const auto& row) { return strcmp(row.name, name) == 0; });
    Check(operation != std::end(kOperations), name);
    operation->run();
}

}  // namespace

int main(int argc, char** argv)
{
    Check(argc > 1, "a folder for the cache");
    // The client prints its endpoints to standard output.
    const int output = dup(STDOUT_FILENO);
    dup2(STDERR_FILENO, STDOUT_FILENO);
    s_folder = argv[1];
    setenv("ZV_FLASHVARS", ("cache=" + s_folder).c_str(), 1);
    for (int i = 2; i < argc; ++i)
        Do(argv[i]);
    s_session.reset();
    const auto requests = TheStore().Log();
    const auto images = std::count_if(requests.begin(), requests.end(),
                                      [](const LoggedRequest& request) { return request.service == "boxart"; });
    dprintf(output, "%d\n", static_cast<int>(images));
    return 0;
}
