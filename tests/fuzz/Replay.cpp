// Runs a fuzz target over the inputs that are kept in a folder.
#include "Target.h"
#include "TempFolder.h"

int main(int, char** argv)
{
    int count = 0;
    for (const auto& input : std::filesystem::directory_iterator(argv[1])) {
        fprintf(stderr, "replay: %s\n", input.path().c_str());  // the last one named is the one that failed
        TestInput(ContentOf(input.path()));
        ++count;
    }
    return count == 0;
}
