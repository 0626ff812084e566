#include "cli/cli_options.h"

bool ParseCliOptions(const std::vector<std::string>& words, CliOptions& options, std::string& error) {
    options = CliOptions();
    error.clear();
    for (std::size_t i = 0; i < words.size(); ++i) {
        const std::string& word = words[i];
        auto value = [&](std::string& into) {
            if (i + 1 >= words.size() || words[i + 1].empty()) {
                error = word + " needs a value";
                return false;
            }
            into = words[++i];
            return true;
        };
        if (word == "--help" || word == "-h") {
            options.help = true;
        } else if (word == "--version") {
            options.version = true;
        } else if (word == "--progress") {
            options.progress = true;
        } else if (word == "--all-maps") {
            options.allMaps = true;
        } else if (word == "--tree") {
            if (!value(options.tree)) return false;
        } else if (word == "--catalogue") {
            if (!value(options.catalogue)) return false;
        } else if (word == "--report-dir") {
            if (!value(options.reportDir)) return false;
        } else if (word == "--map") {
            if (!value(options.map)) return false;
        } else if (!word.empty() && word[0] == '-') {
            error = "unknown option " + word;
            return false;
        } else if (options.command.empty()) {
            options.command = word;
        } else {
            error = "unexpected word " + word;
            return false;
        }
    }
    if (options.help || options.version) return true;
    if (options.command.empty())
        error = "no command given";
    else if (!options.tree.empty() && !options.catalogue.empty())
        error = "give --tree or --catalogue, not both";
    else if (options.allMaps && !options.map.empty())
        error = "give --map or --all-maps, not both";
    return error.empty();
}
