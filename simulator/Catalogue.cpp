#include "Catalogue.h"

#include <array>
#include <cstdint>
#include <cstdio>
#include <vector>

#include "Storefront.h"

namespace simulator {

namespace {

// Counted up with every change of the tables, or of what fills them; a row of kMigrations tells what that is to data
// that is there already.
constexpr int kSchemaVersion = 3;

const struct {
    int from;  // the version that it makes one more of; data from before the first is not brought along
    const char* statement;
} kMigrations[] = {
    {2, "CREATE UNIQUE INDEX title_prefix ON title (prefix)"},
    {2, "DROP INDEX product_title"},
    {2, "CREATE INDEX product_title_type ON product (title, type)"},
};

const char kSchema[][512] = {
    "CREATE TABLE genre (id INTEGER PRIMARY KEY, name TEXT, visible INTEGER, parent INTEGER, label TEXT)",
    // A series' season is a title with is_tv 1; its episodes are titles that name it as their season.
    "CREATE TABLE title (id INTEGER PRIMARY KEY, name TEXT, prefix TEXT, is_tv INTEGER DEFAULT 0, season INTEGER, "
    "episode "
    "INTEGER DEFAULT 0, rating TEXT, synopsis TEXT, stars INTEGER DEFAULT 0, directors TEXT, actors TEXT, writers "
    "TEXT, "
    "producers TEXT, copyright TEXT, runtime TEXT, reason TEXT, thx INTEGER DEFAULT 0, chvrs TEXT, external TEXT)",
    "CREATE TABLE title_genre (genre INTEGER, title INTEGER, PRIMARY KEY (genre, title)) WITHOUT ROWID",
    "CREATE TABLE product (sku INTEGER PRIMARY KEY, title INTEGER, type INTEGER, price TEXT, expires TEXT, period "
    "INTEGER)",
    "CREATE INDEX product_title_type ON product (title, type)",
    "CREATE TABLE bonus (id INTEGER PRIMARY KEY, title INTEGER, profile INTEGER)",
    "CREATE INDEX bonus_title ON bonus (title)",
    "CREATE INDEX title_season ON title (season)",
    "CREATE UNIQUE INDEX title_prefix ON title (prefix)",
    // One row: what players sign in with, whoever is the customer, and when the catalogue was loaded.
    "CREATE TABLE service (user TEXT, password TEXT, api_key TEXT, load_time TEXT)",
    // A row for each customer, with the PIN that activates a player for it. Wishes, passes and tokens name their
    // account.
    "CREATE TABLE account (id INTEGER PRIMARY KEY, pin TEXT UNIQUE, email TEXT, name TEXT, prepaid INTEGER, adult_pin "
    "TEXT, adult_enabled INTEGER, card TEXT, card_type INTEGER, card_name TEXT, audio INTEGER, country INTEGER)",
    // Every token that was ever given out, and the player that has it.
    "CREATE TABLE token (number INTEGER PRIMARY KEY, text TEXT UNIQUE, account INTEGER, device TEXT, withdrawn "
    "INTEGER)",
    "CREATE TABLE wish (account INTEGER, title INTEGER, added INTEGER, PRIMARY KEY (account, title))",
    "CREATE TABLE pass (id INTEGER PRIMARY KEY, account INTEGER, title INTEGER, sku INTEGER, type INTEGER, watch "
    "INTEGER, status INTEGER, position INTEGER, hours INTEGER, stream TEXT)",
    "CREATE TABLE gift (code TEXT PRIMARY KEY, amount INTEGER, used INTEGER)",
    "CREATE TABLE config (key TEXT, value TEXT)",
    "CREATE TABLE report (kind TEXT)",
};

struct Purchase {
    int title, type, status, position, hours;
};

// Accounts 1 and 2. Each bought before: one video watched in part; the first customer also a rental that has run out
// and a fresh one.
const struct {
    const char* pin;
    const char* email;
    const char* name;
    int prepaid;  // cents
    bool adultEnabled;
    const char* card;
    int cardType;
    const char* cardName;
    std::vector<Purchase> purchases;
    std::vector<int> wishes;
} kCustomers[] = {
    {StorefrontAccount::kActivationPin,
     "ana@customer.example",
     "Ana S\u00e3o Jorge",
     2500,
     true,
     "4242",
     2,
     "Visa",
     {{12, 0, 2, 1860, 30}, {24, 0, 1, 0, 0}, {36, 1, 1, 0, 0}},
     {7, 19, 1001}},
    {StorefrontAccount::kSecondActivationPin,
     "ben@customer.example",
     "Ben Carter",
     700,
     false,
     "1881",
     1,
     "Mastercard",
     {{48, 1, 2, 600, 0}},
     {8, 20}},
};

// The same numbers on every machine.
class Dice {
public:
    int Roll(int sides)
    {
        m_State = m_State * 6364136223846793005ull + 1442695040888963407ull;
        return static_cast<int>((m_State >> 33) % static_cast<uint64_t>(sides));
    }
    template <size_t N>
    const char* Pick(const std::array<const char*, N>& words)
    {
        return words[static_cast<size_t>(Roll(N))];
    }

private:
    uint64_t m_State = 2011;
};

const std::array<const char*, 16> kAdjectives = {"Silent",  "Golden",  "Last",       "Hidden",     "Broken", "Crimson",
                                                 "Endless", "Lost",    "Quiet",      "Second",     "Winter", "Electric",
                                                 "Paper",   "Distant", "Na\u00efve", "Salt & Iron"};
const std::array<const char*, 16> kNouns = {"Harbour",  "Orchard", "Witness",      "Empire",   "Garden", "Signal",
                                            "Voyage",   "Letters", "River",        "Mirror",   "Summer", "Passage",
                                            "Zo\u00eb", "Circus",  "\u6771\u4eac", "Caf\u00e9"};
const std::array<const char*, 12> kPeople = {
    "Ana S\u00e3o Jorge", "Ben Carter",    "Chlo\u00e9 Martin", "Dev Rao",    "Elif Kaya",   "Finn O\u2019Hara",
    "Greta Lind",         "Hugo <H> Berg", "Ines Roth",         "Jun \u6797", "Kofi Mensah", "Lena Fox"};
const std::array<const char*, 5> kRatings = {"G", "PG", "PG-13", "R", "NR"};
const std::array<const char*, 3> kTvRatings = {"TV-G", "TV-PG", "TV-14"};
const std::array<const char*, 6> kReasons = {"violence", "language", "thematic elements", "smoking", "", ""};

const std::array<const char*, 9> kTopGenres = {"Action",        "Comedy", "Drama",      "Documentary", "Family",
                                               "Music & Dance", "Sci-Fi", "Television", "Staff only"};
const std::array<const char*, 5> kSubGenres = {"New arrivals", "Classics", "Award winners", "Critics\u2019 choice",
                                               "Under 90 minutes"};

constexpr int kTelevision = 8;
constexpr int kMovies = 2400;
constexpr int kSeries = 40;

class Filler {
public:
    explicit Filler(Database& database) : m_Database(database) {}

