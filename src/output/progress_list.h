// The progress list window, in which a running check shows what it does.
#pragma once

#include <string>

void OpenProgressList();
void CloseProgressList();
// Callers test ProgressListOn first: these never touch a list that is not open.
void ClearProgressList();
void AddProgressLine(const std::string& text);
