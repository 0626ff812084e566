// The shared catalogue reader and the name cuts of a building header.
#pragma once

#include <string>
#include <string_view>
#include <vector>

// The lines of bytes held in memory. Lines come out as views into those bytes, so the bytes must
// outlive every line taken from them.
struct LineReader {
    const std::string* bytes = nullptr;
    std::size_t position = 0;
};

LineReader LinesOf(const std::string& bytes);
// A line ends at CR LF, LF, CR or NUL; a CR followed by any other byte leaves that byte for the
// next line. A line end at the very end of the data makes no further empty line.
bool NextPhysicalLine(LineReader& reader, std::string_view& line);
// The next physical line less its leading and trailing blanks (tabs stay).
bool NextCatalogueLine(LineReader& reader, std::string_view& line);

// How reading a whole file ended.
enum class FileRead {
    Whole,          // every byte is in
    NotOpened,      // the folder or the file could not be opened
    FailedPartway,  // a read failed: what came in is not the whole file
};
// Makes the folder current and reads the file there, opened by its bare name, to its end.
FileRead ReadWholeFile(const std::string& folder, const std::string& fileName, std::string& bytes);

std::string_view TrimBlanks(std::string_view line);
bool IsBuildingHeader(std::string_view line);
std::string_view SectionNameByBracket(std::string_view header);
std::string_view SectionNameByEnds(std::string_view header);
std::string_view ObjectNameOf(std::string_view header);
// The section names of the building headers by the bracket cut, in file order.
std::vector<std::string_view> BuildingSectionNames(const std::string& catalogue);
