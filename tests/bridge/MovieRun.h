// Runs a movie in the desktop runtime with the extension class and a class of the test's own.
#pragma once

#include <functional>
#include <memory>
#include <string>
#include <vector>

#include "ZVWSLibAEPrefetchPause.h"
#include "ZVWSLibAEResult.h"

struct MovieRun {
    std::vector<std::string> lines;  ///< What the movie reported, in order.
    bool succeeded = false;          ///< No script error at the top level.

    /// The lines, one below the other.
    std::string Text() const;
};

/// What the test answers to a movie's question. Called while the movie runs, on its thread.
using Answer = std::function<std::string(const std::string& question)>;

/// The movie sees com.orvex.ZVWSLib, com.orvex.ZVCfgLib, report(text), answer(question), and result(): the script value
/// of `shown`. A `pause` takes the place of the first instance's own.
MovieRun RunMovie(const std::string& script, const Result& shown = Result(), const Answer& answer = nullptr,
                  std::shared_ptr<PrefetchPause> pause = nullptr);
