// What the database filter tests share: the rows through the text filter
// tests' helpers, a folder under the host's /tmp (Z:\tmp under Wine), and
// the message of the CQoException an action raises.
#pragma once

#include "../qotools/PythonPeer.h"
#include "../qotools/TextFilterTestSupport.h"

#include <CQoException.h>

#include <functional>
#include <string>

using Folder = PeerFolder;

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