    void Fill()
    {
        Genres();
        for (int i = 0; i < kMovies; ++i)
            Movie();
        for (int i = 0; i < kSeries; ++i)
            Series(i);
        Accounts();
    }

private:
    // Top genres are 1 to 9, the last of them not shown; each has five below it, and "Classics" two more.
    void Genres()
    {
        const int last = static_cast<int>(kTopGenres.size());
        for (int top = 1; top <= last; ++top) {
            Genre(top, kTopGenres[static_cast<size_t>(top - 1)], 0, top != last);
            for (int sub = 0; sub < static_cast<int>(kSubGenres.size()); ++sub) {
                const int child = top * 100 + sub;
                Genre(child, kSubGenres[static_cast<size_t>(sub)], top, true);
                if (sub != 1) continue;
                Genre(child * 10, "Silent era", child, true);
                Genre(child * 10 + 1, "Restored", child, sub == 1 && top % 2 == 1);
            }
        }
    }

    void Genre(int id, const char* name, int parent, bool visible)
    {
        m_Database.Run("INSERT INTO genre VALUES (?, ?, ?, ?, ?)",
                       {id, name, visible, parent, std::string(name) + " *"});
    }

    // Into the genre and all above it.
    void Place(int title, int genre)
    {
        for (; genre > 0; genre = genre >= 1000 ? genre / 10 : genre >= 100 ? genre / 100 : 0) {
            m_Database.Run("INSERT OR IGNORE INTO title_genre VALUES (?, ?)", {genre, title});
        }
    }

