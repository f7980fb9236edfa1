// A program for process mode: writes its command line as the system gave it
// and its arguments, one line each, into the file named by its first argument.
#include <windows.h>

#include <cstdio>

int main(int argc, char** argv)
{
    if (argc < 2)
        return 1;
    FILE* f = std::fopen(argv[1], "w");
    if (f == nullptr)
        return 1;
    std::fprintf(f, "%s\n", ::GetCommandLineA());
    for (int i = 1; i < argc; ++i)
        std::fprintf(f, "%s\n", argv[i]);
    std::fclose(f);
    return 5;
}
