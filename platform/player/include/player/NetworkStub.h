// The network stub library: the message queue between this process and the player's system software, which starts and
// stops it.
//
// A message is four 32-bit words. Word 0 is its type; the others are zero in every message that the host sends, and
// ignored in those it receives.
//
// Threads: one thread receives; any thread may send, open or close at any time. A queue is open between a successful
// init_network_msg_queue and uninit_network_msg_queue, and can be opened again after that. One queue exists at a time.
//
// Results: 0 for success, else a positive error number of the system (errno.h). The implementation must not end the
// process, raise a signal or hang on anything that the other side does.
#pragma once

#include <stdint.h>

enum NETWORK_MSG_STUB_TYPE {
    NETWORK_MSG_STUB_INIT = 1,                    // to the host: the player system is there
    NETWORK_MSG_STUB_UNINIT = 3,                  // to the host: close the interface
    NETWORK_MSG_STUB_UNINIT_RET = 4,              // from the host: closed as asked, all resources released
    NETWORK_MSG_STUB_FINALIZE = 5,                // from the host: the interface ended by itself; answers a UNINIT
                                                  //   that it crosses, after which no UNINIT_RET comes
    NETWORK_MSG_STUB_FINALIZE_DONE = 6,           // to the host: the player system has seen FINALIZE
    NETWORK_MSG_STUB_FINALIZE_NETWORK_ERROR = 7,  // to the host: finalize because the network failed
};

struct NETWORK_MSG_STUB_MESSAGE {
    uint32_t type;  // NETWORK_MSG_STUB_TYPE; other numbers can arrive
    uint32_t words[3];
};

extern "C" {
// Opens the queue. Does not wait for the player system: without one it fails. EALREADY when a queue is open.
int init_network_msg_queue(void);

// Closes the queue. A receive that blocks must return with ENOTCONN soon; later sends and receives fail with it as
// well. Harmless when no queue is open. Does not block.
void uninit_network_msg_queue(void);

// Blocks until a message has arrived and copies it to *message (not null), which is undefined on failure. Types that
// the receiver does not know must be handed out too; what is no message must be dropped with a line on the error
// stream. ENOTCONN when no queue is open or it was closed, ECONNRESET when the player system has gone. Messages that
// were sent before it went must be handed out first.
int network_stub_recv_ipc_msg(struct NETWORK_MSG_STUB_MESSAGE* message);

// Sends *message (not null). Must not block: EAGAIN when the player system does not take messages out of a full queue.
// ENOTCONN when no queue is open, EPIPE when the player system has gone.
int network_stub_send_ipc_msg(const struct NETWORK_MSG_STUB_MESSAGE* message);
}
