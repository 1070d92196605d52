#include "PublicHeaders.h"

#include <algorithm>
#include <filesystem>
#include <regex>
#include <sstream>

#include "Document.h"

namespace {

// Collects comments while it goes through a header's lines.
class Reader {
public:
    explicit Reader(const std::string& header) : m_Lines(SourceText("Public/" + header)) {}

    bool Next()
    {
        if (!m_IsComment) comment.clear();
        if (!std::getline(m_Lines, line)) return false;
        static const std::regex kComment("\\s*//(/?) ?(.*)");
        std::smatch parts;
        m_IsComment = std::regex_match(line, parts, kComment);
        if (!m_IsComment) return true;
        const std::string text = parts.str(2);
        m_IsSection = parts.length(1) == 0 && (m_IsSection || text.compare(0, 5, "---- ") == 0);
        if (m_IsSection && text.compare(0, 5, "---- ") == 0) section.clear();
        std::string& to = m_IsSection ? section : comment;
        to += (to.empty() ? "" : " ") + text.substr(std::min(text.size(), text.find_first_not_of(' ')));
        return true;
    }

    std::string line, comment, section;

private:
    std::istringstream m_Lines;
    bool m_IsComment = false, m_IsSection = false;
};

PublicStatus StatusOf(const std::string& name, int value, const std::string& comment)
{
    PublicStatus status;
    status.name = name;
    status.value = value;
    static const std::regex kParts("(\\w+): (.*?)\\.(?: Then: (.*?)(?: \\((ZV_WS_[^)]*)\\))?\\.(.*))?");
    std::smatch parts;
    if (!std::regex_match(comment, parts, kParts)) return status;
    status.who = parts.str(1);
    status.cause = parts.str(2);
    status.remedy = parts.str(3);
    status.calls = NamesIn(parts.str(4), "ZV_WS_");
    return status;
}

}  // namespace

std::vector<PublicCall> PublicCalls(const std::string& prefix)
{
    const std::regex declaration("\\w[\\w ]*[ *]+(" + prefix + "\\w+)\\(.*");
    std::vector<std::string> headers;
    for (const auto& entry : std::filesystem::directory_iterator(SourceFile("Public")))
        headers.push_back(entry.path().filename().string());
    std::sort(headers.begin(), headers.end());
    std::vector<PublicCall> calls;
    for (const std::string& header : headers) {
        std::smatch parts;
        for (Reader reader(header); reader.Next();) {
            if (std::regex_match(reader.line, parts, declaration))
                calls.push_back({parts.str(1), reader.comment, reader.section});
        }
    }
    return calls;
}

const std::vector<PublicStatus>& PublicStatuses()
{
    static const auto kStatuses = [] {
        static const std::regex kRow("\\s*ZV_WS_Status_(\\w+) = (-?\\d+),.*");
        std::vector<PublicStatus> statuses;
        std::smatch parts;
        for (Reader reader("ZV_WS_Status.h"); reader.Next();) {
            if (std::regex_match(reader.line, parts, kRow))
                statuses.push_back(StatusOf(parts.str(1), std::stoi(parts.str(2)), reader.comment));
        }
        return statuses;
    }();
    return kStatuses;
}

std::string Named(int status)
{
    for (const PublicStatus& known : PublicStatuses()) {
        if (known.value == status) return known.name + " (" + std::to_string(status) + ")";
    }
    return std::to_string(status);
}

std::set<std::string> NamesIn(const std::string& text, const std::string& prefix)
{
    const std::regex name("\\b" + prefix + "(\\w+)");
    std::set<std::string> names;
    for (std::sregex_iterator at(text.begin(), text.end(), name), end; at != end; ++at)
        names.insert(at->str(1));
    return names;
}
