#include "output/app_state.h"

std::string StartFolder;
std::string CatalogueFolder;
std::string MapsPattern;
bool ProgressListOn = false;

Handle MainWindow = 0;
Handle OpenCatalogueButton = 0;
Handle ProgressToggle = 0;
Handle ProgressWindow = 0;
Handle ProgressList = 0;

void ClearAppState() {
    StartFolder.clear();
    CatalogueFolder.clear();
    MapsPattern.clear();
    ProgressListOn = false;
    MainWindow = OpenCatalogueButton = ProgressToggle = ProgressWindow = ProgressList = 0;
}
