// Runs the client's process with a movie.
#pragma once

#include "Process.h"

struct MovieOutput {
    int status = -1;  ///< waitpid's.
    Lines lines;      ///< Of standard output, then of the error stream.

    /// What follows the prefix in the first line that starts with it; "(none)" when none does.
    std::string After(const std::string& prefix) const
    {
        for (const std::string& line : lines) {
            if (line.rfind(prefix, 0) == 0) return line.substr(prefix.size());
        }
        return "(none)";
    }
    /// What the movie did: "ok", "stopped" or "script error", by the last line of the error stream.
    std::string End() const
    {
        const std::string prefix = "movie ended: ";
        return !lines.empty() && lines.back().rfind(prefix, 0) == 0 ? lines.back().substr(prefix.size()) : "(unknown)";
    }
    std::string Text() const
    {
        std::string text;
        for (const std::string& line : lines)
            text += line + "\n";
        return text;
    }
};

/// Runs a movie's file until it ends.
inline MovieOutput RunMovieFile(const std::string& movie, Environment environment)
{
    environment.emplace_back("STAGECRAFT_MOVIE", movie);
    Process process({ZV_STAGECRAFT, "5"}, environment);
    MovieOutput output;
    output.status = process.WaitForEnd();
    output.lines = process.Output();
    for (const std::string& line : process.Errors())
        output.lines.push_back(line);
    return output;
}
