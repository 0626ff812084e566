#include "cli/cli_options.h"

#include "test_support.h"

TEST(CliOptions, TakesCommandAndOptionsInAnyOrder) {
    CliOptions options;
    std::string error;
    ASSERT_TRUE(ParseCliOptions(
        {"--progress", "--report-dir", "out", "empty-references", "--catalogue", "a b"}, options, error));
    EXPECT_EQ(options.command, "empty-references");
    EXPECT_EQ(options.catalogue, "a b");
    EXPECT_EQ(options.reportDir, "out");
    EXPECT_TRUE(options.progress);
    EXPECT_FALSE(options.help);
}

TEST(CliOptions, RejectsBadUsageWithReason) {
    const std::pair<Strings, std::string> cases[] = {
        {{}, "no command given"},
        {{"--progress"}, "no command given"},
        {{"doubled-objects", "--catalogue"}, "--catalogue needs a value"},
        {{"doubled-objects", "--catalogue", ""}, "--catalogue needs a value"},
        {{"doubled-objects", "--report-dir"}, "--report-dir needs a value"},
        {{"doubled-objects", "--verbose"}, "unknown option --verbose"},
        {{"doubled-objects", "empty-references"}, "unexpected word empty-references"},
    };
    for (const auto& [words, reason] : cases) {
        CliOptions options;
        std::string error;
        EXPECT_FALSE(ParseCliOptions(words, options, error)) << reason;
        EXPECT_EQ(error, reason);
    }
}
