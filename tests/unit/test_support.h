// A scratch folder per test, the headless platform reset, and file helpers.
#pragma once

#include "platform/headless/headless.h"

#include <gtest/gtest.h>

#include <string>
#include <vector>

using Strings = std::vector<std::string>;

// Creates a fresh scratch folder with a Desktop folder in it, resets the headless platform and
// the application state, and points the desktop there.
class ScratchTest : public ::testing::Test {
protected:
    void SetUp() override;
    void TearDown() override;

    // Host path of a name inside the scratch folder.
    std::string Host(const std::string& relative) const;
    // Program path ("\" separators) of a folder inside the scratch folder, ending in "\".
    std::string Folder(const std::string& relative) const;
    void Write(const std::string& relative, const std::string& bytes) const;
    std::string Read(const std::string& relative) const;
    bool Exists(const std::string& relative) const;
    // Writes static.ini into a catalogue folder and makes it the known catalogue folder.
    void UseCatalogue(const std::string& bytes, const std::string& folder = "mods/std/com/maddox/il2/objects");
    std::string Desktop(const std::string& name) const { return Read("Desktop/" + name); }
    // Lines of the open progress list.
    Strings ProgressLines() const;
    // Titles and texts of the message boxes shown, as "Title: text".
    Strings Messages() const;
    // A fresh scratch folder and platform, for cases run in a loop.
    void Restart();

    std::string root;
};

// A click on "OK" in the folder chooser.
HeadlessStep ChooserOkStep();

// Joins lines each followed by CR LF.
std::string CrLf(const Strings& lines);
