#include "SimBlockParameters.h"

#include <cstdio>

std::string IntegerLimitMessage(std::int32_t lowerLimit) {
    char text[64];
    std::snprintf(text, sizeof text, kIntegerLimitFormat, static_cast<int>(lowerLimit));
    return text;
}
