// Files of tests, and a folder of a test's own, which is removed with everything in it when the test ends.
#pragma once

#include <stdlib.h>
#include <unistd.h>

#include <filesystem>
#include <fstream>
#include <iterator>
#include <string>

inline std::string ContentOf(const std::string& file)
{
    std::ifstream stream(file, std::ios::binary);
    return std::string(std::istreambuf_iterator<char>(stream), {});
}

class TempFolder {
public:
    TempFolder()
    {
        // In memory where that is to be had: what waits for a disk here tells nothing.
        const bool inMemory = !getenv("TMPDIR") && access("/dev/shm", W_OK) == 0;
        std::string name =
            ((inMemory ? std::filesystem::path("/dev/shm") : std::filesystem::temp_directory_path()) / "zvtestXXXXXX")
                .string();
        if (!mkdtemp(&name[0])) abort();
        m_Path = name + "/";
    }
    ~TempFolder()
    {
        std::error_code ignored;
        std::filesystem::remove_all(m_Path, ignored);
    }
    TempFolder(const TempFolder&) = delete;
    TempFolder& operator=(const TempFolder&) = delete;

    // The folder with its "/", or a name in it.
    std::string operator/(const std::string& name) const { return m_Path + name; }

    std::string Write(const std::string& name, const std::string& content) const
    {
        std::ofstream(m_Path + name, std::ios::binary) << content;
        return m_Path + name;
    }
    std::string Read(const std::string& name) const { return ContentOf(m_Path + name); }
    bool Has(const std::string& name) const { return std::filesystem::exists(m_Path + name); }

private:
    std::string m_Path;
};
