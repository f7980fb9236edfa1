#include "QoLimits.h"

#include "CQoException.h"

#include <cstdio>

namespace qolimits {

int Checked(char const *key, long long value, long long low, long long high)
{
    if (value < low || value > high) {
        char text[256];
        std::snprintf(text, sizeof text, "Der Wert %lld von '%s' liegt au\xDF" "erhalb von %lld bis %lld", value,
                      key ? key : "", low, high);
        throw CQoException(CQoException::invalidArgument, text, nullptr);
    }
    return static_cast<int>(value);
}

} // namespace qolimits
