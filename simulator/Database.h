// A small wrapper of SQLite: one connection, one lock, statements that bind their arguments in order and are prepared
// once. Every member may be called from any thread.
#pragma once

#include <sqlite3.h>

#include <functional>
#include <memory>
#include <mutex>
#include <string>
#include <unordered_map>
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

    /// One request's: what is read and written meanwhile is a whole, into which no other thread comes.
    class Transaction {
    public:
        explicit Transaction(Database& database);
        ~Transaction();
        Transaction(const Transaction&) = delete;
        Transaction& operator=(const Transaction&) = delete;
        /// Nothing was written; what follows is no part of it any more.
        void Undo();

    private:
        Database& m_Database;
        const std::lock_guard<std::recursive_mutex> m_Lock;
        bool m_Undone = false;
    };

private:
    struct Closer {
        void operator()(sqlite3* database) const { sqlite3_close(database); }
        void operator()(sqlite3_stmt* statement) const { sqlite3_finalize(statement); }
    };
    using Statement = std::unique_ptr<sqlite3_stmt, Closer>;
    /// Null when it cannot be prepared.
    Statement Take(const std::string& sql, const Values& values);
    void GiveBack(const std::string& sql, Statement statement);

    std::recursive_mutex m_Mutex;
    std::unique_ptr<sqlite3, Closer> m_Database;
    // Those that are not in use, by their text: several when one has been used while another was.
    std::unordered_map<std::string, std::vector<Statement>> m_Prepared;
};

}  // namespace simulator
