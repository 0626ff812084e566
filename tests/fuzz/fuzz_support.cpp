#include "fuzz_support.h"

#include "baselines.h"
#include "catalogue/catalogue_reader.h"
#include "platform/headless/headless.h"
#include "output/app_state.h"
#include "output/progress_list.h"

#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

std::string HostScratch;

void RemoveScratch() {
    std::error_code error;
    fs::remove_all(HostScratch, error);
}

}  // namespace

const std::string& ScratchFolder() {
    static std::string folder;
    if (!folder.empty()) return folder;
    std::error_code error;
    fs::path base = fs::is_directory("/dev/shm", error) ? fs::path("/dev/shm") : fs::temp_directory_path(error);
    HostScratch = (base / ("verrant-fuzz-" + std::to_string(getpid()))).string();
    fs::create_directories(HostScratch + "/Desktop", error);
    std::atexit(RemoveScratch);
    folder = HeadlessProgramPath(HostScratch) + "\\";
    return folder;
}

void ResetForInput() {
    ScratchFolder();
    HeadlessReset();
    ClearAppState();
    std::error_code error;
    fs::remove_all(HostScratch + "/Desktop", error);
    fs::create_directories(HostScratch + "/Desktop", error);
    HeadlessSetDesktopFolder(ScratchFolder() + "Desktop\\");
    HeadlessSetEnvironment("WINDIR", "C:\\WINDOWS");
}

void WriteScratchFile(const std::string& name, const std::string& bytes) {
    ScratchFolder();
    std::error_code error;
    fs::create_directories(fs::path(HostScratch + "/" + name).parent_path(), error);
    std::ofstream(HostScratch + "/" + name, std::ios::binary | std::ios::trunc) << bytes;
}

std::string ReadScratchFile(const std::string& name, bool& exists) {
    ScratchFolder();
    std::ifstream in(HostScratch + "/" + name, std::ios::binary);
    exists = static_cast<bool>(in);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

bool IsScratchFile(const std::string& name) {
    ScratchFolder();
    std::error_code error;
    return fs::is_regular_file(HostScratch + "/" + name, error);
}

std::string ReadDesktopFile(const std::string& name, bool& exists) { return ReadScratchFile("Desktop/" + name, exists); }

std::string BaselineOutput(const std::string& baseline, const std::string& report, bool& exists) {
    ScratchFolder();
    std::error_code error;
    fs::remove_all(HostScratch + "/baseline", error);
    fs::create_directories(HostScratch + "/baseline", error);
    bool rewrite = report == "@static.ini";
    BaselineInput input{rewrite ? HostScratch + "/copy" : HostScratch, HostScratch + "/mods",
                        HostScratch + "/map/actors.static", HostScratch + "/baseline"};
    exists = false;
    if (!RunBaseline(baseline, input)) return "";
    return rewrite ? ReadScratchFile("copy/static.ini", exists) : ReadScratchFile("baseline/" + report, exists);
}

CommandResult RunCheckAgainstBaseline(const std::uint8_t* data, std::size_t size, CommandResult (*check)(),
                                      const std::string& report, const std::string& baseline,
                                      bool reportOnlyWithFindings) {
    ResetForInput();
    WriteScratchFile("static.ini", std::string(reinterpret_cast<const char*>(data), size));
    CatalogueFolder = ScratchFolder();
    ProgressListOn = size > 0 && (data[0] & 1);
    if (ProgressListOn) OpenProgressList();
    CommandResult result = check();
    bool written = false, expected = false;
    std::string text = ReadDesktopFile(report, written);
    std::string plain = BaselineOutput(baseline, report, expected);
    Require(written == expected && text == plain, "the report is the straightforward method's");
    if (reportOnlyWithFindings)
        Require(result == (written ? CommandResult::Findings : CommandResult::NothingFound), "the result");
    return result;
}

void Require(bool holds, const char* what) {
    if (holds) return;
    std::fprintf(stderr, "property failed: %s\n", what);
    std::abort();
}

std::vector<std::string> CatalogueLinesOf(const std::string& bytes, bool trimmed) {
    std::vector<std::string> lines;
    LineReader reader = LinesOf(bytes);
    std::string_view line;
    while (trimmed ? NextCatalogueLine(reader, line) : NextPhysicalLine(reader, line))
        lines.emplace_back(line);
    return lines;
}

std::string CrLfText(const std::vector<std::string>& lines) {
    std::string text;
    for (const std::string& line : lines) text += line + "\r\n";
    return text;
}
