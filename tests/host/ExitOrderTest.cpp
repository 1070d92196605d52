// A close that the player system requests while the host ends by itself, at every point where the two threads can meet.
// This program has a console and a queue of its own, in which threads are held.
#include <errno.h>
#include <gtest/gtest.h>
#include <stdarg.h>
#include <stdlib.h>
#include <string.h>
#include <sys/prctl.h>
#include <unistd.h>

#include <condition_variable>
#include <deque>
#include <mutex>
#include <string>
#include <thread>

#include "Host.h"
#include "HostConsole.h"
#include "IpcChannel.h"
#include "TempFolder.h"
#include "player/NetworkStub.h"

namespace {

const char* const kSends = "(sends)";

// What the main thread prints or does when the request arrives, in order; `isOpen`: the player system has not been told
// of an active exit.
const struct {
    const char* at;
    bool isOpen;
} kMainPoints[] = {{"[ZV_FLASH] ZV FLASH Run Over! ", true},
                   {"[ZV_FLASH] zv_stagecraft_finalize_proc calling! Active Exit ", true},
                   {"[ZV_FLASH]Call----> zv_stagecraft_finalize_proc ", true},
                   {"<ZV_FLASH> exit_zv_stagecraft enter! ", true},
                   {"<ZV_FLASH> exit_zv_stagecraft leave! ", true},
                   {"[ZV_FLASH] stop_zv_app_ipc_listen_thread Enter! ", true},
                   {"[ZV_FLASH] STOP: send FINALIZE msg to BDP ", false},
                   {kSends, false},
                   {"[ZV_FLASH] ZV FLASH Run End ", false}};

// How far the listen thread gets with the request before the main thread goes on to its end; `isNoted`: the request is
// known by then.
const struct {
    const char* at;
    bool isNoted;
} kListenPoints[] = {{"[ZV_FLASH] IPC get 3 ", false},
                     {"[ZV_FLASH] NETWORK_MSG_STUB_UNINIT !", false},
                     {"[ZV_FLASH]Call----> zv_stagecraft_uninit_proc ", true},
                     {"<ZV_FLASH> exit_zv_stagecraft enter! ", true},
                     {"<ZV_FLASH> exit_zv_stagecraft leave! ", true},
                     {"<ZV_FLASH> ipc listener thread main has exit!", true}};

// The child process's, set before its threads exist.
std::string s_mainPoint, s_listenPoint;
std::thread::id s_main;

std::mutex s_mutex;  // for the rest
std::condition_variable s_changed;
std::deque<uint32_t> s_toHost;
int s_sent = 0;  // the types, a digit each
bool s_isOpen = false, s_listenerIsHeld = false, s_mainHasEnded = false;

// The thread is at that point.
void Pass(const std::string& point)
{
    std::unique_lock<std::mutex> lock(s_mutex);
    if (std::this_thread::get_id() == s_main) {
        if (point != s_mainPoint) return;
        s_mainPoint.clear();
        s_toHost.push_back(NETWORK_MSG_STUB_UNINIT);
        s_changed.notify_all();
        s_changed.wait(lock, [] { return s_listenerIsHeld; });
    } else if (point == s_listenPoint) {
        s_listenerIsHeld = true;
        s_changed.notify_all();
        s_changed.wait(lock, [] { return s_mainHasEnded; });
    }
}

}  // namespace

void HostPrint(const char* format, ...)
{
    char text[256];
    va_list arguments;
    va_start(arguments, format);
    vsnprintf(text, sizeof text, format, arguments);
    va_end(arguments);
    text[strcspn(text, "\n")] = '\0';
    Pass(text);
}

int init_network_msg_queue()
{
    const std::lock_guard<std::mutex> lock(s_mutex);
    s_isOpen = true;
    return 0;
}

void uninit_network_msg_queue()
{
    const std::lock_guard<std::mutex> lock(s_mutex);
    s_isOpen = false;
    s_changed.notify_all();
}

int network_stub_recv_ipc_msg(NETWORK_MSG_STUB_MESSAGE* message)
{
    std::unique_lock<std::mutex> lock(s_mutex);
    s_changed.wait(lock, [] { return !s_isOpen || !s_toHost.empty(); });
    if (!s_isOpen) return ENOTCONN;
    *message = {s_toHost.front(), {0, 0, 0}};
    s_toHost.pop_front();
    return 0;
}

int network_stub_send_ipc_msg(const NETWORK_MSG_STUB_MESSAGE* message)
{
    Pass(kSends);
    const std::lock_guard<std::mutex> lock(s_mutex);
    if (!s_isOpen) return ENOTCONN;
    s_sent = s_sent * 10 + static_cast<int>(message->type);
    return 0;
}

namespace {

// Exits with the types of the messages sent.
void End(const std::string& mainPoint, const std::string& listenPoint)
{
    prctl(PR_SET_PDEATHSIG, SIGKILL);  // threads that are never released end with the test
    s_mainPoint = mainPoint;
    s_listenPoint = listenPoint;
    s_main = std::this_thread::get_id();
    zv_stagecraft_ipc_init();
    start_zv_stagecraft_ipc_listen_thread();
    const char* vector[] = {"stagecraft", "movie"};
    main_zv_stagecraft(2, vector);
    {
        const std::lock_guard<std::mutex> lock(s_mutex);
        s_mainHasEnded = true;
        s_changed.notify_all();
    }
    WaitForIpcListenThread();
    _exit(s_sent);
}

// UNINIT_RET, or FINALIZE when that was on its way first; never both, never none.
TEST(ExitOrderDeathTest, ARequestedCloseGetsItsAnswer)
{
    const TempFolder folder;
    setenv("STAGECRAFT_MOVIE", folder.Write("movie.js", "").c_str(), 1);
    for (const auto& main : kMainPoints) {
        for (const auto& listener : kListenPoints) {
            const int answer =
                main.isOpen && listener.isNoted ? NETWORK_MSG_STUB_UNINIT_RET : NETWORK_MSG_STUB_FINALIZE;
            EXPECT_EXIT(End(main.at, listener.at), testing::ExitedWithCode(answer), "") << main.at << listener.at;
        }
    }
}

}  // namespace
