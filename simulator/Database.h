// A small wrapper of SQLite: one connection, one lock, statements that bind their arguments in order.
#pragma once

#include <sqlite3.h>

#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <vector>

namespace simulator {

class Database {
public:
    /// One row of an answer; null columns read as 0 and "".
    class Row {
    public:
        explicit Row(sqlite3_stmt* statement) : m_Statement(statement) {}
        int Int(int column) const { return sqlite3_column_int(m_Statement, column); }
        std::string Text(int column) const;
        int Columns() const { return sqlite3_column_count(m_Statement); }
        bool IsNull(int column) const { return sqlite3_column_type(m_Statement, column) == SQLITE_NULL; }

    private:
        sqlite3_stmt* m_Statement;
    };

    /// An argument of a statement.
    struct Value {
        Value(int number) : number(number) {}
        Value(const std::string& text) : text(text), isText(true) {}
        Value(const char* text) : text(text), isText(true) {}
        int number = 0;
        std::string text;
        bool isText = false;
    };
    using Values = std::vector<Value>;

    /// Null and the reason when the file cannot be opened.
    static std::unique_ptr<Database> Open(const std::string& file, std::string& error);

    /// Runs a statement; the number of rows it changed, -1 when it failed.
    int Run(const std::string& sql, const Values& values = {});
    /// Calls `use` for each row.
    void Each(const std::string& sql, const Values& values, const std::function<void(const Row&)>& use);
    /// The first column of the first row.
    int Int(const std::string& sql, const Values& values = {}, int standard = 0);
    std::string Text(const std::string& sql, const Values& values = {});
    /// Its path.
    std::string File() { return sqlite3_db_filename(m_Database.get(), "main"); }
    int LastId() { return static_cast<int>(sqlite3_last_insert_rowid(m_Database.get())); }

    /// Held for the whole of one request, so that requests see each other's effects whole.
    std::recursive_mutex& Mutex() { return m_Mutex; }

private:
    struct Closer {
        void operator()(sqlite3* database) const { sqlite3_close(database); }
        void operator()(sqlite3_stmt* statement) const { sqlite3_finalize(statement); }
    };
    using Statement = std::unique_ptr<sqlite3_stmt, Closer>;
    Statement Prepare(const std::string& sql, const Values& values);

    std::recursive_mutex m_Mutex;
    std::unique_ptr<sqlite3, Closer> m_Database;
};

}  // namespace simulator
