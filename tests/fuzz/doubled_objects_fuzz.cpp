// ".. doubled objects" on arbitrary catalogues: the report against the pairwise walk.
#include "fuzz_support.h"

#include "catalogue/catalogue_reader.h"
#include "checks/doubled_objects.h"
#include "shell/app_state.h"
#include "shell/progress_list.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string bytes(reinterpret_cast<const char*>(data), size);
    ResetForInput();
    std::vector<std::string> names;
    for (const std::string& line : CatalogueLinesOf(bytes, true))
        if (IsBuildingHeader(line)) names.push_back(SectionNameByBracket(line));
    std::vector<std::string> expected = {"Doubled objects in your static.ini:", ""};
    for (std::size_t i = 0; i < names.size(); ++i)
        for (std::size_t k = i + 1; k < names.size(); ++k)
            if (names[k] == names[i]) {
                expected.push_back("Double object (" + std::to_string(i) + ") => (" + std::to_string(k) +
                                   "): " + names[i]);
                break;
            }

    CatalogueFolder = ScratchFolder();
    ProgressListOn = size > 0 && (data[0] & 1);
    if (ProgressListOn) OpenProgressList();
    CommandResult result = FindDoubledObjects();
    bool written = false;
    std::string report = ReadDesktopFile("Doubled_objects.txt", written);
    if (expected.size() == 2) {
        Require(result == CommandResult::NothingFound && !written, "no report without doubles");
    } else {
        Require(result == CommandResult::Findings && written, "a report with doubles");
        Require(report == CrLfText(expected), "the report pairs each name with its next repetition");
    }
    return 0;
}
