// The benchmarks: the plain model and the module in the same run.
//
//   fpnavi_bench [--geometries] [--peers] [--json] [--pairs=N] [--rounds=N]
//                [--benchmark_filter=REGEX ...]
//
// Without --geometries and --peers: every step and whole pairs at the default size.
#include <algorithm>
#include <cstdlib>
#include <string>
#include <vector>

#include "Tables.h"

namespace bench {
namespace {

struct Request {
    Options options;
    std::vector<const Table*> tables;
    bool json = false;
    std::vector<std::string> rest;  // the library's arguments
};

const Table* TableOf(const std::string& option) {
    for (const Table* const table : {&kSizeTable, &kPeerTable}) {
        if (option == table->option)
            return table;
    }
    return nullptr;
}

Request ReadArguments(const std::vector<std::string>& arguments) {
    Request request;
    for (const std::string& argument : arguments) {
        const Table* const table = TableOf(argument);
        if (table != nullptr)
            request.tables.push_back(table);
        else if (argument == "--json")
            request.rest.emplace_back("--benchmark_format=json");
        else if (argument.rfind("--pairs=", 0) == 0)
            request.options.pairs = std::max(std::atoi(argument.c_str() + 8), 1);
        else if (argument.rfind("--rounds=", 0) == 0)
            request.options.rounds = std::max(std::atoi(argument.c_str() + 9), 1);
        else
            request.rest.push_back(argument);
    }
    if (request.tables.empty())
        request.tables.push_back(&kStepTable);
    for (const std::string& argument : request.rest)
        request.json = request.json || argument.rfind("--benchmark_format", 0) == 0;
    return request;
}

// In the library's own format: all rows at once.
void RunInOne(const Request& request) {
    for (const Table* const table : request.tables)
        table->addRows(request.options);
    benchmark::RunSpecifiedBenchmarks();
}

void RunAsTables(const Request& request) {
    for (const Table* const table : request.tables) {
        benchmark::ClearRegisteredBenchmarks();
        table->addRows(request.options);
        TableReporter reporter(table->format);
        benchmark::RunSpecifiedBenchmarks(&reporter);
    }
}

int Main(const std::vector<std::string>& arguments) {
    Request request = ReadArguments(arguments);
    std::vector<char*> pointers;
    for (std::string& argument : request.rest)
        pointers.push_back(argument.data());
    int count = static_cast<int>(pointers.size());
    benchmark::Initialize(&count, pointers.data());
    if (benchmark::ReportUnrecognizedArguments(count, pointers.data()))
        return 2;
    if (request.json)
        RunInOne(request);
    else
        RunAsTables(request);
    return AnyFailed() ? 1 : 0;
}

}  // namespace
}  // namespace bench

int main(int argc, char** argv) {
    return bench::Main(std::vector<std::string>(argv, argv + argc));
}
