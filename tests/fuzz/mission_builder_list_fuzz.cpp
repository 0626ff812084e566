// Both mission-builder lists on arbitrary catalogues, against the plain one-pass list.
#include "fuzz_support.h"

#include "rewrite/mission_builder_list.h"

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    ResetForInput();
    WriteScratchFile("static.ini", std::string(reinterpret_cast<const char*>(data), size));
    const struct {
        BuilderList mode;
        const char *file, *baseline;
    } modes[] = {{BuilderList::Fmb, "Static_list_FMB.txt", "entry-list"},
                 {BuilderList::FmbPlus, "Static_list_FMBplus.txt", "entry-list-plus"}};
    for (const auto& mode : modes) {
        Require(CreateMissionBuilderList(ScratchFolder(), mode.mode) == CommandResult::Done, "the list is written");
        bool written = false, expected = false;
        std::string list = ReadDesktopFile(mode.file, written);
        std::string plain = BaselineOutput(mode.baseline, mode.file, expected);
        Require(written && expected && list == plain, "the list matches the plain one");
    }
    return 0;
}
