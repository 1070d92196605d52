// The channel to the player's system software: the listen thread, what it does on each message, and the ways to end.
#pragma once

/// Opens the queue. 0, or -1 when that failed: the listen thread's first receive fails then, which ends the process as
/// a queue that breaks does.
int zv_stagecraft_ipc_init();
/// Does nothing: the queue is closed where its last message was sent or received.
void zv_stagecraft_ipc_release();

/// Main thread. 0, or the error number that kept the thread from being created. SIGQUIT stays blocked in the caller.
int start_zv_stagecraft_ipc_listen_thread();

/// Tells the player system that the interface ended by itself, which makes it end the listen thread; nothing is sent
/// when that thread is ending already, or the player system asked for the close. 0, or -1 when the message could not be
/// sent. Does not wait.
int stop_zv_stagecraft_ipc_listen_thread();

/// Gives the listen thread the time to end that a player system needs for its last message, a few seconds at most.
/// Main thread, as the last act: a thread that still listens then ends with the process.
void WaitForIpcListenThread();

/// Active exit: the movie has ended by itself. Main thread; 0.
int zv_stagecraft_finalize_proc();
/// Requested close, and a queue that broke: ends the movie. Listen thread; 0.
int zv_stagecraft_uninit_proc();
/// End of a requested close: tells the player system that all is released, and closes the queue. Main thread; 0, or -1
/// when the message could not be sent, with the queue left open.
int zv_stagecraft_exit_by_bdp_release();

/// The process mutex, for other components of the process. Any thread.
void zv_stagecraft_lock_init();
void zv_stagecraft_lock_uninit();
/// Waits until a holder has finished. Does not keep the lock.
void zv_stagecraft_lock();
void zv_stagecraft_unlock();

/// Whether the player system asked for the close. Set before the movie is stopped; any thread.
bool zv_stagecraft_ipc_state_get();
void zv_stagecraft_ipc_state_set(bool requested);
