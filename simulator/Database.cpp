#include "Database.h"

std::string Database::Row::Text(int column) const
{
    const auto* text = reinterpret_cast<const char*>(sqlite3_column_text(m_Statement, column));
    return text ? std::string(text, sqlite3_column_bytes(m_Statement, column)) : std::string();
}

std::unique_ptr<Database> Database::Open(const std::string& file, std::string& error)
{
    sqlite3* opened = nullptr;
    const int result = sqlite3_open(file.c_str(), &opened);
    auto database = std::make_unique<Database>();
    database->m_Database.reset(opened);
    if (result == SQLITE_OK) {
        sqlite3_busy_timeout(opened, 5000);
        if (database->Run("PRAGMA synchronous = OFF") >= 0 && database->Run("PRAGMA user_version = 1") >= 0) {
            return database;
        }
    }
    error = file + ": cannot open the database: " + sqlite3_errmsg(opened);
    return nullptr;
}

Database::Statement Database::Prepare(const std::string& sql, const Values& values)
{
    sqlite3_stmt* prepared = nullptr;
    sqlite3_prepare_v2(m_Database.get(), sql.c_str(), static_cast<int>(sql.size()), &prepared, nullptr);
    int place = 0;
    for (const Value& value : values) {
        ++place;
        if (value.isText) {
            sqlite3_bind_text(prepared, place, value.text.data(), static_cast<int>(value.text.size()),
                              SQLITE_TRANSIENT);
        } else {
            sqlite3_bind_int(prepared, place, value.number);
        }
    }
    return Statement(prepared);
}

int Database::Run(const std::string& sql, const Values& values)
{
    const std::lock_guard<std::recursive_mutex> lock(m_Mutex);
    const Statement statement = Prepare(sql, values);
    if (!statement) return -1;
    int result;
    do {
        result = sqlite3_step(statement.get());
    } while (result == SQLITE_ROW);
    return result == SQLITE_DONE ? sqlite3_changes(m_Database.get()) : -1;
}

void Database::Each(const std::string& sql, const Values& values, const std::function<void(const Row&)>& use)
{
    const std::lock_guard<std::recursive_mutex> lock(m_Mutex);
    const Statement statement = Prepare(sql, values);
    while (statement && sqlite3_step(statement.get()) == SQLITE_ROW)
        use(Row(statement.get()));
}

int Database::Int(const std::string& sql, const Values& values, int standard)
{
    int value = standard;
    Each(sql, values, [&](const Row& row) { value = row.Int(0); });
    return value;
}

std::string Database::Text(const std::string& sql, const Values& values)
{
    std::string value;
    Each(sql, values, [&](const Row& row) { value = row.Text(0); });
    return value;
}
