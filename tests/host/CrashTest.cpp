// The reports of signals: real faults in a child of the test, and the real process.
#include "CrashHandler.h"

#include <dirent.h>
#include <sched.h>
#include <stdlib.h>
#include <string.h>
#include <sys/mman.h>
#include <sys/syscall.h>
#include <sys/wait.h>
#include <unistd.h>

#include <algorithm>
#include <chrono>
#include <fstream>

#include "HostLines.h"

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

void Illegal()
{
#if defined(__x86_64__)
    asm volatile("ud2");
#else
    raise(SIGILL);
#endif
}

void Divide()
{
#if defined(__x86_64__)
    asm volatile("xorl %%ecx, %%ecx; movl $1, %%eax; cltd; idivl %%ecx" ::: "eax", "ecx", "edx");
#else
    raise(SIGFPE);
#endif
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

// As a fault repeats; abort() itself takes the default action after the first.
void Abort()
{
    raise(SIGABRT);
    raise(SIGABRT);
}

struct Fault {
    const char* name;
    int signal;
    void (*cause)();
    const char* title;
    const char* place;  // how its line begins; null: none
    bool backtrace;
};

// The action that SIGSEGV had before start-up: every fatal signal ends with it.
void OldSegv(int signal)
{
    _exit(signal + 100);
}

class FaultTest : public testing::TestWithParam<Fault> {};

TEST_P(FaultTest, IsReported)
{
    Unreadable();
    int output[2];
    ASSERT_EQ(0, pipe(output));
    const pid_t child = fork();
    if (child == 0) {
        dup2(output[1], STDOUT_FILENO);
        struct sigaction old = {};
        old.sa_handler = OldSegv;
        old.sa_flags = SA_ONSTACK;
        sigaction(SIGSEGV, &old, nullptr);
        zv_dbg_init();
        _EN_CORE_DUMP = true;
        GetParam().cause();
        _exit(1);
    }
    close(output[1]);
    std::string text;
    char part[4096];
    for (ssize_t got; (got = read(output[0], part, sizeof(part))) > 0;) {
        text.append(part, static_cast<size_t>(got));
    }
    close(output[0]);
    int status = 0;
    waitpid(child, &status, 0);
    EXPECT_TRUE(WIFEXITED(status));
    EXPECT_EQ(GetParam().signal + 100, WEXITSTATUS(status));

    const std::string start = std::string("\n") + GetParam().title + "\n\n";
    EXPECT_EQ(start, text.substr(0, start.size()));
    if (GetParam().place) {
        EXPECT_EQ(start.size(), text.find(GetParam().place));
    }
    char name[20], comm[64];
    std::ifstream("/proc/self/comm") >> name;
    snprintf(comm, sizeof(comm), "\n\nPid: %d, comm: %20s\npc : [<", static_cast<int>(child), name);
    EXPECT_NE(std::string::npos, text.find(comm + (GetParam().place ? 1 : 2))) << text;
    EXPECT_EQ(GetParam().backtrace, text.find("\nbacktrace:\n") != std::string::npos) << text;
    const std::string end = "Using default signal handler.\n";
    EXPECT_EQ(text.size() - end.size(), text.rfind(end)) << text;
    if (GetParam().cause == Touch) {
        char address[64];
        snprintf(address, sizeof(address), ", addr: %p\n", static_cast<void*>(Unreadable() + 8));
        EXPECT_NE(std::string::npos, text.find(address)) << text;
    }
}

INSTANTIATE_TEST_SUITE_P(Signals, FaultTest,
                         testing::Values(Fault{"Segv", SIGSEGV, Touch, "Invalid memory reference", "\tpc: 0x", false},
                                         Fault{"Overflow", SIGSEGV, Overflow, "Invalid memory reference", "\tpc: 0x",
                                               false},
                                         Fault{"Ill", SIGILL, Illegal, "Illegal Instruction", "\tpc: 0x", true},
                                         Fault{"Fpe", SIGFPE, Divide, "Floating point exception", "\tpc: 0x", true},
                                         Fault{"Abrt", SIGABRT, Abort, " Abort signal", nullptr, true}),
                         [](const testing::TestParamInfo<Fault>& info) { return info.param.name; });

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
        const std::string tasks = "/proc/" + std::to_string(process) + "/task";
        pid_t found = -1;
        DIR* folder = opendir(tasks.c_str());
        while (const dirent* entry = folder ? readdir(folder) : nullptr) {
            std::string name;
            std::getline(std::ifstream(tasks + "/" + entry->d_name + "/comm") >> std::ws, name);
            if (name == wanted) found = atoi(entry->d_name);
        }
        if (folder) closedir(folder);
        return found;
    }

    // Until the process has no handler for the signal any more.
    static bool WaitUntilGivenBack(pid_t process, int signal)
    {
        const auto patience = std::chrono::steady_clock::now() + std::chrono::minutes(1);
        while (std::chrono::steady_clock::now() < patience) {
            std::ifstream status("/proc/" + std::to_string(process) + "/status");
            unsigned long long caught = ~0ull;
            for (std::string line; std::getline(status, line);) {
                if (line.compare(0, 7, "SigCgt:") == 0) caught = std::stoull(line.substr(7), nullptr, 16);
            }
            if (!(caught >> (signal - 1) & 1)) return true;
            sched_yield();
        }
        return false;
    }

    Folder m_folder;
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

