// ".. doubled objects" on arbitrary catalogues: the report against the pairwise walk.
#include "fuzz_support.h"

#include "checks/doubled_objects.h"
#include "output/app_state.h"

namespace {

CommandResult FindInScratchCatalogue() { return FindDoubledObjects(CatalogueFolder); }

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    RunCheckAgainstBaseline(data, size, FindInScratchCatalogue, "Doubled_objects.txt", "pairwise", true);
    return 0;
}
