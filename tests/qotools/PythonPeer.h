// Independent peers: the host's Python 3 (python3-dbf, dbfread, openpyxl, csv) runs a
// script in a PeerFolder and leaves its findings there. Under Wine the folder is below
// Z:\tmp and Python starts through `start /wait /unix`; where it cannot, the check skips.
#pragma once

#include "TempFolder.h"

#include <gtest/gtest.h>

#include <chrono>
#include <cstdio>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <random>
#include <sstream>
#include <string>
#include <thread>
#include <vector>

class PeerFolder {
public:
    PeerFolder()
    {
        std::random_device random;
        std::string leaf = "qotools_peer_" + std::to_string(random()) + "_" + std::to_string(random());
#ifdef _WIN32
        std::error_code error;
        if (std::filesystem::is_directory("Z:\\tmp", error)) {
            m_path = std::filesystem::path("Z:\\tmp") / leaf;
            m_unix = "/tmp/" + leaf;
        }
#else
        m_path = std::filesystem::temp_directory_path() / leaf;
        m_unix = m_path.string();
#endif
        if (!m_path.empty())
            std::filesystem::create_directories(m_path);
    }
    ~PeerFolder()
    {
        std::error_code ignored;
        if (!m_path.empty())
            std::filesystem::remove_all(m_path, ignored);
    }
    PeerFolder(PeerFolder const &) = delete;
    PeerFolder &operator=(PeerFolder const &) = delete;

    bool Usable() const { return !m_path.empty(); }
    std::string Path(char const *name) const { return (m_path / name).string(); }
    std::string UnixPath(char const *name) const { return m_unix + "/" + name; }

private:
    std::filesystem::path m_path;
    std::string m_unix;
};

// Runs `script` with `folder` bound to the folder; false (traceback printed) on failure.
inline bool RunPython(PeerFolder const &folder, char const *name, std::string const &script)
{
    std::string file = std::string(name) + ".py";
    {
        std::string body;
        std::istringstream lines(script);
        for (std::string line; std::getline(lines, line);)
            body += "    " + line + "\n";
        std::ofstream out(folder.Path(file.c_str()), std::ios::binary);
        out << "import sys, os, traceback\nfolder = sys.argv[1]\ntry:\n    pass\n"
            << body
            << "except BaseException:\n"
            << "    open(os.path.join(folder, 'failed'), 'w').write(traceback.format_exc())\n"
            << "    sys.exit(1)\n"
            << "open(os.path.join(folder, 'done'), 'w').write('ok')\n";
    }
    std::remove(folder.Path("done").c_str());
    std::remove(folder.Path("failed").c_str());
    std::string command = "/usr/bin/python3 " + folder.UnixPath(file.c_str()) + " " +
                          folder.UnixPath("").substr(0, folder.UnixPath("").size() - 1);
#ifdef _WIN32
    command = "start /wait /unix " + command + " >NUL 2>&1";
#endif
    std::system(command.c_str());
    // Wine's start does not wait for a host program: wait for its answer.
    for (int i = 0; i < 1200; ++i) {
        if (std::filesystem::exists(folder.Path("done")))
            return true;
        if (std::filesystem::exists(folder.Path("failed")))
            break;
        std::this_thread::sleep_for(std::chrono::milliseconds(100));
    }
    std::printf("peer script %s did not finish: %s\n", name, ReadBytes(folder.Path("failed")).c_str());
    return false;
}

// The peer could not be run: fail natively (Python is part of the set-up),
// skip under Wine, where starting a host program may be impossible.
#ifdef _WIN32
#define PEER_UNAVAILABLE() GTEST_SKIP() << "host Python cannot be started from this Wine session"
#else
#define PEER_UNAVAILABLE() FAIL() << "/usr/bin/python3 with dbf/dbfread did not run"
#endif

// Lines of a file written by a peer script (LF separated, no trailing LF).
inline std::vector<std::string> ReadPeerLines(std::string const &path)
{
    std::vector<std::string> lines;
    std::istringstream in(ReadBytes(path));
    for (std::string line; std::getline(in, line);)
        lines.push_back(line);
    return lines;
}
