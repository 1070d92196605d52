#include "Process.h"

#include <stdlib.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <sstream>

std::string ProcessOutput::After(const std::string& prefix) const
{
    for (const std::string& line : lines) {
        if (line.rfind(prefix, 0) == 0) return line.substr(prefix.size());
    }
    return "(none)";
}

std::string ProcessOutput::Text() const
{
    std::string text;
    for (const std::string& line : lines)
        text += line + "\n";
    return text;
}

ProcessOutput RunMovieFile(const std::string& movie, const std::map<std::string, std::string>& environment)
{
    int ends[2];
    if (pipe(ends) != 0) return ProcessOutput();
    const pid_t child = fork();
    if (child == 0) {
        dup2(ends[1], STDOUT_FILENO);
        dup2(ends[1], STDERR_FILENO);
        close(ends[0]);
        close(ends[1]);
        setenv("STAGECRAFT_MOVIE", movie.c_str(), 1);
        for (const auto& variable : environment)
            setenv(variable.first.c_str(), variable.second.c_str(), 1);
        execl(ZV_STAGECRAFT, ZV_STAGECRAFT, "5", static_cast<char*>(nullptr));
        _exit(127);
    }
    close(ends[1]);
    std::string text;
    char piece[4096];
    for (ssize_t count; (count = read(ends[0], piece, sizeof piece)) > 0;)
        text.append(piece, static_cast<size_t>(count));
    close(ends[0]);
    ProcessOutput output;
    int status = 0;
    waitpid(child, &status, 0);
    if (WIFEXITED(status)) output.status = WEXITSTATUS(status);
    std::istringstream lines(text);
    for (std::string line; std::getline(lines, line);)
        output.lines.push_back(line);
    return output;
}

ProcessOutput RunMovieText(const std::string& text, const std::map<std::string, std::string>& environment)
{
    std::string folder = std::filesystem::temp_directory_path().string() + "/movie-XXXXXX";
    if (!mkdtemp(&folder[0])) return ProcessOutput();
    const std::string file = folder + "/movie.js";
    std::ofstream(file) << text;
    ProcessOutput output = RunMovieFile(file, environment);
    std::filesystem::remove_all(folder);
    return output;
}
