// Runs the built program, each test in a folder of its own.
#pragma once

#include "tests/player/player_scene.h"

#include <filesystem>
#include <fstream>
#include <sys/wait.h>

struct Outcome {
    int code = -1; // exit code; -1 when a signal ended it
    std::string out, err;
};

// Movies and what the program says lie above its folder, so that the folder holds its files alone.
class Tool : public testing::Test {
protected:
    Tool() : folder(std::string(mkdtemp(above)) + "/here/")
    {
        std::filesystem::create_directory(folder);
    }
    ~Tool() override { std::filesystem::remove_all(above); }

    // Runs a line of shell in the folder with $vexel set; vexel with these words, quoted for it.
    Outcome Shell(const std::string& line) const
    {
        const std::string script = "cd " + folder +
                                   "; export LC_ALL=C vexel=" VEXEL_TOOL_PATH "; { " + line +
                                   "\n} >../out 2>../err </dev/null";
        const int status = std::system(script.c_str());
        return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, Read("../out"), Read("../err")};
    }
    Outcome Run(const std::string& words) const { return Shell("$vexel " + words); }

    void Write(const std::string& name, const std::vector<U8>& bytes) const
    {
        std::ofstream file(folder + name, std::ios::binary);
        file.write(reinterpret_cast<const char*>(bytes.data()), std::streamsize(bytes.size()));
    }
    std::string Read(const std::string& name) const
    {
        std::ifstream file(folder + name, std::ios::binary);
        return {std::istreambuf_iterator<char>(file), {}};
    }
    Picture Load(const std::string& name) const
    {
        Picture picture;
        EXPECT_TRUE(LoadPng(folder + name, &picture)) << name;
        return picture;
    }
    // The names in the folder, sorted, a blank between two.
    std::string Files() const { return Shell("printf %s \"$(ls | xargs)\"").out; }

    char above[32] = "/tmp/vexel-test-XXXXXX";
    std::string folder;
};
