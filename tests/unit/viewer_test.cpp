// The text viewer: Notepad from the Windows folder, started in the file's folder; the shell's
// open as the second way; a catalogue that no way can show is told.
#include "output/reports.h"

#include "test_support.h"

namespace {

struct ViewerCase {
    std::string name;
    bool processStarts, shellOpens;
    std::string windir;
    StartedProcess expected;  // how the viewer was started; empty command line and file: not at all
    Strings messages;
};

}  // namespace

TEST_F(ScratchTest, ViewerStartsNotepadOrFallsBackToTheShell) {
    const std::string notepad = "C:\\WINDOWS\\notepad.exe";
    const ViewerCase cases[] = {
        {"process", true, true, "D:\\WIN", {"\"D:\\WIN\\notepad.exe\" static.ini", Folder("cat"), false, "", ""}, {}},
        {"shell", false, true, "C:\\WINDOWS", {"", Folder("cat"), true, notepad, "static.ini"}, {}},
        {"no WINDIR", true, true, "", {"\"" + notepad + "\" static.ini", Folder("cat"), false, "", ""}, {}},
        {"neither", false, false, "C:\\WINDOWS", {}, {"static.ini failure: Can't open static.ini"}},
    };
    for (const ViewerCase& c : cases) {
        SCOPED_TRACE(c.name);
        Restart();
        HeadlessSetEnvironment("WINDIR", c.windir);
        HeadlessSetProcessStarts(c.processStarts, c.shellOpens);
        OpenCatalogueInViewer(Folder("cat"));
        EXPECT_EQ(Messages(), c.messages);
        if (c.messages.empty()) {
            ASSERT_EQ(HeadlessProcesses().size(), 1u);
            const StartedProcess& started = HeadlessProcesses()[0];
            EXPECT_EQ(started.commandLine, c.expected.commandLine);
            EXPECT_EQ(started.workingFolder, c.expected.workingFolder);
            EXPECT_EQ(started.throughShell, c.expected.throughShell);
            EXPECT_EQ(started.file, c.expected.file);
            EXPECT_EQ(started.parameters, c.expected.parameters);
        }
    }
}
