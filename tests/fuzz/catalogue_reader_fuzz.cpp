// The line reader and the name cuts on arbitrary bytes, against a plain splitter.
#include "fuzz_support.h"

#include "catalogue/catalogue_reader.h"

namespace {

// The rule, byte by byte: a line ends at CR LF, LF, CR or NUL; no empty line after a final end.
std::vector<std::string> SplitLines(const std::string& bytes) {
    std::vector<std::string> lines;
    std::string line;
    for (std::size_t i = 0; i < bytes.size(); ++i) {
        char c = bytes[i];
        if (c != '\r' && c != '\n' && c != '\0') {
            line += c;
            continue;
        }
        if (c == '\r' && i + 1 < bytes.size() && bytes[i + 1] == '\n') ++i;
        lines.push_back(line);
        line.clear();
    }
    if (!line.empty()) lines.push_back(line);
    return lines;
}

std::string TrimSpaces(const std::string& line) {
    std::size_t first = line.find_first_not_of(' ');
    return first == std::string::npos ? "" : line.substr(first, line.find_last_not_of(' ') - first + 1);
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    std::string bytes(reinterpret_cast<const char*>(data), size);
    // The reader takes the file in blocks of 64 KiB: one first byte in eight moves the input onto
    // the first block's end, so line ends split across two blocks are tried too.
    if (size >= 2 && (data[0] & 7) == 1) bytes.insert(0, std::string((1 << 16) - 1 - data[1] % 8, 'p'));
    ResetForInput();

    std::vector<std::string> expected = SplitLines(bytes);
    Require(CatalogueLinesOf(bytes, false) == expected, "physical lines split as the rule says");
    std::vector<std::string> trimmed = CatalogueLinesOf(bytes, true);
    Require(trimmed.size() == expected.size(), "as many catalogue lines as physical lines");
    for (std::size_t i = 0; i < trimmed.size(); ++i) {
        const std::string& line = trimmed[i];
        Require(line == TrimSpaces(expected[i]), "a catalogue line is its physical line less blanks");
        Require(IsBuildingHeader(line) == (line.rfind("[bui", 0) == 0), "a building header begins with [bui");
        std::string bracket(SectionNameByBracket(line)), ends(SectionNameByEnds(line)),
            name(ObjectNameOf(line));
        if (line.size() >= 2) {
            Require(ends == line.substr(1, line.size() - 2), "the end cut drops the first and last character");
            Require(line.compare(1, bracket.size(), bracket) == 0, "the bracket cut starts after the first character");
            Require(bracket.find(']') == std::string::npos, "the bracket cut stops at the first ]");
            Require(1 + bracket.size() == line.size() || line[1 + bracket.size()] == ']',
                    "the bracket cut keeps everything up to the first ]");
        }
        Require(name.find('$') == std::string::npos && line.find(name) != std::string::npos,
                "an object name is a piece of the header without $");
    }
    return 0;
}
