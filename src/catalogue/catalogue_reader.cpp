// static.ini, as the readers see it:
//
//   [***]
//   Title House
//   (0)
//   [buildings.House$Kiosk]
//   Mesh          3do/Buildings/Kiosk/mono.sim
//
// Bytes in, bytes out: no decoding and no limit on a line's length.
#include "catalogue/catalogue_reader.h"

#include "platform/platform.h"

#include <cstring>

LineReader LinesOf(const std::string& bytes) { return {&bytes, 0}; }

bool NextPhysicalLine(LineReader& reader, std::string_view& line) {
    const std::string& bytes = *reader.bytes;
    if (reader.position >= bytes.size()) return false;
    // strcspn stops at CR, at LF and at NUL, the three line ends, and is much faster than a loop
    // over the bytes; the string's own terminating NUL stops a scan that reaches its end.
    const char* start = bytes.data() + reader.position;
    std::size_t length = std::strcspn(start, "\r\n");
    line = std::string_view(start, length);
    reader.position += length;
    if (reader.position == bytes.size()) return true;
    char ending = bytes[reader.position++];
    if (ending == '\r' && reader.position < bytes.size() && bytes[reader.position] == '\n') ++reader.position;
    return true;
}

bool NextCatalogueLine(LineReader& reader, std::string_view& line) {
    if (!NextPhysicalLine(reader, line)) return false;
    line = TrimBlanks(line);
    return true;
}

FileRead ReadWholeFile(const std::string& folder, const std::string& fileName, std::string& bytes) {
    const std::size_t blockSize = 1 << 16;
    bytes.clear();
    if (!MakeFolderCurrent(folder)) return FileRead::NotOpened;
    Handle file = OpenForReading(fileName);
    if (file == 0) return FileRead::NotOpened;
    // One block for the whole file: growing it as it fills would copy it over and over.
    bytes.reserve(FileSizeOf(file) + blockSize);
    for (;;) {
        std::size_t filled = bytes.size();
        bytes.resize(filled + blockSize);
        std::size_t got = ReadBytes(file, bytes.data() + filled, blockSize);
        bytes.resize(filled + got);
        if (got == 0) break;
    }
    bool failed = ReadHasFailed(file);
    CloseFile(file);
    return failed ? FileRead::FailedPartway : FileRead::Whole;
}

std::string_view TrimBlanks(std::string_view line) {
    std::size_t first = line.find_first_not_of(' ');
    if (first == std::string_view::npos) return {};
    return line.substr(first, line.find_last_not_of(' ') + 1 - first);
}

bool IsBuildingHeader(std::string_view line) { return line.substr(0, 4) == "[bui"; }

std::string_view SectionNameByBracket(std::string_view header) {
    if (header.empty()) return {};
    std::size_t bracket = header.find(']', 1);
    return header.substr(1, bracket == std::string_view::npos ? std::string_view::npos : bracket - 1);
}

std::string_view SectionNameByEnds(std::string_view header) {
    if (header.size() < 2) return {};
    return header.substr(1, header.size() - 2);
}

// A header without "$" gives the whole line less its last character.
std::string_view ObjectNameOf(std::string_view header) {
    std::size_t dollar = header.find('$');
    std::size_t start = dollar == std::string_view::npos ? 0 : dollar + 1;
    std::size_t next = header.find('$', start);
    std::string_view name = header.substr(start, next == std::string_view::npos ? std::string_view::npos : next - start);
    if (!name.empty()) name.remove_suffix(1);
    return name;
}

std::vector<std::string_view> BuildingSectionNames(const std::string& catalogue) {
    std::vector<std::string_view> names;
    LineReader reader = LinesOf(catalogue);
    std::string_view line;
    while (NextCatalogueLine(reader, line))
        if (IsBuildingHeader(line)) names.push_back(SectionNameByBracket(line));
    return names;
}
