// What the database filter tests read from a filter: the rows through the
// text filter tests' helpers, and the message of the CQoException an action
// raises.
#pragma once

#include "../qotools/TextFilterTestSupport.h"

#include <CQoException.h>

#include <functional>
#include <string>

// Empty when the action raises nothing.
inline std::string ErrorOf(const std::function<void()>& action)
{
    try {
        action();
    } catch (const CQoException& e) {
        return e.Message();
    }
    return std::string();
}
