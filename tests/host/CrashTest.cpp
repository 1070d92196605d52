// The reports of signals: real faults in a child of the test, and the real process.
#include "CrashHandler.h"

#include <stdlib.h>
#include <string.h>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <filesystem>
#include <fstream>

#include "HostLines.h"
#include "TempFolder.h"

// The handler's stdio is accepted.
extern "C" const char* __tsan_default_options()
{
    return "report_signal_unsafe=0";
}

namespace {

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

void Fail(void (*cause)())
{
    dup2(STDERR_FILENO, STDOUT_FILENO);
    struct sigaction old = {};
    old.sa_handler = OldSegv;
    old.sa_flags = SA_ONSTACK;
    sigaction(SIGSEGV, &old, nullptr);
    zv_dbg_init();
    _EN_CORE_DUMP = true;
    cause();
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
                {SIGILL, RaiseTwice<SIGILL>, "Illegal Instruction" + pc + "inst: 0x[0-9a-f]{8}\n", true},
                {SIGFPE, RaiseTwice<SIGFPE>, "Floating point exception" + pc + "inst: 0x[0-9a-f]{8}\n", true},
                {SIGABRT, RaiseTwice<SIGABRT>, " Abort signal\n\n", true}};
    for (const auto& row : rows) {
        // No line of registers has a "k".
        const std::string report = "^\n" + row.title + "\nPid: [0-9]+, comm: +host_tests\npc : \\[<[^k]*\n" +
                                   (row.backtrace ? "backtrace:\n.*\n" : "") + "Using default signal handler\\.\n$";
        EXPECT_EXIT(Fail(row.cause), testing::ExitedWithCode(row.signal + 100), report);
    }
}

// ---- The process

class CrashTest : public testing::Test {
protected:
    Environment Variables(const Environment& more = {})
    {
        Environment environment = {{"STAGECRAFT_MOVIE", m_folder.Write("movie.js", kRunsOn)},
                                   // A sanitizer's own handlers would be the actions from before.
                                   {"TSAN_OPTIONS", "report_signal_unsafe=0:handle_segv=0"},
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

    TempFolder m_folder;
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