    int Leaf(int top)
    {
        const int sub = m_Dice.Roll(5);
        const int genre = top * 100 + sub;
        return sub == 1 ? genre * 10 + m_Dice.Roll(2) : genre;
    }

    std::string Name() { return std::string("The ") + m_Dice.Pick(kAdjectives) + " " + m_Dice.Pick(kNouns); }

    int Title(const std::string& name, bool isTv, int season, int episode, const char* rating)
    {
        const int id = ++m_Title;
        char prefix[32];
        snprintf(prefix, sizeof prefix, "ZV%05d", id);
        // Every eleventh title lacks what the service may leave out.
        const bool bare = id % 11 == 0;
        const auto given = [&](const std::string& text) { return bare ? std::string() : text; };
        m_Database.Run(
            "INSERT INTO title VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?, ?)",
            {id, name, prefix, isTv, season, episode, given(rating),
             given(name + ": a story of " + m_Dice.Pick(kPeople) + " and " + m_Dice.Pick(kPeople) +
                   ", \"as told\" in one night."),
             m_Dice.Roll(6), given(m_Dice.Pick(kPeople)),
             given(std::string(m_Dice.Pick(kPeople)) + ", " + m_Dice.Pick(kPeople)), given(m_Dice.Pick(kPeople)),
             given(m_Dice.Pick(kPeople)), given("\u00a9 20" + std::to_string(10 + m_Dice.Roll(16))),
             std::to_string(80 + m_Dice.Roll(70)) + " min", given(m_Dice.Pick(kReasons)), id % 5 == 0,
             given(id % 3 ? "PG" : "14+"), "EXT" + std::to_string(id)});
        return id;
    }

    void Products(int title)
    {
        const int kinds = 1 + m_Dice.Roll(3);  // rent, buy, both
        for (int type = 0; type < 2; ++type) {
            if (!(kinds & (1 << type))) continue;
            char price[16], expires[32];
            snprintf(price, sizeof price, "%d.%02d", (type ? 9 : 2) + m_Dice.Roll(6), m_Dice.Roll(2) ? 99 : 50);
            snprintf(expires, sizeof expires, "20%02d/%02d/%02d %02d:59:59", 27 + m_Dice.Roll(9), 1 + m_Dice.Roll(12),
                     1 + m_Dice.Roll(28), m_Dice.Roll(24));
            m_Database.Run("INSERT INTO product VALUES (?, ?, ?, ?, ?, ?)",
                           {title * 10 + type, title, type, price, expires, type == 0 ? 48 : 0});
        }
        if (title % 2) m_Database.Run("INSERT INTO bonus VALUES (?, ?, ?)", {title * 10 + 5, title, 1 + title % 2});
    }

    void Movie()
    {
        const int title = Title(Name(), false, 0, 0, m_Dice.Pick(kRatings));
        Products(title);
        int top = 1 + m_Dice.Roll(static_cast<int>(kTopGenres.size()));
        if (top == kTelevision) top = 1;
        Place(title, Leaf(top));
        if (m_Dice.Roll(3) == 0) Place(title, Leaf(1 + m_Dice.Roll(kTelevision - 1)));
    }

