#include "IpcChannel.h"

#include <pthread.h>
#include <signal.h>

#include <chrono>

#include "ExitDecision.h"
#include "Host.h"
#include "HostConsole.h"
#include "SignalStack.h"
#include "ZVMutex.h"
#include "player/NetworkStub.h"

namespace {

// Beyond it a player system does not answer any more.
constexpr std::chrono::seconds kLastMessageTime{5};

pthread_t s_listenThread;  // main thread's, like the next
bool s_listenThreadCreated = false;

// Never destructed: the listen thread can outlive main.
struct ListenEnd {
    ZVMutex mutex;
    ZVCondition changed;
    bool ended ZV_GUARDED_BY(mutex) = false;
};
ListenEnd& TheListenEnd()
{
    static ListenEnd& end = *new ListenEnd;
    return end;
}

// Error-checking: an unlock by someone who holds nothing, which zv_stagecraft_lock invites, then does nothing.
pthread_mutex_t s_processMutex = PTHREAD_ERRORCHECK_MUTEX_INITIALIZER_NP;

int Send(NETWORK_MSG_STUB_TYPE type)
{
    const NETWORK_MSG_STUB_MESSAGE message = {static_cast<uint32_t>(type), {0, 0, 0}};
    return network_stub_send_ipc_msg(&message);
}

void Dispatch(uint32_t type)
{
    switch (type) {
        case NETWORK_MSG_STUB_INIT:
            HostPrint("[ZV_FLASH] NETWORK_MSG_STUB_INIT !");
            break;
        case NETWORK_MSG_STUB_UNINIT:
            HostPrint("[ZV_FLASH] NETWORK_MSG_STUB_UNINIT !");
            // Before the movie ends: start-up reads it then.
            zv_stagecraft_ipc_state_set(true);
            ExitDecision::Get().StopListening();
            zv_stagecraft_uninit_proc();
            break;
        case NETWORK_MSG_STUB_FINALIZE_DONE:
            HostPrint("[ZV_FLASH] listener thread main,zv_app_recv_ipc_msg() NETWORK_MSG_STUB_FINALIZE_DONE!");
            ExitDecision::Get().StopListening();
            uninit_network_msg_queue();
            break;
        case NETWORK_MSG_STUB_FINALIZE_NETWORK_ERROR:
            HostPrint("[ZV_FLASH] listener thread main,zv_app_recv_ipc_msg() NETWORK_MSG_STUB_FINALIZE_NETWORK_ERROR!");
            break;
        default:
            break;
    }
}

void* _zv_stagecraft_ipc_listen_thread_main(void*)
{
    const SignalStack signalStack;
    pthread_setname_np(pthread_self(), "zv_ipc_listen");
    HostPrint("<ZV_FLASH> Calling -------> %s, %d\n", __func__, ExitDecision::Get().Listens() ? 0 : 1);
    while (ExitDecision::Get().Listens()) {
        HostPrint("[ZV_FLASH] IPC enter ");
        NETWORK_MSG_STUB_MESSAGE message;
        const int error = network_stub_recv_ipc_msg(&message);
        if (error != 0) {
            HostPrint(
                "[ZV_FLASH]listener thread main, zv_app_recv_ipc_msg() failed! ERR =%d ,Release flash resource \n",
                error);
            ExitDecision::Get().StopListening();
            zv_stagecraft_uninit_proc();
            break;
        }
        HostPrint("[ZV_FLASH] IPC get %d \n", static_cast<int>(message.type));
        Dispatch(message.type);
    }
    HostPrint("<ZV_FLASH> ipc listener thread main has exit!");
    ListenEnd& end = TheListenEnd();
    const ZVMutexLock lock(end.mutex);
    end.ended = true;
    end.changed.NotifyAll();
    return reinterpret_cast<void*>(1);
}

}  // namespace

int zv_stagecraft_ipc_init()
{
    HostPrint("[ZV_FLASH] zv_stagecraft_ipc_init enter ");
    if (init_network_msg_queue() == 0) return 0;
    HostPrint("[ZV_FLASH] zv_stagecraft_ipc_init Error ");
    return -1;
}

void zv_stagecraft_ipc_release() {}

