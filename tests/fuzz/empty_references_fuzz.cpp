// ".. empty references" on arbitrary catalogues: the report, always written, against the plain scan.
#include "fuzz_support.h"

#include "checks/empty_references.h"

#include <string_view>

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    CommandResult result =
        RunCheckAgainstBaseline(data, size, FindEmptyReferences, "Empty_references.txt", "bare-keys", false);
    bool written = false;
    std::string report = ReadDesktopFile("Empty_references.txt", written);
    bool none = std::string_view(report).ends_with("\r\n\r\nNo empty references found in your static.ini") &&
                report.find("Empty reference: ") == std::string::npos;
    Require(written, "the report is always written");
    Require(result == (none ? CommandResult::NothingFound : CommandResult::Findings), "the result");
    return 0;
}
