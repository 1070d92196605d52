// A file in memory, for code that opens its input by name.
#pragma once

#include <sys/mman.h>
#include <unistd.h>

#include <string>
#include <string_view>

#include "Target.h"

class MemoryFile {
public:
    explicit MemoryFile(std::string_view content) : m_File(memfd_create("input", MFD_CLOEXEC))
    {
        Require(m_File != -1, "a file in memory can be had");
        Require(write(m_File, content.data(), content.size()) == static_cast<ssize_t>(content.size()),
                "the file takes its content");
        m_Path = "/proc/self/fd/" + std::to_string(m_File);
    }
    ~MemoryFile() { close(m_File); }
    MemoryFile(const MemoryFile&) = delete;
    MemoryFile& operator=(const MemoryFile&) = delete;

    const char* Path() const { return m_Path.c_str(); }

private:
    int m_File;
    std::string m_Path;
};
