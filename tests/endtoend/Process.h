// Runs the client's process with a movie and collects what it prints.
#pragma once

#include <map>
#include <string>
#include <vector>

struct ProcessOutput {
    int status = -1;                 ///< Exit code; -1 when a signal ended it.
    std::vector<std::string> lines;  ///< Of standard output and error stream.

    /// What follows the prefix in the first line that starts with it; "(none)" when none does.
    std::string After(const std::string& prefix) const;
    std::string Text() const;
};

/// Runs zv_stagecraft with a movie's file until it ends.
ProcessOutput RunMovieFile(const std::string& movie, const std::map<std::string, std::string>& environment);

/// The same with the movie's text.
ProcessOutput RunMovieText(const std::string& text, const std::map<std::string, std::string>& environment);
