// The golden cases: each folder under tests/golden holds verrant-cli's words (command), the tree they
// run on (tree/) and everything the run must leave (expected/): status, stdout, stderr, reports/ and
// tree/, the input files the run changes. VERRANT_GOLDEN_UPDATE=1 writes a run's output into
// expected/ instead, to start a new case; every file it writes must then be checked by hand.
#include <gtest/gtest.h>

#include <algorithm>
#include <cctype>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <string>
#include <vector>

namespace fs = std::filesystem;

namespace {

using Files = std::map<std::string, std::string>;  // path below a folder ("/" separators) -> bytes

std::string ReadFile(const fs::path& path) {
    std::ifstream in(path, std::ios::binary);
    std::ostringstream bytes;
    bytes << in.rdbuf();
    return bytes.str();
}

Files FilesBelow(const fs::path& folder, const std::string& prefix = "") {
    Files files;
    if (fs::is_directory(folder))
        for (const fs::directory_entry& entry : fs::recursive_directory_iterator(folder))
            if (entry.is_regular_file())
                files[prefix + entry.path().lexically_relative(folder).generic_string()] =
                    ReadFile(entry.path());
    return files;
}

std::string WordsOf(const fs::path& caseFolder) {
    std::string words = ReadFile(caseFolder / "command");
    return words.substr(0, words.find_first_of("\r\n"));
}

std::vector<fs::path> Cases() {
    std::vector<fs::path> cases;
    for (const fs::directory_entry& entry : fs::directory_iterator(VERRANT_GOLDEN_DIR))
        if (entry.is_directory()) cases.push_back(entry.path());
    std::sort(cases.begin(), cases.end());
    return cases;
}

// Runs the words on a fresh scratch folder holding a copy of the case's tree; gives every file the
// run left there (tree/..., reports/...) and its status, stdout and stderr, with the scratch path as
// <root>.
Files RunCase(const fs::path& caseFolder, const fs::path& scratch, const std::string& words) {
    fs::remove_all(scratch);
    fs::create_directories(scratch / "tree");
    fs::create_directories(scratch / "reports");
    if (fs::exists(caseFolder / "tree"))
        fs::copy(caseFolder / "tree", scratch / "tree", fs::copy_options::recursive);
    const std::string root = fs::canonical(scratch).string();
    // The case's words come last, so that a --report-dir of its own wins.
    std::string line = "cd '" + root + "' && '" VERRANT_CLI_PATH "' --report-dir '" + root + "/reports' " +
                       words + " >stdout 2>stderr; echo $? >status";
    std::system(line.c_str());
    Files files = FilesBelow(root);
    for (auto& [name, bytes] : files)
        for (std::size_t at; (at = bytes.find(root)) != std::string::npos;)
            bytes.replace(at, root.size(), "<root>");
    return files;
}

}  // namespace

TEST(Golden, EveryCaseLeavesItsExpectedFiles) {
    std::vector<fs::path> cases = Cases();
    ASSERT_FALSE(cases.empty()) << "no cases in " << VERRANT_GOLDEN_DIR;
    for (const fs::path& folder : cases) {
        const std::string name = folder.filename().string();
        const fs::path scratch = fs::path(VERRANT_SCRATCH_DIR) / "golden" / name;
        std::string lowered = scratch.string();
        std::transform(lowered.begin(), lowered.end(), lowered.begin(), ::tolower);
        // The mods root and a map's catalogue folder are cut at the first "mods" or "mod" of a path.
        ASSERT_EQ(lowered.find("mod"), std::string::npos) << scratch << " must not hold \"mod\"";
        const Files actual = RunCase(folder, scratch, WordsOf(folder));
        const Files input = FilesBelow(folder / "tree", "tree/");
        if (std::getenv("VERRANT_GOLDEN_UPDATE")) {
            fs::remove_all(folder / "expected");
            for (const auto& [file, bytes] : actual) {
                if (input.count(file) && input.at(file) == bytes) continue;
                fs::create_directories((folder / "expected" / file).parent_path());
                std::ofstream(folder / "expected" / file, std::ios::binary) << bytes;
            }
        }
        Files expected = FilesBelow(folder / "expected");
        expected.insert(input.begin(), input.end());  // keeps expected/tree/'s version of a file
        for (const auto& [file, bytes] : expected) {
            if (!actual.count(file))
                ADD_FAILURE() << name << ": " << file << " is missing";
            else
                EXPECT_EQ(actual.at(file), bytes) << name << ": " << file;
        }
        for (const auto& [file, bytes] : actual)
            if (!expected.count(file)) ADD_FAILURE() << name << ": " << file << " was not expected";
    }
}

// check-all writes each report as its single command does: each case of check-all, run again command
// by command on the same tree, leaves the same reports.
TEST(Golden, CheckAllWritesTheReportsOfTheSingleCommands) {
    const char* singles[] = {"doubled-objects",      "irregular-entries", "empty-references",
                             "wrong-sim-references", "doubled-used-sims", "missing-objects --all-maps"};
    const fs::path scratch = fs::path(VERRANT_SCRATCH_DIR) / "golden-check-all";
    for (const fs::path& folder : Cases()) {
        const std::string words = WordsOf(folder);
        if (words.rfind("check-all ", 0) != 0) continue;
        Files together, apart;
        for (const auto& [file, bytes] : RunCase(folder, scratch, words))
            if (file.rfind("reports/", 0) == 0) together[file] = bytes;
        for (const char* single : singles)
            for (const auto& [file, bytes] : RunCase(folder, scratch, single + words.substr(9)))
                if (file.rfind("reports/", 0) == 0) apart[file] = bytes;
        EXPECT_EQ(together, apart) << folder.filename();
    }
}
