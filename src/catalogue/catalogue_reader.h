// The shared catalogue reader and the name cuts of a building header.
#pragma once

#include "platform/platform.h"

#include <string>
#include <vector>

struct CatalogueReader {
    Handle file = 0;
    std::vector<char> buffer;
    std::size_t position = 0;
    std::size_t filled = 0;
    bool exhausted = false;  // the file gave its last byte
    bool failed = false;     // a read failed: what came before is not the whole file
};

// Makes the folder current and opens the catalogue there by its bare name.
bool OpenCatalogue(const std::string& folder, CatalogueReader& reader, const std::string& fileName = "static.ini");
void CloseCatalogue(CatalogueReader& reader);
bool AtCatalogueEnd(CatalogueReader& reader);
// A line ends at CR LF, LF, CR or NUL; a CR followed by any other byte leaves that byte for the
// next line. A line end at the very end of the data makes no further empty line.
bool NextPhysicalLine(CatalogueReader& reader, std::string& line);
// The next physical line less its leading and trailing blanks (tabs stay).
bool NextCatalogueLine(CatalogueReader& reader, std::string& line);

void TrimBlanksInPlace(std::string& line);
std::string TrimBlanks(const std::string& line);
bool IsBuildingHeader(const std::string& line);
std::string SectionNameByBracket(const std::string& header);
std::string SectionNameByEnds(const std::string& header);
std::string ObjectNameOf(const std::string& header);
