// Runs the programs in tests/data/scripts. README.txt there says how they are written.
#include "core/player/limits.h"
#include "tests/player/player_scene.h"
#include "tests/support/script_writer.h"

#include <fstream>
#include <map>

namespace {

constexpr int kRootFrames = 6;

struct Script {
    std::string where;
    std::map<std::string, ScriptWords> code = {}; // by timeline and frame, from 1
    int framesLoaded = kRootFrames;
    int level = 0; // one that plays the code for "level"
    std::vector<ScriptWords> wanted = {};

    TagWriter& Write(TagWriter* tags, const std::string& place, int frame) const
    {
        const auto block = code.find(place + " " + std::to_string(frame));
        return block != code.end() ? tags->DoAction(AssembleScript(block->second)) : *tags;
    }
};

std::vector<U8> MakeMovie(const Script& script, const std::string& root, int frames)
{
    const std::string labels[] = {"one", "mid", "three", "-x", "-5", "six"};
    MovieWriter movie(2000, 2000, Fps(10), kRootFrames);
    TagWriter a, b;
    script.Write(&b, "b", 1).Place(1, 1).Show().End();
    a.Place2(1, {.character = 2, .name = "b"});
    for (int f = 1; f <= 3; f++)
        script.Write(&a, "a", f).Label(labels[f - 1]).Show();
    movie.DefineShape(1, Square()).DefineSprite(2, b).DefineSprite(3, a.End());
    movie.Place2(1, {.character = 3, .name = "a"});
    for (int f = 1; f <= frames; f++)
        script.Write(&movie, root, f).Label(labels[f - 1]).Show();
    return movie.Bytes();
}

// A shell that may unload everything in the middle of a record.
class ScriptShell : public NativePlayerWnd {
public:
    using NativePlayerWnd::NativePlayerWnd;
    int redraws = 0;
    void InvalidateScreenArea(const SRECT*) override
    {
        redraws++;
        if (actionDepth > 0 && FindVariable("unload"))
            ClearScript();
    }
};

std::string Answer(ScriptShell* player, const std::string& what, const std::string& arg)
{
    ScriptValue value;
    if (what == "stack")
        return player->stack.Peek(U32(std::stoi(arg)))->Text();
    if (what == "request") {
        std::vector<HostRequest> all = player->Requests();
        all.resize(40, {"no", "", "", "", "", ""});
        const HostRequest& r = all[size_t(std::stoi(arg)) - 1];
        return r.kind + " " + r.url + " " + r.window + (r.data.empty() ? "" : " " + r.data);
    }
    if (what == "var")
        return player->GetVariable(player, arg.c_str(), &value) ? value.Text() : "absent";
    const ScriptThread* thread = player->FindTarget(nullptr, arg.c_str());
    const std::map<std::string, int> numbers = {
        {"aborted", player->actionsAborted},
        {"frame", thread ? thread->curFrame + 1 : 0},
        {"playing", thread ? thread->playing : 0},
        {"there", thread != nullptr},
        {"dragged",
         thread && player->drag.object && player->drag.object.Get() == thread->rootObject}};
    return std::to_string(numbers.at(what));
}

void Check(ScriptShell* player, const ScriptWords& want)
{
    const bool stack = want[0].text == "stack";
    ASSERT_TRUE(!stack || player->stack.Count() == want.size() - 1) << player->stack.Count();
    for (size_t i = stack ? 1 : 2; i < want.size(); i++) {
        const std::string arg = stack ? std::to_string(want.size() - 1 - i) : want[1].text;
        EXPECT_EQ(Answer(player, want[0].text, arg), want[i].text) << want[0].text << " " << arg;
    }
}

// The clock stands at 250 ms, and the player was made at 0. A tracer sees each value as text.
void Play(const Script& script, bool traced)
{
    SCOPED_TRACE(script.where);
    SetHeadlessClock(0);
    ScriptShell player(100, 100);
    SetHeadlessClock(250000);
    if (traced)
        player.tracer.record = [](void*, ScriptThread*, const SActionRecord&, ValueStack& stack) {
            for (U32 i = 0; i < 2 && stack.Peek(i); i++)
                stack.Peek(i)->Text();
        };
    const std::vector<U8> movie = MakeMovie(script, "root", kRootFrames);
    const size_t loaded = MakeMovie(script, "root", script.framesLoaded).size();
    player.Feed(movie.data(), loaded);
    if (script.level != 0) {
        const std::vector<U8> more = MakeMovie(script, "level", kRootFrames);
        ScriptPlayer* level = player.OpenLayer(script.level, 0);
        level->PushDataBuf(more.data(), S32(more.size()));
        level->DrawFrame(0, true);
        player.DoActions();
    }
    EXPECT_EQ(player.scene.calls.level, 0);
    for (const ScriptWords& want : script.wanted)
        Check(&player, want);
    player.DoPlay(0); // and on it goes
}

void Append(ScriptWords* to, const ScriptWords& more)
{
    to->insert(to->end(), more.begin(), more.end());
}

std::vector<Script> Read(const std::string& file)
{
    std::vector<Script> scripts;
    std::string place, line;
    std::ifstream in(file);
    for (int n = 1; std::getline(in, line); n++) {
        const ScriptWords tokens = SplitScript(line);
        const std::string verb = tokens.empty() ? "test" : tokens[0].text;
        const size_t arrow = verb == "=" ? std::string::npos : line.find(" ->");
        if ((verb == "test" && !tokens.empty()) || arrow != std::string::npos) {
            scripts.push_back({file + ":" + std::to_string(n)});
            place = "root 1";
        }
        if (arrow != std::string::npos) {
            Append(&scripts.back().code[place], SplitScript(line.substr(0, arrow)));
            scripts.back().wanted.push_back(SplitScript("stack " + line.substr(arrow + 3)));
        } else if (verb == "on") {
            place = tokens.at(1).text + " " + tokens.at(2).text;
        } else if (verb == "loaded" || verb == "level") {
            Script& script = scripts.back();
            (verb == "level" ? script.level : script.framesLoaded) = std::stoi(tokens.at(1).text);
        } else if (verb == "=") {
            scripts.back().wanted.emplace_back(tokens.begin() + 1, tokens.end());
        } else if (verb != "test") {
            Append(&scripts.back().code[place], tokens);
        }
    }
    return scripts;
}

} // namespace

