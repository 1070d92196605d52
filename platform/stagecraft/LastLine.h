// The last line of the process's error stream, by which its callers learn what the movie did: "movie ended: ok",
// "movie ended: stopped" (by a request from outside), or "movie ended: script error" (at least one was reported). A
// process that ran no movie to its end has none.
//
// It is written when the process exits: after this library was closed, too, others still print. So the library stays in
// memory (see the link options). Main thread.
#pragma once

namespace LastLine {

// Tells of the movie that runs from now on; an earlier one is forgotten.
void MovieBegins();
void MovieEnds(bool wasStopped);
void ScriptError();

}  // namespace LastLine
