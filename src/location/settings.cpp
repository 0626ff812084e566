#include "location/settings.h"

#include "catalogue/catalogue_reader.h"
#include "location/catalogue_folder.h"
#include "location/derived_paths.h"
#include "platform/platform.h"
#include "output/app_state.h"
#include "output/messages.h"

namespace {

const char* const SettingsFileName = "verrant.ini";

// Deleting by bare name is only safe once the start folder is current.
bool RemoveSettingsFile(const std::string& startFolder) {
    return MakeFolderCurrent(startFolder) && RemoveFile(SettingsFileName);
}

void ForgetCatalogueFolder() {
    CatalogueFolder.clear();
    MapsPattern.clear();
}

bool WriteSettingsFile(const std::string& folder, const std::string& startFolder) {
    if (!MakeFolderCurrent(startFolder)) return false;
    Handle file = CreateForWriting(SettingsFileName);
    if (file == 0) return false;
    bool written = WriteBytes(file, folder.data(), folder.size());
    if (!CloseFile(file)) written = false;
    // A cut-off path would be taken for a lost folder at the next start.
    if (!written) RemoveFile(SettingsFileName);
    return written;
}

}  // namespace

bool LoadSettings(const std::string& startFolder) {
    {
        LineReader reader;
        if (OpenLines(startFolder, SettingsFileName, reader) == FileRead::NotOpened) return true;
        std::string_view folder;
        NextPhysicalLine(reader, folder);
        CatalogueFolder = folder;
    }  // closed here: Windows deletes no open file, and verrant.ini may be deleted below
    MapsPattern = DeriveMapsPattern(CatalogueFolder);

    // A folder that cannot be entered holds no catalogue, even when the start folder holds one.
    if (FolderHoldsCatalogue(CatalogueFolder)) return false;
    ShowMessage("static,ini failure", "static.ini not found in " + CatalogueFolder);
    MakeFolderCurrent(startFolder);
    ForgetCatalogueFolder();
    RemoveSettingsFile(startFolder);
    return false;
}

bool SavePath(const std::string& folder, const std::string& startFolder) {
    if (!WriteSettingsFile(folder, startFolder)) {
        ShowMessage("Path not saved", "Can't write verrant.ini in " + startFolder);
        return false;
    }
    ShowMessage("Path saved", "Path saved in verrant.ini");
    return true;
}

void ClearPath() {
    if (!RemoveSettingsFile(StartFolder)) {
        ShowMessage("Path cleared failure", "Nothing to clear");
        return;
    }
    ShowMessage("Path cleared", "verrant.ini deleted");
    ForgetCatalogueFolder();
}
