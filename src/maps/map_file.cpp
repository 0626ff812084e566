// A map file is binary records with the placed objects' class names among numbers:
//
//   ..\x07\0\0\0com.maddox.il2.objects.buildings.House$Kiosk\0<x y z heading as floats>..
//
// The records are never parsed: a bounded prefix is read and text is looked for in it.
#include "maps/map_file.h"

#include "catalogue/text.h"
#include "platform/platform.h"

namespace {

const std::size_t ValidationPrefixSize = 50000;
const std::size_t MapTextPrefixSize = 140000;
const std::string MapFileMarker = "com.maddox.il2.objects";

// Up to limit bytes from the start of the file, opened by its bare name in its own folder. False
// when the folder or the file cannot be reached, so that no file of another folder is read.
bool ReadFilePrefix(const std::string& folder, const std::string& fileName, std::size_t limit,
                    std::string& bytes) {
    bytes.clear();
    if (!MakeFolderCurrent(folder)) return false;
    Handle file = OpenForReading(fileName);
    if (file == 0) return false;
    bytes.resize(limit);
    std::size_t filled = 0;
    while (filled < limit) {
        std::size_t got = ReadBytes(file, bytes.data() + filled, limit - filled);
        if (got == 0) break;
        filled += got;
    }
    bytes.resize(filled);
    CloseFile(file);
    return true;
}

}  // namespace

void SplitMapFileSelection(const std::string& selection, std::string& folder, std::string& fileName) {
    std::size_t star = selection.find('*');
    folder = selection.substr(0, star);
    fileName = star == std::string::npos ? "" : selection.substr(star + 1);
}

std::string ValidationTextOf(std::string_view bytes) {
    std::string text;
    text.reserve(bytes.size());
    for (char c : bytes)
        if (static_cast<unsigned char>(c) > 32) text += c;
    return text;
}

std::string MapTextOf(std::string_view bytes) {
    std::string text;
    text.reserve(bytes.size());
    for (char c : bytes) {
        unsigned char byte = static_cast<unsigned char>(c);
        if (byte == 0)
            text += ' ';
        else if (byte >= 33 && byte <= 122)
            text += c;
    }
    return text;
}

// A "build" with no blank after it runs into the end of the prefix, so its name may be cut short:
// it gives no name and ends the scan.
std::vector<std::string> ExtractMapObjectNames(const std::string& mapText) {
    std::vector<std::string> names;
    std::size_t position = 0;
    for (;;) {
        std::size_t start = mapText.find("build", position);
        if (start == std::string::npos) break;
        std::size_t blank = mapText.find(' ', start);
        if (blank == std::string::npos) break;
        names.push_back(mapText.substr(start, blank - start));
        position = blank;
    }
    return names;
}

bool IsMapFile(const std::string& folder, const std::string& fileName) {
    if (fileName == "static.ini") return false;
    std::string bytes;
    if (!ReadFilePrefix(folder, fileName, ValidationPrefixSize, bytes)) return false;
    return Contains(ValidationTextOf(bytes), MapFileMarker);
}

std::string ReadMapFileText(const std::string& folder, const std::string& fileName) {
    std::string bytes;
    if (!ReadFilePrefix(folder, fileName, MapTextPrefixSize, bytes)) return "";
    return MapTextOf(bytes);
}
