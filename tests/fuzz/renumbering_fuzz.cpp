// Renumbering and denumbering arbitrary catalogues: the round trip gives the catalogue back with
// CR LF line ends, a second renumbering changes nothing, and where every line holding a bracket is
// a number line the result is that of the plain two passes.
#include "fuzz_support.h"

#include "rewrite/renumbering.h"

namespace {

// "(", digits, ")" between blanks: the lines the denumbering takes out.
bool NumberLineOracle(const std::string& line) {
    std::size_t first = line.find_first_not_of(' '), last = line.find_last_not_of(' ');
    if (first == std::string::npos || last < first + 2 || line[first] != '(' || line[last] != ')') return false;
    for (std::size_t i = first + 1; i < last; ++i)
        if (line[i] < '0' || line[i] > '9') return false;
    return true;
}

std::string Rewrite(Numbering mode) {
    Require(RenumberCatalogue(ScratchFolder(), mode) == CommandResult::Done, "the rewrite is done");
    bool exists = false, leftOver = false;
    std::string catalogue = ReadScratchFile("static.ini", exists);
    ReadScratchFile("static.ini.tmp", leftOver);
    Require(exists && !leftOver, "static.ini is in place and static.ini.tmp is gone");
    return catalogue;
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string input(reinterpret_cast<const char*>(data), size);
    ResetForInput();
    std::vector<std::string> lines = CatalogueLinesOf(input, false);
    std::vector<std::string> kept;
    bool onlyNumberLinesHoldBrackets = true;
    for (const std::string& line : lines) {
        if (!NumberLineOracle(line)) kept.push_back(line);
        if (!NumberLineOracle(line) && line.find_first_of("()") != std::string::npos) onlyNumberLinesHoldBrackets = false;
    }

    WriteScratchFile("static.ini", input);
    if (!IsTextCatalogue(input)) {
        bool exists = false;
        Require(RenumberCatalogue(ScratchFolder(), Numbering::Renumber) == CommandResult::Failed &&
                    ReadScratchFile("static.ini", exists) == input,
                "a catalogue that is not text stays as it is");
        return 0;
    }
    std::string renumbered = Rewrite(Numbering::Renumber);
    if (onlyNumberLinesHoldBrackets) {
        WriteScratchFile("copy/static.ini", input);
        bool exists = false;
        Require(renumbered == BaselineOutput("two-passes", "@static.ini", exists), "renumbering as the two passes");
    }
    Require(Rewrite(Numbering::Renumber) == renumbered, "a second renumbering changes nothing");
    Require(Rewrite(Numbering::Denumber) == CrLfText(kept),
            "denumbering gives back every line but the number lines");
    return 0;
}
