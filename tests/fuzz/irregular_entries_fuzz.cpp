// ".. irregular entrys" on arbitrary catalogues: the report against the prefix table tried line by line.
#include "fuzz_support.h"

#include "checks/irregular_entries.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    RunCheckAgainstBaseline(data, size, CheckIrregularEntries, "Irregular_entrys.txt", "prefix-table", true);
    return 0;
}
