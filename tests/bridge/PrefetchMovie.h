// Movies that show pages, with a file cache that pages and box art are fetched ahead into.
#pragma once

#include <filesystem>

#include "CacheFile.h"
#include "StoreMovie.h"

class Prefetch : public StoreMovie {
protected:
    // Runs the script in a movie, in `ready` of an instance with a new file cache for `data`. until(then) goes on when
    // the store has seen `requests` of them.
    std::string Run(int data, size_t requests, const std::string& script)
    {
        std::filesystem::remove_all(Cache());
        store->ClearLog();
        std::string report = Report("var perPage; setup.EnvNum = 2; setup.CacheType = 2; setup.CachePath = '" +
                                    Cache() +
                                    "'; setup.CacheLimit = 358400; setup.CacheData = " + std::to_string(data) +
                                    "; function until(then) { when('all', " + std::to_string(requests) + R"(, then); }
function ask(method, parameters, then) {
    call(ws, method, parameters, function (status, result) {
        if (status !== 0) report(method + ' ' + status);
        then(result);
    });
}
function titles(page, then) {
    ask('getTitles', {genreid: 100, CurrentPageNumber: page, ItemsPerPage: perPage, purchasetype: 2}, then);
}
ready(function () {)" + script + "});");
        store->ClearFaults();
        return report;
    }

    std::string AnswerTo(const std::string& question) override
    {
        if (question == "load a catalogue") return store->Query("UPDATE service SET load_time = load_time || '0'");
        if (question == "all") return std::to_string(store->Log().size());
        if (question != "lose all pages") return StoreMovie::AnswerTo(question);
        for (const auto& entry : std::filesystem::directory_iterator(Cache())) {
            if (entry.path().extension() == ".zv")
                CacheFile(entry.path()).Run("PRAGMA busy_timeout = 10000; DELETE FROM Service");
        }
        return "";
    }

    std::string Cache() const { return store->DataFolder() + "/cache/"; }

    // The values of a child in the requests of an operation, in order.
    std::vector<std::string> Children(const std::string& operation, const std::string& name) const
    {
        std::vector<std::string> values;
        for (const LoggedRequest& request : store->Log()) {
            for (const auto& child : request.children) {
                if (request.operation == operation && child.first == name) values.push_back(child.second);
            }
        }
        return values;
    }
    std::vector<std::string> Pages(const std::string& operation) const
    {
        return Children(operation, "CurrentPageNumber");
    }

    // So many items on a page that genre 100 has that many pages.
    std::string PerPage(int pages) const
    {
        const int total = Number("SELECT COUNT(*) FROM title_genre WHERE genre = 100");
        return "perPage = " + std::to_string((total + pages - 1) / pages) + ";";
    }

    using Strings = std::vector<std::string>;
};
