#include "fuzz_support.h"

#include "baselines.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "platform/headless/headless.h"

#include <unistd.h>
#include <cstdio>
#include <filesystem>
#include <fstream>
#include <iterator>

namespace fs = std::filesystem;

// In memory where the system has such a folder; one per process, as targets may run side by side.
static const struct ScratchHost {
    std::string path = (fs::exists("/dev/shm") ? "/dev/shm" : fs::temp_directory_path().string()) +
                       "/verrant-fuzz-" + std::to_string(getpid());
    ~ScratchHost() { fs::remove_all(path); }
} Host;

const std::string Scratch = HeadlessProgramPath(Host.path) + "\\";

std::string Fresh(const std::uint8_t* data, std::size_t size) {
    std::string bytes(reinterpret_cast<const char*>(data), size);
    HeadlessReset();
    ClearAppState();
    fs::remove_all(Host.path + "/Desktop");
    fs::create_directories(Host.path + "/Desktop");
    HeadlessSetDesktopFolder(Scratch + "Desktop\\");
    WriteFile("static.ini", bytes);
    if ((ProgressListOn = size % 2)) OpenProgressList();
    return bytes;
}

void WriteFile(const std::string& name, const std::string& bytes) {
    fs::create_directories(fs::path(Host.path + "/" + name).parent_path());
    std::ofstream(Host.path + "/" + name, std::ios::binary) << bytes;
}

std::string ReadFile(const std::string& name, bool* exists) {
    std::ifstream in(Host.path + "/" + name, std::ios::binary);
    if (exists) *exists = in.is_open();
    return {std::istreambuf_iterator<char>(in), {}};
}

void RunBaselineOnScratch(const char* baseline) {
    fs::remove_all(Host.path + "/baseline");
    fs::create_directories(Host.path + "/baseline");
    const std::string& host = Host.path;  // a baseline that fails writes nothing, which tells
    RunBaseline(baseline, {host, host + "/mods", host + "/map/actors.static", host + "/baseline"});
}

void RequireBaseline(CommandResult result, const char* report, const char* baseline, const char* mark,
                     bool (*unjudged)()) {
    bool written = false, expected = false;
    std::string text = ReadFile(std::string("Desktop/") + report, &written);
    RunBaselineOnScratch(baseline);
    bool same = text == ReadFile(std::string("baseline/") + report, &expected) && written == expected;
    Require(same || (unjudged && unjudged()), std::string(report) + " is the baseline's");
    bool findings = written && mark && text.find(mark) != std::string::npos;
    Require(mark ? result == (findings ? CommandResult::Findings : CommandResult::NothingFound)
                 : result == CommandResult::Done && written,
            std::string("the result with ") + report);
}

void Require(bool holds, const std::string& what) {
    if (holds) return;
    std::fprintf(stderr, "property failed: %s\n", what.c_str());
    fs::remove_all(Host.path);  // abort runs no destructor
    std::abort();
}
