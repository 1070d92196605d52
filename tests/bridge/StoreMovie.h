// Movies against a storefront of the test's own.
#pragma once

#include "MovieRun.h"
#include "Store.h"

class StoreMovie : public Store {
protected:
    /// Runs a script that has `setup` for "init", an instance `ws`, and these functions.
    static MovieRun Run(const std::string& script)
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
)" + script);
    }

    static std::string Report(const std::string& script)
    {
        const MovieRun run = Run(script);
        EXPECT_TRUE(run.succeeded);
        return run.Text();
    }
};
