// A second connection to a cache's file.
#pragma once

#include <gtest/gtest.h>
#include <sqlite3.h>

#include <string>

class CacheFile {
public:
    explicit CacheFile(const std::string& path)
    {
        EXPECT_EQ(SQLITE_OK, sqlite3_open(path.c_str(), &m_DB));
        sqlite3_busy_timeout(m_DB, 60000);
    }
    ~CacheFile() { sqlite3_close(m_DB); }
    CacheFile(const CacheFile&) = delete;
    CacheFile& operator=(const CacheFile&) = delete;

    void Run(const std::string& sql)
    {
        EXPECT_EQ(SQLITE_OK, sqlite3_exec(m_DB, sql.c_str(), nullptr, nullptr, nullptr));
    }

    // The first column of every row, each followed by a blank.
    std::string Query(const std::string& sql)
    {
        std::string values;
        const auto add = [](void* to, int, char** columns, char**) {
            *static_cast<std::string*>(to) += std::string(columns[0] ? columns[0] : "NULL") + " ";
            return 0;
        };
        EXPECT_EQ(SQLITE_OK, sqlite3_exec(m_DB, sql.c_str(), add, &values, nullptr)) << sqlite3_errmsg(m_DB);
        return values;
    }

private:
    sqlite3* m_DB = nullptr;
};
