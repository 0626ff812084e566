#include "test_support.h"

#include "platform/headless/headless.h"
#include "output/app_state.h"

#include <filesystem>
#include <fstream>
#include <sstream>

namespace fs = std::filesystem;

void ScratchTest::SetUp() {
    const ::testing::TestInfo* info = ::testing::UnitTest::GetInstance()->current_test_info();
    // Inside the build tree: suites of other build trees may run at the same time.
    root = (fs::path(VERRANT_SCRATCH_DIR) / info->test_suite_name() / info->name()).string();
    fs::remove_all(root);
    fs::create_directories(root + "/Desktop");
    HeadlessReset();
    ClearAppState();
    HeadlessSetDesktopFolder(Folder("Desktop"));
    HeadlessSetEnvironment("WINDIR", "C:\\WINDOWS");
}

void ScratchTest::TearDown() {
    HeadlessReset();
    if (!HasFailure()) fs::remove_all(root);
}

std::string ScratchTest::Host(const std::string& relative) const { return root + "/" + relative; }

std::string ScratchTest::Folder(const std::string& relative) const {
    return HeadlessProgramPath(Host(relative)) + "\\";
}

void ScratchTest::Write(const std::string& relative, const std::string& bytes) const {
    fs::path path = Host(relative);
    fs::create_directories(path.parent_path());
    std::ofstream(path, std::ios::binary) << bytes;
}

std::string ScratchTest::Read(const std::string& relative) const {
    std::ifstream in(Host(relative), std::ios::binary);
    std::ostringstream text;
    text << in.rdbuf();
    return text.str();
}

bool ScratchTest::Exists(const std::string& relative) const { return fs::exists(Host(relative)); }

void ScratchTest::UseCatalogue(const std::string& bytes, const std::string& folder) {
    Write(folder + "/static.ini", bytes);
    CatalogueFolder = Folder(folder);
}

Strings ScratchTest::ProgressLines() const {
    const HeadlessControl* list = HeadlessControlOf(ProgressList);
    return list ? list->lines : Strings();
}

Strings ScratchTest::Messages() const {
    Strings shown;
    for (const ShownMessage& message : HeadlessMessages()) shown.push_back(message.title + ": " + message.text);
    return shown;
}

void ScratchTest::Restart() {
    TearDown();
    SetUp();
}

std::string CrLf(const Strings& lines) {
    std::string text;
    for (const std::string& line : lines) text += line + "\r\n";
    return text;
}

HeadlessStep ChooserOkStep() {
    return [] {
        Event event;
        event.window = HeadlessFindWindow("Searching static.ini");
        event.kind = EventKind::Control;
        event.control = HeadlessControlByKind(event.window, "push");
        event.id = HeadlessControlOf(event.control)->id;
        return event;
    };
}
