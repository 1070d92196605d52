#include "Database.h"

namespace simulator {

namespace {

// Small letters for capital ones in ASCII, Latin-1, Greek and Cyrillic; SQLite's own lower() knows ASCII alone.
std::string Fold(const unsigned char* text, int size)
{
    std::string folded(reinterpret_cast<const char*>(text), static_cast<size_t>(size));
    for (size_t i = 0; i < folded.size(); ++i) {
        const unsigned char lead = text[i];
        if (lead >= 'A' && lead <= 'Z') folded[i] = static_cast<char>(lead + 0x20);
        if (lead < 0xC3 || lead > 0xD0 || i + 1 == folded.size()) continue;
        unsigned int code = (lead & 0x1Fu) << 6 | (text[i + 1] & 0x3Fu);
        const bool capital = (code >= 0xC0 && code <= 0xDE && code != 0xD7) || (code >= 0x391 && code <= 0x3A9) ||
                             (code >= 0x410 && code <= 0x42F);
        if (capital) code += 0x20;
        folded[i] = static_cast<char>(0xC0 | code >> 6);
        folded[++i] = static_cast<char>(0x80 | (code & 0x3F));
    }
    return folded;
}

void FoldFunction(sqlite3_context* context, int, sqlite3_value** values)
{
    const unsigned char* text = sqlite3_value_text(values[0]);
    const std::string folded = text ? Fold(text, sqlite3_value_bytes(values[0])) : std::string();
    sqlite3_result_text(context, folded.data(), static_cast<int>(folded.size()), SQLITE_TRANSIENT);
}

}  // namespace

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
        sqlite3_create_function(opened, "fold", 1, SQLITE_UTF8 | SQLITE_DETERMINISTIC, nullptr, FoldFunction, nullptr,
                                nullptr);
        // The first statement that reads the file finds out whether it is a database.
        if (database->Run("PRAGMA synchronous = OFF") >= 0 && database->Run("PRAGMA user_version") >= 0) {
            return database;
        }
    }
    error = file + ": cannot open the database: " + sqlite3_errmsg(opened);
    return nullptr;
}

Database::Transaction::Transaction(Database& database) : m_Database(database), m_Lock(database.m_Mutex)
{
    m_Database.Run("BEGIN");
}

Database::Transaction::~Transaction()
{
    if (!m_Undone) m_Database.Run("COMMIT");
}

void Database::Transaction::Undo()
{
    m_Database.Run("ROLLBACK");
    m_Undone = true;
}

Database::Statement Database::Take(const std::string& sql, const Values& values)
{
    Statement statement;
    std::vector<Statement>& idle = m_Prepared[sql];
    if (idle.empty()) {
        sqlite3_stmt* prepared = nullptr;
        sqlite3_prepare_v3(m_Database.get(), sql.c_str(), static_cast<int>(sql.size()) + 1, SQLITE_PREPARE_PERSISTENT,
                           &prepared, nullptr);
        statement.reset(prepared);
    } else {
        statement = std::move(idle.back());
        idle.pop_back();
    }
    int place = 0;
    for (const Value& value : values) {
        ++place;
        if (value.isText) {
            // The values live until the statement is given back.
            sqlite3_bind_text(statement.get(), place, value.text.data(), static_cast<int>(value.text.size()),
                              SQLITE_STATIC);
        } else {
            sqlite3_bind_int(statement.get(), place, value.number);
        }
    }
    return statement;
}

void Database::GiveBack(const std::string& sql, Statement statement)
{
    constexpr size_t kMost = 200;  // the simulator's own, and some of those who look into the database
    sqlite3_reset(statement.get());
    sqlite3_clear_bindings(statement.get());
    if (m_Prepared.size() > kMost) m_Prepared.clear();
    m_Prepared[sql].push_back(std::move(statement));
}

int Database::Run(const std::string& sql, const Values& values)
{
    const std::lock_guard<std::recursive_mutex> lock(m_Mutex);
    Statement statement = Take(sql, values);
    if (!statement) return -1;
    int result;
    do {
        result = sqlite3_step(statement.get());
    } while (result == SQLITE_ROW);
    const int changed = result == SQLITE_DONE ? sqlite3_changes(m_Database.get()) : -1;
    GiveBack(sql, std::move(statement));
    return changed;
}

void Database::Each(const std::string& sql, const Values& values, const std::function<void(const Row&)>& use)
{
    const std::lock_guard<std::recursive_mutex> lock(m_Mutex);
    Statement statement = Take(sql, values);
    if (!statement) return;
    while (sqlite3_step(statement.get()) == SQLITE_ROW)
        use(Row(statement.get()));
    GiveBack(sql, std::move(statement));
}

int Database::Int(const std::string& sql, const Values& values, int standard)
{
    int value = standard;
    bool isFirst = true;
    Each(sql, values, [&](const Row& row) {
        if (isFirst) value = row.Int(0);
        isFirst = false;
    });
    return value;
}

std::string Database::Text(const std::string& sql, const Values& values)
{
    std::string value;
    bool isFirst = true;
    Each(sql, values, [&](const Row& row) {
        if (isFirst) value = row.Text(0);
        isFirst = false;
    });
    return value;
}

}  // namespace simulator
