// The reports of signals: real faults in a child of the test, and the real process.
#include "CrashHandler.h"

#include <errno.h>
#include <fcntl.h>
#include <limits.h>
#include <malloc.h>
#include <stdlib.h>
#include <string.h>
#include <sys/mman.h>
#include <sys/prctl.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>
#include <functional>
#include <thread>

#include "CrashConsole.h"
#include "HostLines.h"
#include "TempFolder.h"
#include "ZVThread.h"
#include "ZV_Log.h"

namespace {

// The allocator of the C library ends the process in an order of its own; a sanitizer's does in another.
#ifdef ZV_SANITIZED
constexpr bool kHasPlainHeap = false;
#else
constexpr bool kHasPlainHeap = true;
#endif

// ---- Faults

char* Unreadable()
{
    static char* page = static_cast<char*>(mmap(nullptr, 4096, PROT_NONE, MAP_PRIVATE | MAP_ANONYMOUS, -1, 0));
    return page;
}

void Touch()
{
    *static_cast<volatile char*>(Unreadable() + 8) = 1;
}

int Deepen(volatile int depth)
{
    volatile char room[4096];
    room[0] = static_cast<char>(depth);
    return depth < 0 ? 0 : Deepen(depth + 1) + room[0];
}

void Overflow()
{
    Deepen(0);
}

// On a thread of the client's.
void OverflowElsewhere()
{
    ZVThread* thread = ZVThread::CreateThread();
    thread->Run(
        "overflow", [](void*) { Overflow(); }, nullptr);
    ZVThread::SafeDestroyThread(thread);
}

// Writes over the size of the heap's rest. The allocator ends the process when it next looks there, with its lock held,
// which it takes only in a process with threads.
void CorruptHeap()
{
    std::thread([] { pause(); }).detach();
    mallopt(M_ARENA_MAX, 1);
    const size_t size = 100000;  // from the rest, not out of a bin
    static char* volatile last;
    last = static_cast<char*>(malloc(size));
    static char* volatile rest;
    rest = last + malloc_usable_size(last);
    memset(rest, 0xff, sizeof(size_t));
    last = static_cast<char*>(malloc(size));
}

// Nobody reads what it prints.
void AbortBehindAFullPipe()
{
    int ends[2];
    if (pipe2(ends, O_NONBLOCK) != 0) _exit(1);
    while (write(ends[1], "x", 1) == 1) {
    }
    fcntl(ends[1], F_SETFL, 0);
    dup2(ends[1], STDOUT_FILENO);
    abort();
}

// As a fault repeats.
template <int kSignal>
void RaiseTwice()
{
    raise(kSignal);
    raise(kSignal);
}

// The action that SIGSEGV had before start-up: every fatal signal ends with it.
void OldSegv(int signal)
{
    _exit(signal + 100);
}

void Fail(const std::function<void()>& cause)
{
    prctl(PR_SET_PDEATHSIG, SIGKILL);  // a report that hangs ends with the test
    dup2(STDERR_FILENO, STDOUT_FILENO);
    struct sigaction old = {};
    old.sa_handler = OldSegv;
    old.sa_flags = SA_ONSTACK;
    sigaction(SIGSEGV, &old, nullptr);
    zv_dbg_init();
    _EN_CORE_DUMP = true;
    cause();
}

// The report of a fatal signal, to the end of what is printed. No line of registers has a "k".
std::string Report(const std::string& title, bool backtrace)
{
    return "\n" + title + "\nPid: [0-9]+, comm: +host_tests\npc : \\[<[^k]*\n" +
           (backtrace ? "backtrace:\n.+\\[0x[0-9a-f]+\\]\n" : "") + "Using default signal handler\\.\n$";
}

TEST(FaultDeathTest, IsReported)
{
    char address[32];
    snprintf(address, sizeof(address), "%p\n", static_cast<void*>(Unreadable() + 8));
    const std::string pc = "\n\n\tpc: 0x[0-9a-f]+, ";
    const struct {
        int signal;
        void (*cause)();
        std::string title;
        bool backtrace;
    } rows[] = {{SIGSEGV, Touch, "Invalid memory reference" + pc + "addr: " + address, false},
                {SIGSEGV, Overflow, "Invalid memory reference" + pc + "addr: 0x[0-9a-f]+\n", false},
                {SIGSEGV, OverflowElsewhere, "Invalid memory reference" + pc + "addr: 0x[0-9a-f]+\n", false},
                {SIGILL, RaiseTwice<SIGILL>, "Illegal Instruction" + pc + "inst: 0x[0-9a-f]{8}\n", true},
                {SIGFPE, RaiseTwice<SIGFPE>, "Floating point exception" + pc + "inst: 0x[0-9a-f]{8}\n", true},
                {SIGABRT, RaiseTwice<SIGABRT>, " Abort signal\n\n", true}};
    for (const auto& row : rows)
        EXPECT_EXIT(Fail(row.cause), testing::ExitedWithCode(row.signal + 100), "^" + Report(row.title, row.backtrace));
}

// What was printed and logged before comes first, and nothing of it is lost.
TEST(FaultDeathTest, ABrokenHeapIsReportedAfterWhatCameBefore)
{
    if (!kHasPlainHeap) GTEST_SKIP() << "a sanitizer's allocator";
    const TempFolder folder;
    const auto cause = [&] {
        int area = -1;
        ZV_LogTarget target;
        void* file;
        ZV_LogRegisterArea("crash", &area);
        ZV_LogGetFileTarget((folder / "log.txt").c_str(), &target, &file, 0, true);
        ZV_LogSetTarget(target, file);
        ZV_LogOutput(area, ZV_LOG_TRACE, "logged before\n");
        printf("printed before\n");
        CorruptHeap();
    };
    // The C library goes on to the default action.
    EXPECT_EXIT(Fail(cause), testing::KilledBySignal(SIGABRT), "printed before\n" + Report(" Abort signal\n\n", true));
    EXPECT_NE(std::string::npos, folder.Read("log.txt").find("-crash] logged before\n"));
}

TEST(FaultDeathTest, EndsInTimeThoughTheConsoleTakesNothing)
{
    EXPECT_EXIT(Fail(AbortBehindAFullPipe), testing::ExitedWithCode(SIGABRT + 100), "");
}

TEST(FaultDeathTest, TheInterruptedCodeKeepsItsErrno)
{
    const auto interrupt = [] {
        zv_dbg_init();
        errno = EXDEV;
        raise(SIGTERM);
        _exit(errno == EXDEV ? 0 : 1);
    };
    EXPECT_EXIT(interrupt(), testing::ExitedWithCode(0), "");
}

TEST(CrashConsoleTest, PrintsAsPrintfDoes)
{
    testing::internal::CaptureStdout();
    char expected[256];
    const auto print = [](auto printer) {
        printer("%d|%-2d|%3d|%d|%s|%6s|%-6s|", 0, 7, -12, INT_MIN, "", "right", "left");
        printer("%p|%p|%lx|%08lx|%016lx|", static_cast<void*>(nullptr), reinterpret_cast<void*>(0xabc), 0ul, 0x1ful,
                ~0ul);
    };
    std::string wanted;
    print([&](const char* format, auto... values) {
        snprintf(expected, sizeof expected, format, values...);
        wanted += expected;
    });
    print([](const char* format, auto... values) { CrashPrint(format, values...); });
    EXPECT_EQ(wanted, testing::internal::GetCapturedStdout());

    testing::internal::CaptureStdout();
    CrashPrint("%s", std::string(5000, 'x').c_str());
    EXPECT_EQ(std::string(1023, 'x') + "\n", testing::internal::GetCapturedStdout());
}

// ---- The process

class CrashTest : public testing::Test {
protected:
    Environment Variables(const Environment& more = {})
    {
        Environment environment = {{"STAGECRAFT_MOVIE", m_Folder.Write("movie.js", kRunsOn)},
                                   // A sanitizer's own handlers would be the actions from before.
                                   {"TSAN_OPTIONS", "handle_segv=0"},
                                   {"ASAN_OPTIONS", "handle_segv=0"}};
        environment.insert(environment.end(), more.begin(), more.end());
        return environment;
    }

