// How every command reads static.ini: a block at a time, opened with the command's own words when
// it does not open, and judged at its end, so that a catalogue that could not be read to its end is
// never reported, listed or rewritten as if it were complete.
#pragma once

#include "catalogue/catalogue_reader.h"
#include "catalogue/name_table.h"

#include <string>

// What a command says when static.ini does not open; an empty title says nothing.
struct CatalogueOpenFailure {
    std::string title, text;
};
const CatalogueOpenFailure CantOpenCatalogue = {"static.ini failure", "Can't open static.ini"};
const CatalogueOpenFailure CantOpenToRewrite = {"static.ini failure", "Can't open file static.ini"};
// A read that failed partway, for every command alike.
const CatalogueOpenFailure CantReadCatalogue = {"static.ini failure", "Can't read static.ini"};

// Tells the user why the catalogue could not be read: a read that failed partway is
// "Can't read static.ini" for every command, a catalogue that did not open in the command's words.
void TellCatalogueFailure(FileRead read, const CatalogueOpenFailure& notOpened);
// Opens static.ini in the folder for reading line by line; false, with the user told, when it does
// not open.
bool OpenCatalogue(const std::string& folder, LineReader& catalogue, const CatalogueOpenFailure& notOpened);
// Whether the lines taken were the whole catalogue; when a read failed partway the user is told.
bool ReadToTheEnd(const LineReader& catalogue);
// Reads every line of static.ini once, so that a run of several checks knows at its start whether
// the catalogue reads whole; false, with the user told, when it does not.
bool CatalogueReadsWhole(const std::string& folder, const CatalogueOpenFailure& notOpened);
// The passes of a check that reads the catalogue more than once: the first takes the reader opened
// already; a later one that does not open is a read that failed partway.
CataloguePass PassesOver(const std::string& folder, LineReader& opened);
