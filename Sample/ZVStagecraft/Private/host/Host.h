// Runs the storefront's movie in the script runtime, and ends it.
#pragma once

/// Loads the runtime, runs the movie that the vector describes until it has ended, and shuts down as the way of its end
/// asks. Blocks that long. Main thread, once a process, with the DRM library started and the listen thread running; 0.
int main_zv_stagecraft(int argc, const char** argv);

/// Asks the movie to end; one that has not begun yet will end before any of its script runs. Does not wait. Any thread;
/// 0.
int exit_zv_stagecraft();
