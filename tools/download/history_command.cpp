// history: the service record of every download, newest first, as a table, CSV or JSON.
#include <iostream>
#include <regex>

#include "download/commands.h"
#include "history/history_report.h"
#include "history/service_record.h"

namespace zx917 {

namespace {

int usage(const std::string& why) {
    std::cerr << "zx917-download history: " << why << " (see --help)\n";
    return 2;
}

}  // namespace

int RunHistoryCommand(const std::vector<std::string>& args) {
    HistoryFilter filter;
    enum { Table, Csv, Json } format = Table;
    for (std::size_t i = 0; i < args.size(); ++i) {
        const std::string& a = args[i];
        const bool hasValue = i + 1 < args.size();
        if (a == "--limit" && hasValue) {
            const std::string n = args[++i];
            if (!std::regex_match(n, std::regex("[0-9]{1,6}"))) return usage("bad --limit " + n);
            filter.limit = std::stoi(n);
        } else if (a == "--all") {
            filter.limit.reset();
        } else if (a == "--instrument" && hasValue) {
            filter.instrument = args[++i];
        } else if (a == "--since" && hasValue) {
            filter.since = args[++i];
            if (!std::regex_match(filter.since,
                                  std::regex("[0-9]{4}-[0-9]{2}-[0-9]{2}(T[0-9:]+Z?)?")))
                return usage("--since takes a date such as 2026-12-01");
        } else if (a == "--json") {
            format = Json;
        } else if (a == "--csv") {
            format = Csv;
        } else {
            return usage("bad option " + a);
        }
    }
    const std::string path = DefaultHistoryPath();
    std::string error;
    const auto attempts = ServiceRecord::Read(path, filter, error);
    if (!attempts) {
        std::cerr << "zx917-download history: " << error << std::endl;
        return 1;
    }
    if (format == Json) {
        std::cout << HistoryJson(*attempts);
    } else if (format == Csv) {
        std::cout << HistoryCsv(*attempts);
    } else if (attempts->empty()) {
        std::cout << "No download attempts recorded in " << path << ".\n";
    } else {
        std::cout << HistoryTable(*attempts);
    }
    return 0;
}

}  // namespace zx917