// Nobody can tell numbers from their text: with someone who looks at them it all ends the same.
TEST(Scripts, LeaveWhatTheirFilesSay)
{
    const SLimits kept = gLimits;
    gLimits.workPerRun = 1u << 22;
    for (const char* name : {"values", "flow", "timelines", "sprites", "removal", "urls"}) {
        const std::vector<Script> scripts =
            Read(std::string(VEXEL_SOURCE_DIR "/tests/data/scripts/") + name + ".txt");
        EXPECT_FALSE(scripts.empty()) << name;
        for (const Script& script : scripts) {
            Play(script, false);
            Play(script, true);
        }
    }
    gLimits = kept;
}

// Each program stays far below the limit by its records alone: it is the walks that it causes which
// end it, soon after they have used up the work of a run.
TEST(Scripts, PayForTheWalksTheyCause)
{
    const SLimits kept = gLimits;
    const struct {
        const char* walk;
        const char* program;
        int times;
        bool ends = true;
    } rows[] = {
        {"children kept by a seek", "GotoFrame 2 GotoFrame 1", 400},
        {"objects under the pointer", "0 0 \"a\" StartDrag EndDrag", 200},
        {"siblings below and above", "\"a\" \"x\" 16384 CloneSprite \"a\" \"y\" 60000 CloneSprite",
         800},
        {"objects in a box", "\"\" 8 GetProperty Pop", 200},
        {"names in a path", "\"\" 11 GetProperty Pop", 12}, // of "a" itself
        {"digits of a number", "\"digits\" GetVariable Not Pop", 400},
        {"quality", "ToggleQuality", 1001, false},
    };
    for (const auto& row : rows) {
        SCOPED_TRACE(row.walk);
        std::string text;
        for (int i = 0; i < row.times; i++)
            text += std::string(row.program) + " ";
        Script script = {row.walk};
        script.code["root 4"] = script.code["a 3"] = SplitScript(text);
        const std::vector<U8> movie = MakeMovie(script, "root", kRootFrames);
        ScriptShell player(100, 100);
        player.Feed(movie.data(), movie.size());
        player.Seek(4);
        ScriptThread* a = player.FindTarget(nullptr, "a");
        for (int i = 0; i < 1000; i++)
            player.ScriptThread::CloneSprite(a, "c", 20000 + i);
        const bool named = std::string(row.walk) == "names in a path";
        if (named)
            player.SetPropertyStr(a, 13, std::string(600000, 'n').c_str());
        player.ScriptThread::SetVariable("digits", std::string(900, '7').c_str(), 0);
        player.Push("left");
        player.redraws = 0;
        gLimits.workPerRun = 300000;
        const U64 before = player.scene.work;
        player.CallFrame(named ? a : &player, named ? 2 : 3);
        EXPECT_EQ(row.ends, player.actionsAborted);
        EXPECT_EQ(row.ends ? 0u : 1u, player.stack.Count());
        EXPECT_LT(player.scene.work - before, 2 * 300000u);
        EXPECT_LE(player.redraws, 2);
        gLimits = kept;
    }
}
