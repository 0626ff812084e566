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

#include <algorithm>

namespace {

const std::size_t ReadBlockSize = 1 << 16;

// Makes at least one unread byte available; false at the end of the file.
bool Refill(CatalogueReader& reader) {
    if (reader.position < reader.filled) return true;
    if (reader.exhausted || reader.file == 0) return false;
    reader.buffer.resize(ReadBlockSize);
    reader.filled = ReadBytes(reader.file, reader.buffer.data(), reader.buffer.size());
    reader.position = 0;
    if (reader.filled == 0) {
        reader.exhausted = true;
        reader.failed = ReadHasFailed(reader.file);
    }
    return reader.filled > 0;
}

bool IsLineEnd(char c) { return c == '\r' || c == '\n' || c == '\0'; }

}  // namespace

bool OpenCatalogue(const std::string& folder, CatalogueReader& reader, const std::string& fileName) {
    reader = CatalogueReader();
    if (!MakeFolderCurrent(folder)) return false;
    reader.file = OpenForReading(fileName);
    return reader.file != 0;
}

void CloseCatalogue(CatalogueReader& reader) {
    if (reader.file != 0) CloseFile(reader.file);
    reader.file = 0;
    reader.exhausted = true;
}

bool AtCatalogueEnd(CatalogueReader& reader) { return !Refill(reader); }

bool NextPhysicalLine(CatalogueReader& reader, std::string& line) {
    line.clear();
    if (!Refill(reader)) return false;
    for (;;) {
        const char* start = reader.buffer.data() + reader.position;
        const char* stop = reader.buffer.data() + reader.filled;
        const char* end = std::find_if(start, stop, IsLineEnd);
        line.append(start, end);
        reader.position += static_cast<std::size_t>(end - start);
        if (end != stop) break;
        if (!Refill(reader)) return true;
    }
    char ending = reader.buffer[reader.position++];
    if (ending == '\r' && Refill(reader) && reader.buffer[reader.position] == '\n') ++reader.position;
    return true;
}

bool NextCatalogueLine(CatalogueReader& reader, std::string& line) {
    if (!NextPhysicalLine(reader, line)) return false;
    TrimBlanksInPlace(line);
    return true;
}

void TrimBlanksInPlace(std::string& line) {
    std::size_t first = line.find_first_not_of(' ');
    if (first == std::string::npos) {
        line.clear();
        return;
    }
    line.erase(line.find_last_not_of(' ') + 1);
    line.erase(0, first);
}

std::string TrimBlanks(const std::string& line) {
    std::string trimmed = line;
    TrimBlanksInPlace(trimmed);
    return trimmed;
}

bool IsBuildingHeader(const std::string& line) { return line.compare(0, 4, "[bui") == 0; }

std::string SectionNameByBracket(const std::string& header) {
    if (header.empty()) return "";
    std::size_t bracket = header.find(']', 1);
    return header.substr(1, bracket == std::string::npos ? std::string::npos : bracket - 1);
}

std::string SectionNameByEnds(const std::string& header) {
    if (header.size() < 2) return "";
    return header.substr(1, header.size() - 2);
}

// A header without "$" gives the whole line less its last character.
std::string ObjectNameOf(const std::string& header) {
    std::size_t dollar = header.find('$');
    std::size_t start = dollar == std::string::npos ? 0 : dollar + 1;
    std::size_t next = header.find('$', start);
    std::string name = header.substr(start, next == std::string::npos ? std::string::npos : next - start);
    if (!name.empty()) name.pop_back();
    return name;
}
