// The parts of a '/'-separated path with "." and empty parts dropped and each
// ".." taking away the part before it (internal). Used where two names must
// be compared as the same place: file paths, and the members of a zip package.
#pragma once

#include <string>
#include <vector>

inline std::vector<std::string> QoPathParts(std::string const &path)
{
    std::vector<std::string> parts;
    std::size_t start = 0;
    while (start <= path.size()) {
        std::size_t slash = path.find('/', start);
        if (slash == std::string::npos)
            slash = path.size();
        std::string part = path.substr(start, slash - start);
        if (part == "..") {
            if (!parts.empty())
                parts.pop_back();
        } else if (!part.empty() && part != ".") {
            parts.push_back(part);
        }
        start = slash + 1;
    }
    return parts;
}
