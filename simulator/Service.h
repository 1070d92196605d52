// What the three SOAP services have in common: operations as rows, and what a row's handler gets.
#pragma once

#include <algorithm>
#include <map>
#include <string>
#include <vector>

#include "Database.h"
#include "Xml.h"

namespace simulator {

/// How a child of a request is checked.
enum class ChildType {
    Int,
    Text,  ///< May be left out.
    IntArray,
    PurchaseType,
    TitleType,
    FileProfile,
    AudioProfile,
    BonusAssetType,
    StreamStatus,
    WatchStatus,
};

/// The texts of an enumeration in the order of its numbers; empty for the other types.
const std::vector<std::string>& EnumTexts(ChildType type);

struct Child {
    const char* name;
    ChildType type;
};

/// One request, checked: its children as texts and numbers.
struct Arguments {
    std::map<std::string, std::string> texts;
    std::map<std::string, std::vector<int>> arrays;
    std::map<std::string, int> numbers;  ///< Also the number behind each enumeration text.
    bool Has(const char* name) const { return texts.count(name) != 0; }
    int Int(const char* name) const { return numbers.at(name); }
    std::string Text(const char* name) const { return Has(name) ? texts.at(name) : std::string(); }
};

/// What a handler works with. It writes the content of the result element.
struct Call {
    Database& database;
    const Arguments& arguments;
    XmlWriter& xml;
    const char* refusal;  ///< The operation's.
    std::string address;  ///< "host:port" of the plain HTTP side, for addresses in answers.
    int account;          ///< Of the customer who asks.
    std::string device;   ///< That asks: its DestinationUniqueID.
    int largestPage;      ///< Items that a page holds at most; 0: as many as are asked for.

    int Int(const char* name) const { return arguments.Int(name); }
    std::string Text(const char* name) const { return arguments.Text(name); }
    /// What the column of the customer's account holds.
    int AccountInt(const char* column) const;
    std::string AccountText(const char* column) const;
    /// How many items the page that is asked for holds.
    int PageSize() const
    {
        const int asked = Int("ItemsPerPage");
        return largestPage > 0 ? std::min(asked, largestPage) : asked;
    }
    /// The head of most results.
    void Standard(int code = 0, const std::string& message = "OK") const
    {
        xml.Element("ResponseCode", code).Optional("ResponseMessage", message);
    }
    /// The whole of a result that says no.
    void Refuse(int code, const std::string& message) const;
};

inline constexpr char kRefusedPage[] =
    "|<GenreID>0</GenreID><CurrentPageNumber>0</CurrentPageNumber><ItemsPerPage>0</ItemsPerPage><TotalPages>0</"
    "TotalPages>"
    "<TotalItems>0</TotalItems>";
inline constexpr char kRefusedVideos[] =
    "|<CurrentPageNumber>0</CurrentPageNumber><ItemsPerPage>0</ItemsPerPage><TotalPages>0</TotalPages>"
    "<TotalItems>0</TotalItems>";
inline constexpr char kRefusedWishes[] =
    "|<CurrentPageNumber>0</CurrentPageNumber><ItemsPerPage>0</ItemsPerPage><TotalPages>0</TotalPages>"
    "<TotalItems>0</TotalItems><SortOrder>0</SortOrder>";
inline constexpr char kRefusedTitle[] =
    "<TitleID>0</TitleID><TitlePosition>0</TitlePosition><EpisodeNumber>0</EpisodeNumber><IsTvListing>false</"
    "IsTvListing>"
    "<IsTHXMediaDirectorEnabled>false</IsTHXMediaDirectorEnabled><IsTHXMediaDirectorEnabledForTrailer>false"
    "</IsTHXMediaDirectorEnabledForTrailer>|<UserRating>0</UserRating><IsAvailInUserWishList>false</"
    "IsAvailInUserWishList>";
inline constexpr char kRefusedLocation[] =
    "|<AssetID>0</AssetID><Status>stopped</Status><StartTimeSeconds>0</StartTimeSeconds>"
    "<HeartbeatPollInSeconds>0</HeartbeatPollInSeconds>";

struct OperationRow {
    const char* name;
    std::vector<Child> children;
    void (*handle)(Call& call);
    bool bare = false;  ///< The result is no record: it has no response code.
    /// What a refusal says beside code and message, which stand at the "|": the children that are never left out.
    const char* refusal = "|";
};
using Operations = std::vector<OperationRow>;

const Operations& BrowseOperations();
/// On both the account and the stream service.
const Operations& SharedOperations();
const Operations& AccountOperations();
const Operations& StreamOperations();

struct ServiceRow {
    const char* name;           ///< In the log.
    const char* path;           ///< Of its endpoint, below "/api/".
    const char* settingsBlock;  ///< The device-settings header it wants.
    std::vector<const Operations*> operations;
};
const std::vector<ServiceRow>& Services();

/// The row of the service's operation, or null.
const OperationRow* FindOperation(const ServiceRow& service, const std::string& name);

}  // namespace simulator