    // The thread with that name.
    static pid_t Thread(pid_t process, const std::string& wanted)
    {
        pid_t found = -1;
        for (const auto& task : std::filesystem::directory_iterator("/proc/" + std::to_string(process) + "/task")) {
            std::string name;
            std::ifstream(task.path() / "comm") >> name;
            if (name == wanted) found = atoi(task.path().filename().c_str());
        }
        return found;
    }

    // While its handler runs, a thread gets no second signal of the kind: that one meets the action given back.
    static void Send(const Process& process, pid_t thread, int signal)
    {
        EXPECT_EQ(0, syscall(SYS_tgkill, process.Pid(), thread, signal));
    }

    TempFolder m_Folder;
};

TEST_F(CrashTest, SegvLeavesTheProcessPaused)
{
    Process host({ZV_STAGECRAFT, "5"}, Variables());
    ASSERT_TRUE(host.WaitForLine("running"));
    kill(host.Pid(), SIGSEGV);
    ASSERT_TRUE(host.WaitForLine("Invalid memory reference"));
    char comm[64];
    snprintf(comm, sizeof(comm), "Pid: %d, comm: %20s", static_cast<int>(host.Pid()), "zv_stagecraft");
    ASSERT_TRUE(host.WaitForLine(comm));
    // Its movie does not end any more: nothing but a kill ends it.
    EXPECT_EQ(0, waitpid(host.Pid(), nullptr, WNOHANG));
    kill(host.Pid(), SIGKILL);
    EXPECT_EQ(SIGKILL, WTERMSIG(host.WaitForEnd()));
    for (const std::string& line : host.Output()) {
        EXPECT_EQ(std::string::npos, line.find("Using default"));
    }
}

// With a core dump the process ends, here by a fault of another thread, which the report names.
TEST_F(CrashTest, CoreDumpModeIsSetByTheEnvironment)
{
    Process host({ZV_STAGECRAFT, "5"}, Variables({{"ZV_CORE_DUMP", "1"}}));
    ASSERT_TRUE(host.WaitForLine("running"));
    ASSERT_TRUE(host.WaitForLine("[ZV_FLASH] NETWORK_MSG_STUB_INIT !"));
    const pid_t listener = Thread(host.Pid(), "zv_ipc_listen");
    ASSERT_GT(listener, 0);
    Send(host, listener, SIGABRT);
    char comm[64];
    snprintf(comm, sizeof(comm), "Pid: %d, comm: %20s", static_cast<int>(host.Pid()), "zv_ipc_listen");
    EXPECT_TRUE(host.WaitForLine(comm));
    Send(host, listener, SIGABRT);  // as the fault itself would repeat
    EXPECT_EQ(SIGABRT, WTERMSIG(host.WaitForEnd()));
}

TEST_F(CrashTest, SecondInterruptEndsTheProcess)
{
    const std::pair<int, const char*> signals[] = {{SIGINT, "Interrupt from keyboard"},
                                                   {SIGTERM, "Termination signal"}};
    for (const auto& [signal, text] : signals) {
        Process host({ZV_STAGECRAFT, "5"}, Variables());
        ASSERT_TRUE(host.WaitForLine("running"));
        ASSERT_TRUE(host.WaitForLine("[ZV_FLASH] NETWORK_MSG_STUB_INIT !"));
        kill(host.Pid(), SIGPIPE);  // ignored
        Send(host, host.Pid(), signal);
        ASSERT_TRUE(host.WaitForLine("Using default signal handler."));
        Send(host, host.Pid(), signal);
        EXPECT_EQ(signal, WTERMSIG(host.WaitForEnd()));
        Lines lines = host.Output();  // the listen thread may print on meanwhile
        lines.erase(std::remove(lines.begin(), lines.end(), "[ZV_FLASH] IPC enter "), lines.end());
        EXPECT_EQ((Lines{"", text, "", "Using default signal handler."}), Lines(lines.end() - 4, lines.end()));
    }
}

}  // namespace
