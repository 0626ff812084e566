// verrant-cli as a script sees it: the built program run on scratch trees.
#include "test_support.h"

#include <sys/wait.h>

#include <cstdlib>
#include <filesystem>

namespace {

struct CliRun {
    int status = -1;
    std::string out, err;
};

const std::string CatalogueDir = "mods/std/com/maddox/il2/objects";

const std::string Doubles = "[buildings.House$A]\r\n[buildings.House$B]\r\n[buildings.House$A]\r\n";
const std::string Clean = "[buildings.House$A]\r\nMesh 3do/a.sim\r\n";
const std::string Faulty = "Colour red\r\n[buildings.House$A]\r\nMeshLive\r\n";

class CliTest : public ScratchTest {
   protected:
    // Runs verrant-cli in the scratch folder's "run" folder with the words, each quoted.
    CliRun Run(const Strings& words) {
        std::filesystem::create_directories(Host("run"));
        std::string command = "cd '" + Host("run") + "' && '" VERRANT_CLI_PATH "'";
        for (const std::string& word : words) command += " '" + word + "'";
        command += " >'" + Host("out.txt") + "' 2>'" + Host("err.txt") + "'";
        CliRun run;
        int status = std::system(command.c_str());
        run.status = WIFEXITED(status) ? WEXITSTATUS(status) : -1;
        run.out = Read("out.txt");
        run.err = Read("err.txt");
        return run;
    }
    CliRun RunCheck(const std::string& command, const std::string& catalogue, Strings more = {}) {
        Write(CatalogueDir + "/static.ini", catalogue);
        std::filesystem::create_directories(Host("reports"));
        Strings words = {command, "--catalogue", Host(CatalogueDir), "--report-dir", Host("reports")};
        words.insert(words.end(), more.begin(), more.end());
        return Run(words);
    }
};

}  // namespace

TEST_F(CliTest, ExitStatusReportAndMessagePerCommand) {
    const struct {
        std::string command, catalogue;
        int status;
        std::string reportName, report, err;
    } cases[] = {
        {"doubled-objects", Doubles, 1, "Doubled_objects.txt",
         CrLf({"Doubled objects in your static.ini:", "", "Double object (0) => (2): buildings.House$A"}),
         ""},
        {"doubled-objects", Clean, 0, "Doubled_objects.txt", "",
         "No doubled objects: No doubled objects found in your static.ini\n"},
        {"irregular-entries", Faulty, 1, "Irregular_entrys.txt",
         CrLf({"Irregular entrys in your static.ini:", "", "Irregular entry towards object 0: Colour red"}),
         ""},
        {"irregular-entries", Clean, 0, "Irregular_entrys.txt", "",
         "No irregular objects: No irregular objects found in your static.ini\n"},
        {"empty-references", Faulty, 1, "Empty_references.txt",
         CrLf({"Empty references in your static.ini", "", "Object 0", "buildings.House$A",
               "Empty reference: MeshLive"}),
         ""},
        {"empty-references", Clean, 0, "Empty_references.txt",
         "Empty references in your static.ini\r\n\r\nNo empty references found in your static.ini", ""},
    };
    for (const auto& c : cases) {
        SCOPED_TRACE(c.command + " " + c.catalogue);
        std::filesystem::remove_all(Host("reports"));
        CliRun run = RunCheck(c.command, c.catalogue);
        EXPECT_EQ(run.status, c.status);
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.err, c.err);
        EXPECT_EQ(Exists("reports/" + c.reportName), !c.report.empty());
        EXPECT_EQ(Read("reports/" + c.reportName), c.report);
    }
}

