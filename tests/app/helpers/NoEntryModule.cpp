// A library that is loadable but is no conversion module: no QoMain.
extern "C" __declspec(dllexport) int QoMainNot(int, char**)
{
    return 99;
}
