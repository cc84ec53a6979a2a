#pragma once
// Colours as projects and settings store them: red in the low byte; 0x01000000 means "no
// colour" (the caller's system colour stands in) and 0x02xxxxxx values are palette-relative,
// drawn as the colour in their low 24 bits.

#include <QColor>
#include <cstdint>

inline QColor StoredColour(std::uint32_t value, const QColor& none) {
    if (value == 0x01000000u)
        return none;
    return QColor(value & 0xFF, (value >> 8) & 0xFF, (value >> 16) & 0xFF);
}
