// ".. irregular entrys" on arbitrary catalogues: the report against the prefix table tried line by line.
#include "fuzz_support.h"

#include "checks/irregular_entries.h"
#include "output/app_state.h"

namespace {

CommandResult CheckScratchCatalogue() { return CheckIrregularEntries(CatalogueFolder); }

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    RunCheckAgainstBaseline(data, size, CheckScratchCatalogue, "Irregular_entrys.txt", "prefix-table", true);
    return 0;
}
