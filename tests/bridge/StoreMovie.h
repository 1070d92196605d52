// Movies against a storefront of the test's own.
#pragma once

#include "MovieRun.h"
#include "Store.h"

class StoreMovie : public Store {
protected:
    /// What the script asks of the test: how often the store was asked for an operation or a service.
    virtual std::string AnswerTo(const std::string& name)
    {
        const auto log = store->Log();
        const auto isThat = [&](const LoggedRequest& one) { return one.operation == name || one.service == name; };
        return std::to_string(std::count_if(log.begin(), log.end(), isThat));
    }

    /// Runs a script that has `setup` for "init", an instance `ws`, and these functions.
    MovieRun Run(const std::string& script)
    {
        return RunMovie(R"(
var setup = {APIKey: 'desktop', UserName: 'customer', Password: 'secret', DestinationUniqueID: 'device',
    DestinationTypeID: 48, AccessType: 2, EnvNum: 3, firmwareVersion: 'F', ApplicationRevision: 'A', modelNumber: 'M'};
var ws = new com.orvex.ZVWSLib();
function call(object, method, parameters, then) {
    var code = object[method]([{onComplete: then || function () {}}, parameters]);
    if (code !== 0) report(method + ' refused ' + code);
}
function ready(then) {
    call(ws, 'init', setup, function (status, result) {
        if (status !== 0 || result !== true) report('init ' + status + ' ' + result);
        then();
    });
}
// Goes on when the store has been asked so often.
function when(name, count, then) {
    var patience = 2000, timer = setInterval(function () {
        if (Number(answer(name)) < count && --patience > 0) return;
        clearInterval(timer);
        if (patience === 0) report('asked for ' + name + ' ' + answer(name) + ' times, not ' + count);
        then();
    }, 5);
}
)" + script,
                        Result(), [this](const std::string& question) { return AnswerTo(question); }, pause);
    }

    std::string Report(const std::string& script)
    {
        const MovieRun run = Run(script);
        EXPECT_TRUE(run.succeeded);
        return run.Text();
    }

    std::shared_ptr<PrefetchPause> pause;  ///< Of the next movie's first instance; null: its own.
};
