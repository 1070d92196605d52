// A folder for settings files and a device key of its own.
#pragma once

#include <gtest/gtest.h>
#include <sys/wait.h>
#include <unistd.h>

#include <string>
#include <vector>

#include "CfgXMLFile.h"
#include "Deployment.h"
#include "TempFolder.h"

class SettingsFolder : public testing::Test {
protected:
    void SetUp() override { UseKeyFile(folder + "device.key"); }

    void UseKeyFile(const std::string& path)
    {
        const std::string deployment = folder + "deployment";
        Put(deployment, "device_key_file = " + path + "\n");
        setenv("ZV_DEPLOYMENT", deployment.c_str(), 1);
        ASSERT_TRUE(Deployment::Load());
    }

    static void Put(const std::string& path, const std::string& text)
    {
        std::ofstream(path, std::ios::binary | std::ios::trunc) << text;
    }

    static ZVString Bytes(const std::string& text) { return ZVString(text.data(), text.size()); }

    unsigned int Write(const std::string& key, const std::string& value, bool isProtected = false) const
    {
        return CfgXMLFile(Bytes(file)).Write(Bytes(key), Bytes(value), isProtected);
    }

    unsigned int Read(const std::string& key, std::string& value, bool isProtected = false) const
    {
        ZVString read("not touched");
        const unsigned int result = CfgXMLFile(Bytes(file)).Read(Bytes(key), read, isProtected);
        value.assign(read.c_str(), read.length());
        return result;
    }

    /// "result:value".
    std::string Reading(const std::string& key, bool isProtected = false) const
    {
        std::string value;
        const unsigned int result = Read(key, value, isProtected);
        return std::to_string(result) + ":" + value;
    }

    /// Runs in a process of its own, which ends with the function's result.
    template <class Function>
    static pid_t Fork(Function function)
    {
        const pid_t child = fork();
        if (child == 0) _exit(function());
        return child;
    }

    /// The exit code; below 0 for the signal that ended it.
    static int Wait(pid_t child)
    {
        int status = 0;
        if (waitpid(child, &status, 0) != child) return 255;
        return WIFEXITED(status) ? WEXITSTATUS(status) : -WTERMSIG(status);
    }

    const TempFolder temp;
    const std::string folder = temp / "";
    std::string file = folder + "settings.xml";
};