TEST_F(CrashTest, WorkerThreadIsNamed)
{
    Process host({ZV_STAGECRAFT, "5"}, Variables());
    ASSERT_TRUE(host.WaitForLine("running"));
    ASSERT_TRUE(host.WaitForLine("[ZV_FLASH] NETWORK_MSG_STUB_INIT !"));
    const pid_t listener = Thread(host.Pid(), "zv_ipc_listen");
    ASSERT_GT(listener, 0);
    syscall(SYS_tgkill, host.Pid(), listener, SIGSEGV);
    char comm[64];
    snprintf(comm, sizeof(comm), "Pid: %d, comm: %20s", static_cast<int>(host.Pid()), "zv_ipc_listen");
    EXPECT_TRUE(host.WaitForLine(comm));
}

TEST_F(CrashTest, CoreDumpModeIsSetByTheEnvironment)
{
    Process host({ZV_STAGECRAFT, "5"}, Variables({{"ZV_CORE_DUMP", "1"}}));
    ASSERT_TRUE(host.WaitForLine("running"));
    kill(host.Pid(), SIGABRT);
    ASSERT_TRUE(host.WaitForLine(" Abort signal"));
    ASSERT_TRUE(host.WaitForLine("backtrace:"));
    ASSERT_TRUE(WaitUntilGivenBack(host.Pid(), SIGABRT));
    kill(host.Pid(), SIGABRT);  // as the fault itself would repeat
    EXPECT_EQ(SIGABRT, WTERMSIG(host.WaitForEnd()));
}

TEST_F(CrashTest, SecondInterruptEndsTheProcess)
{
    const struct {
        int signal;
        const char* text;
    } kSignals[] = {{SIGINT, "Interrupt from keyboard"}, {SIGTERM, "Termination signal"}};
    for (const auto& row : kSignals) {
        Process host({ZV_STAGECRAFT, "5"}, Variables());
        ASSERT_TRUE(host.WaitForLine("running"));
        ASSERT_TRUE(host.WaitForLine("[ZV_FLASH] NETWORK_MSG_STUB_INIT !"));
        kill(host.Pid(), SIGPIPE);  // ignored
        kill(host.Pid(), row.signal);
        ASSERT_TRUE(host.WaitForLine("Using default signal handler."));
        ASSERT_TRUE(WaitUntilGivenBack(host.Pid(), row.signal));
        kill(host.Pid(), row.signal);
        EXPECT_EQ(row.signal, WTERMSIG(host.WaitForEnd()));
        Lines lines = host.Output();  // the listen thread may print on meanwhile
        lines.erase(std::remove(lines.begin(), lines.end(), "[ZV_FLASH] IPC enter "), lines.end());
        EXPECT_EQ((Lines{"", row.text, "", "Using default signal handler."}), Lines(lines.end() - 4, lines.end()));
    }
}

}  // namespace
