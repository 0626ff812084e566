// ".. doubled objects" on arbitrary catalogues: the report against the pairwise walk.
#include "fuzz_support.h"

#include "checks/doubled_objects.h"
#include "shell/app_state.h"
#include "shell/progress_list.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    ResetForInput();
    WriteScratchFile("static.ini", std::string(reinterpret_cast<const char*>(data), size));
    CatalogueFolder = ScratchFolder();
    ProgressListOn = size > 0 && (data[0] & 1);
    if (ProgressListOn) OpenProgressList();
    CommandResult result = FindDoubledObjects();
    bool written = false, expected = false;
    std::string report = ReadDesktopFile("Doubled_objects.txt", written);
    std::string pairwise = BaselineOutput("pairwise", "Doubled_objects.txt", expected);
    Require(result == (expected ? CommandResult::Findings : CommandResult::NothingFound), "the result");
    Require(written == expected && report == pairwise, "the report pairs each name with its next repetition");
    return 0;
}
