// Runs a fuzz target over kept inputs: files, and the files of folders.
#include <filesystem>
#include <fstream>
#include <iterator>

#include "Target.h"

namespace {

void Replay(const std::filesystem::path& path, int& count)
{
    if (std::filesystem::is_directory(path)) {
        for (const auto& entry : std::filesystem::directory_iterator(path))
            Replay(entry.path(), count);
        return;
    }
    std::ifstream file(path, std::ios::binary);
    const std::string bytes((std::istreambuf_iterator<char>(file)), std::istreambuf_iterator<char>());
    if (!file) return;
    fprintf(stderr, "replay: %s\n", path.c_str());  // the last one named is the one that failed
    TestInput(bytes);
    ++count;
}

}  // namespace

int main(int argc, char** argv)
{
    int count = 0;
    for (int i = 1; i < argc; ++i)
        Replay(argv[i], count);
    if (count == 0) fprintf(stderr, "replay: no input\n");
    return count == 0;
}
