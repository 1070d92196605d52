// A storefront whose exchanges the test sees whole.
#pragma once

#include <mutex>

#include "Store.h"

class Exchanges : public Store {
protected:
    void SetUp() override
    {
        StorefrontOptions options;
        options.onExchange = [this](const SoapExchange& exchange) {
            const std::lock_guard<std::mutex> lock(m_Mutex);
            m_Seen.push_back(exchange);
        };
        Open(options);
    }
    void TearDown() override
    {
        Store::TearDown();
        store.reset();  // before what it calls back
    }

    void Begin(ZV_WS_AccessType access)
    {
        ZV_WS_release(&session);
        ASSERT_EQ(ZV_WS_Status_ok, Initialize(Setup(access)));
        Take();
    }

    /// Those since the last time, in order.
    std::vector<SoapExchange> Take()
    {
        const std::lock_guard<std::mutex> lock(m_Mutex);
        return std::exchange(m_Seen, {});
    }

private:
    std::mutex m_Mutex;
    std::vector<SoapExchange> m_Seen;
};
