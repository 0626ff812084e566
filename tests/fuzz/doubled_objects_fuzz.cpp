// ".. doubled objects" on arbitrary catalogues: the report against the pairwise walk.
#include "fuzz_support.h"

#include "checks/doubled_objects.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    RunCheckAgainstBaseline(data, size, FindDoubledObjects, "Doubled_objects.txt", "pairwise", true);
    return 0;
}
