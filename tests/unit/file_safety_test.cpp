// The rewrite and the reports against what others leave in their way: a second run, a run that died,
// links and pipes, the catalogue's mode, owner and link, catalogues that are not text.
#include "commands/command_table.h"
#include "output/app_state.h"
#include "output/progress_list.h"
#include "test_support.h"

#include <signal.h>
#include <sys/stat.h>
#include <sys/wait.h>
#include <unistd.h>

#include <filesystem>

namespace fs = std::filesystem;
using namespace std::string_literals;

namespace {

const std::string Objects = "mods/std/com/maddox/il2/objects/";
const std::string Catalogue = "[***]\r\nTitle Mods\r\n[buildings.House$A]\r\n";
const std::string Renumbered = "[***]\r\nTitle Mods\r\n(0)\r\n[buildings.House$A]\r\n";

class FileSafetyTest : public ScratchTest {
   protected:
    CommandResult Run(const char* command) { return RunCommand(*CommandNamed(command)); }
    struct stat Status(const std::string& relative) const {
        struct stat status {};
        EXPECT_EQ(lstat(Host(relative).c_str(), &status), 0) << relative;
        return status;
    }
};

}  // namespace

TEST_F(FileSafetyTest, LiveRunKeepsTheCatalogueAndADeadOneLeavesNothingInTheWay) {
    UseCatalogue(Catalogue);
    int ready[2];
    ASSERT_EQ(pipe(ready), 0);
    pid_t first = fork();
    if (first == 0) {  // stops in the middle of its rewrite, as if the machine were slow
        ProgressListOn = true;  // with the list on, the rewrite lets an event through
        OpenProgressList();
        HeadlessPushPending([&] {
            EXPECT_EQ(write(ready[1], "!", 1), 1);
            for (;;) pause();
            return Event();
        });
        Run("renumber");
        _exit(1);
    }
    char byte = 0;
    ASSERT_EQ(read(ready[0], &byte, 1), 1);
    EXPECT_EQ(Run("denumber"), CommandResult::Failed);
    kill(first, SIGKILL);
    waitpid(first, nullptr, 0);
    EXPECT_EQ(Messages(), Strings{"static.ini failure: Can't write static.ini.tmp"});
    EXPECT_EQ(Read(Objects + "static.ini"), Catalogue);
    EXPECT_EQ(Run("renumber"), CommandResult::Done);
    EXPECT_EQ(Read(Objects + "static.ini"), Renumbered);
    EXPECT_FALSE(Exists(Objects + "static.ini.tmp"));
}

TEST_F(FileSafetyTest, LinksAndPipesAtTheTemporaryFileOrAReportAreNeverWrittenNorWaitedFor) {
    struct Case {
        const char* command;
        std::string at, message;
    };
    for (const Case& c :
         {Case{"renumber", Objects + "static.ini.tmp", "static.ini failure: Can't write static.ini.tmp"},
          Case{"fmb-list", "Desktop/Static_list_FMB.txt",
               "Report failure: Can't write Static_list_FMB.txt"}}) {
        for (bool isPipe : {false, true}) {
            SCOPED_TRACE(c.at + (isPipe ? " pipe" : " link"));
            Restart();
            UseCatalogue(Catalogue);
            Write("stranger.txt", "theirs");
            isPipe ? (void)mkfifo(Host(c.at).c_str(), 0600)
                   : fs::create_symlink(Host("stranger.txt"), Host(c.at));
            EXPECT_EQ(Run(c.command), CommandResult::Failed);
            EXPECT_EQ(Messages(), Strings{c.message});
            EXPECT_EQ(Read("stranger.txt"), "theirs");
            EXPECT_EQ(Read(Objects + "static.ini"), Catalogue);
            EXPECT_EQ(Status(c.at).st_mode & S_IFMT, isPipe ? S_IFIFO : S_IFLNK);
        }
    }
    // A hard link: a report is not written through it; static.ini.tmp as one is a dead run's
    // leftover, whose name alone goes.
    for (const Case& c : {Case{"fmb-list", "Desktop/Static_list_FMB.txt", "Report failure: Can't write Static_list_FMB.txt"},
                          Case{"renumber", Objects + "static.ini.tmp", ""}}) {
        SCOPED_TRACE(c.at + " hard link");
        Restart();
        UseCatalogue(Catalogue);
        Write("stranger.txt", "theirs");
        fs::create_hard_link(Host("stranger.txt"), Host(c.at));
        EXPECT_EQ(Run(c.command), c.message.empty() ? CommandResult::Done : CommandResult::Failed);
        EXPECT_EQ(Messages(), c.message.empty() ? Strings{"Renumber static.ini: Done"} : Strings{c.message});
        EXPECT_EQ(Read("stranger.txt"), "theirs");
    }
    for (const char* command : {"doubled-objects", "renumber"}) {  // a pipe as the catalogue itself
        fs::remove(Host(Objects + "static.ini"));
        ASSERT_EQ(mkfifo(Host(Objects + "static.ini").c_str(), 0600), 0);
        EXPECT_EQ(Run(command), CommandResult::Failed) << command;
    }
}

