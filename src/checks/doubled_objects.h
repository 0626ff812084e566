// ".. doubled objects": building headers whose section names occur more than once.
#pragma once

#include "catalogue/catalogue_reader.h"
#include "catalogue/name_table.h"
#include "output/command_result.h"

#include <functional>
#include <string>
#include <string_view>

// One building header, with the index of the next header of the same section name; -1 when no
// later one has it.
struct NamedObject {
    int index = 0;
    std::string_view name;  // holds while the sink has it
    int next = -1;
};

// Gives every building header to the sink in file order, paired with its next repetition. The
// names are held a window at a time: the rest of the catalogue is scanned for the repetitions of a
// window's last names before the window goes to the sink. Returns the number of headers, or -1 when
// a pass did not open or was not read whole (the sink may have had some headers by then).
long long PairDoubledNames(const CataloguePass& openPass, NameWindow window,
                           const std::function<void(const NamedObject&)>& sink);
std::string DoubledObjectLine(const NamedObject& object);

// The check on static.ini in the folder; findings is the number of pairs.
CommandResult FindDoubledObjects(const std::string& catalogueFolder, int& findings);