int start_zv_stagecraft_ipc_listen_thread()
{
    HostPrint("<ZV_FLASH>,start_zv_stagecraft_ipc_listen_thread enter ");
    sigset_t quit;
    sigemptyset(&quit);
    sigaddset(&quit, SIGQUIT);
    int i4_ret = pthread_sigmask(SIG_BLOCK, &quit, nullptr);  // the listen thread inherits it
    if (i4_ret != 0) {
        HostPrint("[ZV_FLASH] start_zv_app_ipc_listen_thread: sig block error! ");
        return i4_ret;
    }
    i4_ret = pthread_create(&s_listenThread, nullptr, _zv_stagecraft_ipc_listen_thread_main, nullptr);
    if (i4_ret == 0) {
        s_listenThreadCreated = true;
        HostPrint("<ZV_FLASH>,start_zv_app_ipc_listen_thread create ok! ");
    } else {
        HostPrint("<ZV_FLASH>ERR: create  IPC thread failed, i4_ret [%ld],at L%d\r\n", static_cast<long>(i4_ret),
                  __LINE__);
    }
    return i4_ret;
}

int stop_zv_stagecraft_ipc_listen_thread()
{
    HostPrint("[ZV_FLASH] stop_zv_app_ipc_listen_thread Enter! ");
    if (!ExitDecision::Get().BeginFinalize()) {
        HostPrint("[ZV_FLASH] ipc thread already exit, now do nothing! ");
        return 0;
    }
    HostPrint("[ZV_FLASH] STOP: send FINALIZE msg to BDP ");
    const int error = Send(NETWORK_MSG_STUB_FINALIZE);
    if (error == 0) return 0;
    ExitDecision::Get().FinalizeFailed();
    HostPrint("[ZV_FLASH] send NETWORK_MSG_STUB_FINALIZE failed! ERR =%d \n", error);
    return -1;
}

void WaitForIpcListenThread()
{
    if (!s_listenThreadCreated) return;
    {
        const auto deadline = std::chrono::steady_clock::now() + kLastMessageTime;
        ListenEnd& end = TheListenEnd();
        const ZVMutexLock lock(end.mutex);
        while (!end.ended && end.changed.WaitUntil(end.mutex, deadline)) {
        }
        if (!end.ended) return;
    }
    pthread_join(s_listenThread, nullptr);
    s_listenThreadCreated = false;
}

int zv_stagecraft_finalize_proc()
{
    HostPrint("[ZV_FLASH]Call----> zv_stagecraft_finalize_proc ");
    exit_zv_stagecraft();
    stop_zv_stagecraft_ipc_listen_thread();
    return 0;
}

int zv_stagecraft_uninit_proc()
{
    HostPrint("[ZV_FLASH]Call----> zv_stagecraft_uninit_proc ");
    if (exit_zv_stagecraft() != 0) HostPrint("[ZV_FLASH]zv_stagecraft_uninit_proc: exit_zv_stagecraft FAIL ");
    return 0;
}

int zv_stagecraft_exit_by_bdp_release()
{
    HostPrint("[ZV_FLASH]Call----> zv_stagecraft_exit_by_bdp_release ");
    if (Send(NETWORK_MSG_STUB_UNINIT_RET) != 0) {
        HostPrint("[ZV_FLASH] IPC:,NETWORK_MSG_STUB_UNINIT_RET failed! ERR = \n");
        return -1;
    }
    uninit_network_msg_queue();
    return 0;
}

void zv_stagecraft_lock_init()
{
    pthread_mutexattr_t attributes;
    pthread_mutexattr_init(&attributes);
    pthread_mutexattr_settype(&attributes, PTHREAD_MUTEX_ERRORCHECK);
    pthread_mutex_init(&s_processMutex, &attributes);
    pthread_mutexattr_destroy(&attributes);
}

void zv_stagecraft_lock_uninit()
{
    pthread_mutex_destroy(&s_processMutex);
}

void zv_stagecraft_lock()
{
    HostPrint("ZV_FLASH] zv_stagecraft_lock enter ! ");
    pthread_mutex_lock(&s_processMutex);
    pthread_mutex_unlock(&s_processMutex);
    HostPrint("ZV_FLASH] zv_stagecraft_lock leave ! ");
}

void zv_stagecraft_unlock()
{
    pthread_mutex_unlock(&s_processMutex);
}

bool zv_stagecraft_ipc_state_get()
{
    return ExitDecision::Get().IsRequested();
}

void zv_stagecraft_ipc_state_set(bool requested)
{
    ExitDecision::Get().SetRequested(requested);
}
