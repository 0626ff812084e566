// How every command reads static.ini: whole, before it decides anything, so that a catalogue that
// could not be read to its end is never checked, listed or rewritten as if it were complete.
#pragma once

#include "catalogue/catalogue_reader.h"

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
// Reads static.ini in the folder; false, with the user told, when it could not be read whole.
bool LoadCatalogue(const std::string& folder, std::string& catalogue, const CatalogueOpenFailure& notOpened);
