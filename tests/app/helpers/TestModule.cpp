// A conversion module for the executer tests. QoMain writes its argc and
// argv, one line each, into the file named by argv[1], then acts on argv[2]:
// a number is returned, "throw" throws a C++ exception.
#include <cstdio>
#include <cstdlib>
#include <cstring>
#include <stdexcept>

extern "C" __declspec(dllexport) int QoMain(int argc, char** argv)
{
    if (argc >= 2) {
        FILE* f = std::fopen(argv[1], "w");
        if (f != nullptr) {
            std::fprintf(f, "%d\n", argc);
            for (int i = 0; i < argc; ++i)
                std::fprintf(f, "%s\n", argv[i]);
            std::fprintf(f, "%s\n", argv[argc] == nullptr ? "(null)" : "(not null)");
            std::fclose(f);
        }
    }
    if (argc >= 3 && std::strcmp(argv[2], "throw") == 0)
        throw std::runtime_error("Eingabedatei nicht lesbar");
    return argc >= 3 ? std::atoi(argv[2]) : 0;
}