TEST_F(CliTest, ProgressLinesGoToStandardOutput) {
    CliRun run = RunCheck("empty-references", Faulty, {"--progress"});
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.out,
              "Empty references in your Static.ini\n \n**************\nObject 0\nbuildings.House$A\n"
              "Empty reference: MeshLive\n");
    run = RunCheck("doubled-objects", Clean, {"--progress"});
    EXPECT_EQ(run.status, 0);
    EXPECT_EQ(run.out, "Build (0) buildings.House$A\n\nTotal number of objects: 1\n");
    EXPECT_EQ(run.err, "No doubled objects: No doubled objects found in your static.ini\n");
}

TEST_F(CliTest, CatalogueThatCannotBeReadExitsTwoAndWritesNothing) {
    std::filesystem::create_directories(Host("reports"));
    std::filesystem::create_directories(Host("empty"));
    for (const char* command : {"doubled-objects", "irregular-entries", "empty-references"}) {
        SCOPED_TRACE(command);
        CliRun run =
            Run({command, "--catalogue", Host("empty"), "--report-dir", Host("reports"), "--progress"});
        EXPECT_EQ(run.status, 2);
        EXPECT_EQ(run.out, "");
        EXPECT_EQ(run.err, "static.ini failure: Can't open static.ini\n");
        EXPECT_TRUE(std::filesystem::is_empty(Host("reports")));

        run = Run({command, "--report-dir", Host("reports")});
        EXPECT_EQ(run.status, 2);
        EXPECT_NE(run.err.find("--catalogue"), std::string::npos) << run.err;
        EXPECT_TRUE(std::filesystem::is_empty(Host("reports")));
    }
}

TEST_F(CliTest, ReportThatCannotBeWrittenExitsTwo) {
    std::filesystem::create_directories(Host("reports/Empty_references.txt"));
    CliRun run = RunCheck("empty-references", Faulty);
    EXPECT_EQ(run.status, 2);
    EXPECT_EQ(run.err, "Report failure: Can't write Empty_references.txt\n");

    run = Run({"doubled-objects", "--catalogue", Host(CatalogueDir), "--report-dir", Host("nowhere")});
    EXPECT_EQ(run.status, 2);
    EXPECT_FALSE(Exists("nowhere"));
}

TEST_F(CliTest, HelpAndBadUsage) {
    CliRun run = Run({"--help"});
    EXPECT_EQ(run.status, 0);
    for (const char* command : {"doubled-objects", "irregular-entries", "empty-references"})
        EXPECT_NE(run.out.find(std::string("\n  ") + command + " "), std::string::npos) << command;
    EXPECT_EQ(run.err, "");

    const Strings badUsages[] = {{},
                                 {"doubled-objects", "--catalogue"},
                                 {"no-such-check", "--catalogue", "."},
                                 {"doubled-objects", "--colour"}};
    for (const Strings& words : badUsages) {
        run = Run(words);
        EXPECT_EQ(run.status, 2);
        EXPECT_EQ(run.out, "");
        EXPECT_NE(run.err.find("usage: verrant-cli COMMAND"), std::string::npos) << run.err;
    }
}

// Windows and Wine see one file under either spelling, and the game's trees are written so.
TEST_F(CliTest, NamesMatchWithoutRegardToCase) {
    Write("Mods/STD/Objects/Static.ini", Faulty);
    std::filesystem::create_directories(Host("Reports"));
    CliRun run =
        Run({"irregular-entries", "--catalogue", Host("mods/std/objects"), "--report-dir", Host("reports")});
    EXPECT_EQ(run.status, 1);
    EXPECT_EQ(run.err, "");
    EXPECT_EQ(Read("Reports/Irregular_entrys.txt"), CrLf({"Irregular entrys in your static.ini:", "",
                                                          "Irregular entry towards object 0: Colour red"}));
}

TEST_F(CliTest, ReportGoesToTheCurrentFolderByDefault) {
    Write(CatalogueDir + "/static.ini", Doubles);
    CliRun run = Run({"doubled-objects", "--catalogue", Host(CatalogueDir)});
    EXPECT_EQ(run.status, 1);
    EXPECT_TRUE(Exists("run/Doubled_objects.txt"));
}
