#include "tests/tools/tool_runner.h"

#include <algorithm>
#include <cstdlib>
#include <filesystem>
#include <fstream>
#include <sstream>
#include <sys/wait.h>
#include <unistd.h>

namespace fs = std::filesystem;

namespace {

std::string QuoteForShell(const std::string& word)
{
    std::string quoted = "'";
    for (char c : word)
        quoted += c == '\'' ? "'\\''" : std::string(1, c);
    return quoted + "'";
}

std::string Slurp(const std::string& path)
{
    std::ifstream file(path, std::ios::binary);
    std::ostringstream text;
    text << file.rdbuf();
    return text.str();
}

} // namespace

// What the program says and reads lies beside its folder, so that the folder holds its files alone.
ToolTest::ToolTest()
{
    char pattern[] = "/tmp/vexel-test-XXXXXX";
    folder = std::string(mkdtemp(pattern)) + "/here";
    fs::create_directory(folder);
}

ToolTest::~ToolTest()
{
    std::error_code ignored;
    fs::remove_all(fs::path(folder).parent_path(), ignored);
}

Outcome ToolTest::RunShell(const std::string& line) const
{
    const std::string script =
        "cd " + folder + "; vexel=" VEXEL_TOOL_PATH "; { " + line + "; } >../out 2>../err";
    const int status = std::system(script.c_str());
    return {WIFEXITED(status) ? WEXITSTATUS(status) : -1, Slurp(folder + "/../out"),
            Slurp(folder + "/../err")};
}

Outcome ToolTest::Run(const std::vector<std::string>& words, const std::vector<U8>& input) const
{
    Write("../in", input);
    std::string line = "$vexel";
    for (const std::string& word : words)
        line += " " + QuoteForShell(word);
    return RunShell(line + " <../in");
}

void ToolTest::Write(const std::string& name, const std::vector<U8>& bytes) const
{
    std::ofstream file(PathOf(name), std::ios::binary);
    file.write(reinterpret_cast<const char*>(bytes.data()), std::streamsize(bytes.size()));
}

std::string ToolTest::Read(const std::string& name) const
{
    return Slurp(PathOf(name));
}

Picture ToolTest::Load(const std::string& name) const
{
    Picture picture;
    EXPECT_TRUE(LoadPng(PathOf(name), &picture)) << name;
    return picture;
}

bool ToolTest::Exists(const std::string& name) const
{
    return fs::exists(PathOf(name));
}

std::vector<std::string> ToolTest::Files() const
{
    std::vector<std::string> names;
    for (const fs::directory_entry& entry : fs::directory_iterator(folder))
        names.push_back(entry.path().filename().string());
    std::sort(names.begin(), names.end());
    return names;
}

std::vector<U8> StripMovie(int frames)
{
    ShapeBuilder square;
    square.Styles(0, square.AddFill(Rgba{255, 0, 0, 255})).Rect(0, 0, 200, 200);
    MovieWriter movie(60 * 20, 40 * 20, Fps(10));
    movie.DefineShape(1, square).Place(1, 1).Show();
    for (int i = 1; i < frames; i++)
        movie.Move(1, Mat::Translate(80 * i, 0)).Show();
    movie.End();
    return movie.Bytes();
}
