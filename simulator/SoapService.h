// Answers SOAP requests: checks, handler, envelope, and the faults that are about the message.
#pragma once

#include "Faults.h"
#include "RequestCheck.h"

namespace simulator {

class SoapService {
public:
    SoapService(Database& database, const Hosts& hosts, const SimulatedClock& clock, const StorefrontOptions& options)
        : m_Database(database),
          m_Check(database, hosts, clock, static_cast<size_t>(options.remembered)),
          m_PlainAddress(hosts.Http()),
          m_LargestPage(options.largestPage)
    {}

    /// The service behind a path, or null.
    static const ServiceRow* Find(const std::string& path);

    /// `takeFault(operation)` gives the fault to apply.
    template <class TakeFault>
    HttpResponse Answer(const HttpRequest& request, const ServiceRow& service, LoggedRequest& log, TakeFault takeFault)
    {
        CheckedRequest checked;
        log.service = service.name;
        Database::Transaction transaction(m_Database);
        log.violation = m_Check.Check(request, service, checked, log);
        const Fault fault = takeFault(log.operation);
        if (!log.violation.empty()) return Refuse("Client", log.violation, false);
        std::string result = RunHandler(checked);
        if (fault.ClaimsFailure()) transaction.Undo();
        return Respond(checked, std::move(result), fault);
    }

private:
    HttpResponse Respond(const CheckedRequest& checked, std::string result, const Fault& fault);
    Call CallOf(const CheckedRequest& checked, XmlWriter& xml);
    /// The content of the result element.
    std::string RunHandler(const CheckedRequest& checked);
    std::string RefuseAsAsked(const CheckedRequest& checked, int code);
    static HttpResponse Refuse(const std::string& code, const std::string& text, bool soap12);

    Database& m_Database;
    RequestCheck m_Check;
    std::string m_PlainAddress;
    int m_LargestPage;
};

}  // namespace simulator