    void Series(int number)
    {
        const std::string name = Name();
        for (int season = 1; season <= 1 + number % 3; ++season) {
            const char* rating = m_Dice.Pick(kTvRatings);
            const int title = Title(name + ": Season " + std::to_string(season), true, 0, 0, rating);
            Products(title);
            Place(title, Leaf(kTelevision));
            for (int episode = 1; episode <= 6 + season; ++episode) {
                Products(Title(name + ": " + m_Dice.Pick(kNouns), false, title, episode, rating));
            }
        }
    }

    void Accounts()
    {
        m_Database.Run("INSERT INTO service VALUES (?, ?, ?, '11/1/2026 6:00:00 AM')",
                       {StorefrontAccount::kUser, StorefrontAccount::kPassword, StorefrontAccount::kApiKey});
        for (int i = 1; i <= 5; ++i) {
            m_Database.Run("INSERT INTO gift VALUES (?, ?, 0)", {"GIFT" + std::to_string(i), i * 1000});
        }
        int account = 0;
        for (const auto& customer : kCustomers) {
            ++account;
            m_Database.Run(
                "INSERT INTO account VALUES (?, ?, ?, ?, ?, ?, ?, ?, ?, ?, 0, 1)",
                {account, customer.pin, customer.email, customer.name, customer.prepaid, StorefrontAccount::kAdultPin,
                 customer.adultEnabled, customer.card, customer.cardType, customer.cardName});
            for (const Purchase& bought : customer.purchases) {
                m_Database.Run(
                    "INSERT INTO pass (account, title, sku, type, watch, status, position, hours, stream) VALUES (?, "
                    "?, ?, ?, ?, ?, ?, ?, '')",
                    {account, bought.title, bought.title * 10 + bought.type, bought.type,
                     bought.type == 0 && bought.hours == 0, bought.status, bought.position, bought.hours});
            }
            for (const int title : customer.wishes)
                m_Database.Run("INSERT INTO wish VALUES (?, ?, ?)", {account, title, title});
        }
        // The player was activated once before, and deactivated.
        m_Database.Run("INSERT INTO token VALUES (1, 'token-1', 1, 'desktop-player', 1)");
    }

    Database& m_Database;
    Dice m_Dice;
    int m_Title = 0;
};

std::string WhyRefused(int version)
{
    const std::string known = std::to_string(kSchemaVersion);
    const std::string has = "has tables of version " + std::to_string(version);
    if (version > kSchemaVersion) {
        return has + ", and this simulator knows " + known +
               ": run the newer one that made them, or name another folder with --data";
    }
    return has + ", which cannot be brought to " + known +
           ": remove it to start with new data, or name another folder with --data";
}

bool Make(Database& database)
{
    for (const char* statement : kSchema) {
        if (database.Run(statement) < 0) return false;
    }
    Filler(database).Fill();
    return true;
}

bool Migrate(Database& database, int version)
{
    for (const auto& step : kMigrations) {
        if (step.from >= version && database.Run(step.statement) < 0) return false;
    }
    return true;
}

}  // namespace

bool FillCatalogue(Database& database, std::string& error)
{
    const bool isNew = database.Int("SELECT COUNT(*) FROM sqlite_master") == 0;
    const int version = isNew ? kSchemaVersion : database.Int("PRAGMA user_version");
    if (version < kMigrations[0].from || version > kSchemaVersion) {
        error = database.File() + ": " + WhyRefused(version);
        return false;
    }
    if (!isNew && version == kSchemaVersion) return true;
    database.Run("BEGIN");
    if ((isNew ? Make(database) : Migrate(database, version)) &&
        database.Run("PRAGMA user_version = " + std::to_string(kSchemaVersion)) >= 0 && database.Run("COMMIT") >= 0) {
        return true;
    }
    database.Run("ROLLBACK");
    error = database.File() + ": cannot write the database; name a folder that can be written with --data";
    return false;
}

}  // namespace simulator
