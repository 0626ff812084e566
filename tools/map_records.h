// The bytes of an actors.static file as a map editor leaves them, enough for the map check: a
// count, then one record per placed object with its class name, a NUL and binary numbers
// (position, heading, flags).
#pragma once

#include <cstdint>
#include <cstring>
#include <string>
#include <vector>

inline void AppendLittleEndian(std::string& bytes, std::uint32_t value, int size) {
    for (int i = 0; i < size; ++i) bytes += static_cast<char>((value >> (8 * i)) & 0xff);
}

inline void AppendFloat(std::string& bytes, float value) {
    std::uint32_t raw = 0;
    std::memcpy(&raw, &value, sizeof raw);
    AppendLittleEndian(bytes, raw, 4);
}

// classNames are whole class names such as "com.maddox.il2.objects.buildings.House$Kiosk".
inline std::string MapRecordBytes(const std::vector<std::string>& classNames) {
    std::string bytes;
    AppendLittleEndian(bytes, static_cast<std::uint32_t>(classNames.size()), 4);
    for (std::size_t i = 0; i < classNames.size(); ++i) {
        AppendLittleEndian(bytes, static_cast<std::uint32_t>(i), 4);
        AppendLittleEndian(bytes, static_cast<std::uint32_t>(classNames[i].size()), 2);
        bytes += classNames[i];
        bytes += '\0';
        AppendFloat(bytes, 1000.0f + 37.5f * static_cast<float>(i % 4000));
        AppendFloat(bytes, 2000.0f - 12.25f * static_cast<float>(i % 3000));
        AppendFloat(bytes, 0.0f);
        AppendFloat(bytes, static_cast<float>(i % 360));
        AppendLittleEndian(bytes, 0, 4);
    }
    return bytes;
}

inline std::string BuildingClassName(const std::string& objectName) {
    return "com.maddox.il2.objects.buildings.House$" + objectName;
}