TEST_F(FileSafetyTest, RewriteKeepsModeOwnerAndLinkAndLeavesAReadOnlyCatalogue) {
    UseCatalogue(Catalogue);
    ASSERT_EQ(chmod(Host(Objects + "static.ini").c_str(), 0640), 0);
    bool root = geteuid() == 0;  // only root may give a file away
    EXPECT_EQ(root ? chown(Host(Objects + "static.ini").c_str(), 4321, 4321) : 0, 0);
    EXPECT_EQ(Run("renumber"), CommandResult::Done);
    EXPECT_EQ(Status(Objects + "static.ini").st_mode & 07777, 0640u);
    EXPECT_EQ(Status(Objects + "static.ini").st_uid, root ? 4321u : geteuid());

    Write("elsewhere/real.ini", Catalogue);
    fs::remove(Host(Objects + "static.ini"));
    fs::create_symlink(Host("elsewhere/real.ini"), Host(Objects + "static.ini"));
    EXPECT_EQ(Run("renumber"), CommandResult::Done);
    EXPECT_EQ(Status(Objects + "static.ini").st_mode & S_IFMT, S_IFLNK);
    EXPECT_EQ(Read("elsewhere/real.ini"), Renumbered);

    ASSERT_EQ(chmod(Host("elsewhere/real.ini").c_str(), 0444), 0);
    EXPECT_EQ(Run("denumber"), CommandResult::Failed);
    EXPECT_EQ(Messages().back(), "static.ini failure: Can't replace static.ini");
    EXPECT_EQ(Read("elsewhere/real.ini"), Renumbered);
}

TEST_F(FileSafetyTest, CatalogueThatIsNotTextIsNotRewrittenYetStillChecked) {
    // Byte-order marks of UTF-16 before Cyrillic letters, which have no NUL; UTF-32 and UTF-16 without one.
    for (const std::string& bytes : {"\xFF\xFE\x1F\x04\x40\x04"s, "\xFE\xFF\x04\x1F\x04\x40"s,
                                     "\0\0\xFE\xFF\0\0\x04\x1F"s, "[\0b\0u\0i\0l\0"s}) {
        Restart();
        UseCatalogue(bytes);
        EXPECT_EQ(Run("renumber"), CommandResult::Failed);
        EXPECT_EQ(Messages(), Strings{"static.ini failure: static.ini is not a text file"});
        EXPECT_EQ(Read(Objects + "static.ini"), bytes);
        EXPECT_EQ(Run("irregular-entries"), CommandResult::Findings);
    }
    UseCatalogue("[buildings.House$A]\0\r\nMesh 3do/a.sim\r\n"s);  // one stray NUL
    EXPECT_EQ(Run("renumber"), CommandResult::Done);
}
