// Waits of SQLite that take no time.
#pragma once

#include <sqlite3.h>

#include <functional>

// The default file system of SQLite, which calls `onSleep` in place of waiting.
struct FakeSleep {
    explicit FakeSleep(std::function<void()> onSleep) : original(sqlite3_vfs_find(nullptr)), vfs(*original)
    {
        vfs.zName = "test";
        vfs.xSleep = [](sqlite3_vfs*, int microseconds) {
            s_Slept += microseconds;
            s_OnSleep();
            return microseconds;
        };
        s_OnSleep = std::move(onSleep);
        s_Slept = 0;
        sqlite3_vfs_register(&vfs, 1);
    }
    ~FakeSleep()
    {
        sqlite3_vfs_unregister(&vfs);
        sqlite3_vfs_register(original, 1);
    }

    static inline std::function<void()> s_OnSleep;
    static inline int s_Slept;
    sqlite3_vfs* original;
    sqlite3_vfs vfs;
};
