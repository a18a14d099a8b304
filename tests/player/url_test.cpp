#include "core/player/limits.h"
#include "core/player/relative_url.h"
#include "core/player/stream_data.h"
#include "core/player/url_builder.h"
#include "core/stream/str.h"
#include "tests/player/player_scene.h"

#include <sstream>

namespace {

// A shell that keeps every request, and answers when the test says so.
struct AskedShell : PlayingShell {
    using PlayingShell::PlayingShell;
    static std::string Text(const char* s) { return s != nullptr ? s : "-"; }
    void StreamGetURLNotify(const char* url, const char* window, void* info) override
    {
        asked += "get " + Text(url) + " " + Text(window) + "\n";
        infos.push_back(info);
    }
    void StreamPostURLNotify(const char*, const char*, U32 length, const char* data, void*) override
    {
        asked += "post " + std::string(data, length) + "\n";
    }
    void ProcessFSCommand(const char* c, const char* a) override { asked += Text(c) + Text(a); }
    void CloseStream(StreamData* in) override { closed.push_back(in); }
    void AdjustWindow(S32 w, S32 h) override { asked += "size " + std::to_string(w * h) + "\n"; }
    std::string Asked() { return std::exchange(asked, ""); }
    // The oldest request is answered; how much of the data is wanted.
    S32 Begin(StreamData* in, const char* url, const std::vector<U8>& bytes)
    {
        StreamInNew(in, url, infos.front());
        infos.erase(infos.begin());
        return StreamInWrite(in, bytes.data(), S32(bytes.size()));
    }
    std::string Value(const char* target, const char* name)
    {
        ScriptThread* thread = FindTarget(nullptr, target);
        const SVariable* var = thread != nullptr ? thread->FindVariable(name) : nullptr;
        return var != nullptr ? Text(var->value) : "none";
    }

    std::vector<void*> infos;
    std::vector<StreamData*> closed;
    std::string asked;
};

// Shows sprite "a" at (30, 20) pixels and depth 3.
std::vector<U8> SpriteMovie()
{
    MovieWriter movie;
    movie.DefineShape(1, Square()).DefineSprite(2, TagWriter().Place(1, 1).Show(2).End());
    movie.Place2(3, {.character = U16(2), .matrix = Mat::Translate(600, 400), .name = "a"}).Show();
    return movie.Bytes();
}

// A code that is broken takes along what breaks it, unless that is the end of the text.
TEST(URL, VariablesAreEncodedAndDecoded)
{
    std::istringstream cases(
        "x=a%41b+c x=aAb+c x=%G1 x=1 x=%4Gy x=y x=% x= x=%4 x= a=%26%3D&b=1=2 a=%26%3D&b=1%3D2 "
        "a=1&A=B.~+e a=B%2E%7E+e a=%00b a= a&b=&c=%c3%A9 a=&b=&c=%C3%A9 "
        "abcdefghijklm=1&b=2 abcdefghijklm=1 x=1%&y=2&z x=1y%3D2&z=");
    gLimits.variablesBytes = 16;
    for (std::string text, expected; cases >> text >> expected;) {
        ScriptThread thread;
        URLBuilder builder;
        DecodeQueryString(&thread, text.c_str());
        builder.EncodeVariables(thread.vars);
        EXPECT_EQ(expected, builder.Text()) << text;
    }
    gLimits = {};
}

TEST(URL, RelativeOnesAreResolved)
{
    std::istringstream cases(
        "http://h/a/b.vxm c.vxm http://h/a/c.vxm http://h/a/b?q=/x#/z c http://h/a/c "
        "http://h/a/b?q ?r=../s http://h/a/b?r=../s http://h/a/b?q - http://h/a/b?q "
        "http://h/b?q #f http://h/b?q#f https://h:8/a /c/./d/../e https://h:8/c/e "
        "https://h/a //i/j https://i/j http://h c http://h/c http://h/a/b .. http://h/ "
        "http://h/a/b ../../../d/ http://h/d/ file:///m/a s/t?u=1/../ file:///m/s/t?u=1/../ "
        "m/a.vxm ../../b.vxm b.vxm m/a d:b m/d:b http://h/a mailto:x@y mailto:x@y - c/.. c/..");
    PlayingShell player(SpriteMovie());
    for (std::string base, url, expected; cases >> base >> url >> expected;) {
        base = base == "-" ? "" : base;
        url = url == "-" ? "" : url;
        char* made = player.BuildRelative(base.c_str(), url.data());
        EXPECT_EQ(expected, made) << base << " " << url;
        FreeStr(made != url.data() ? made : nullptr);
    }
    EXPECT_TRUE(MachineEqual("HTTP://u:p@Host/x", "http://host:080/y?@i"));
    EXPECT_TRUE(MachineEqual("https://[::1]", "https://[::1]:443/"));
    for (const char* url : {"https://host", "http://host:81", "http://hos", "host"})
        EXPECT_FALSE(MachineEqual("http://host", url)) << url;
}

TEST(URL, RequestsGoWhereTheyShould)
{
    const std::tuple<const char*, const char*, int, const char*> cases[] = {
        {"fsCommand:quit", "now", 0, "quitnow"},
        {"p.html", "", 0, "get file:///m/p.html _self\n"},
        {"http://h/", "_blank", 0x80, "get http://h/ _blank\n"},
        {"b.txt", "/a", 0xC0, "get file:///m/b.txt -\n"},
        {"b.vxm", "/b", 0x40, ""},
        {"b.vxm", "_level16000", 0, ""},
        {"", "/a", 0x40, ""}};
    for (const char* base : {"file:///m/x?y", "."}) {
        AskedShell player(SpriteMovie());
        FreeStr(std::exchange(player.baseURL, CreateStr(base)));
        FreeStr(std::exchange(player.sourceName, CreateStr("file:///m/x")));
        for (const auto& [url, window, flags, expected] : cases) {
            player.GetURL(url, window, nullptr, flags);
            EXPECT_EQ(expected, player.Asked()) << url << " " << window;
        }
        player.GetURL("c", "w", "x=1", 2);
        const char head[] = "post Content-type: application/x-www-form-urlencoded\n";
        EXPECT_EQ(head + std::string("Content-length: 3\n\nx=1\n\0\n", 25), player.Asked());
        const std::string most(gLimits.stringBytes, 'x'); // cut, more would be something else
        player.GetURL("c", "w", (most + "y").c_str(), 2);
        player.GetURL(("http://" + most).c_str(), "_level1", nullptr, 0);
        EXPECT_EQ("", player.Asked());
        for (void* info : player.infos)
            player.StreamFailed(info);
    }
}

// What was asked for before is nobody's any more. Only the first movie says how large it is and
// becomes the base, and only as long as it is awaited.
TEST(Loading, FirstMovieComesLikeAllOthers)
{
    AskedShell player(std::vector<U8>{});
    const std::vector<U8> movie = MovingSquare(3);
    player.GetURL("/old", "_level1", nullptr, 0);
    player.ControlOpen("file:///m/a.vxm?v=1");
    EXPECT_EQ("get /old -\nget file:///m/a.vxm?v=1 -\n", player.Asked());
    StreamData old, in, next;
    EXPECT_EQ(-1, player.Begin(&old, "/old", movie));
    player.Begin(&in, "file:///m/a.vxm?v=1", {movie.begin(), movie.begin() + 20});
    player.StreamInWrite(&in, movie.data() + 20, S32(movie.size()) - 20);
    player.StreamInDestroy(&old);
    player.StreamInDestroy(&in);
    EXPECT_EQ("size 8000\n", player.Asked());
    EXPECT_TRUE(player.Started() && player.Value("/", "v") == "1");
    player.GetURL("b", "_level1", nullptr, 0);
    player.ControlOpen("c");
    EXPECT_EQ("get file:///m/b -\nget c -\n", player.Asked());
    player.StreamFailed(player.infos[0]);
    EXPECT_EQ(1, player.firstLoad) << "that was another request";
    player.StreamFailed(player.infos[1]);
    player.infos.clear();
    player.GetURL("d", "_level1", nullptr, 0);
    player.Begin(&next, "d", movie);
    EXPECT_EQ("get d -\n", player.Asked());
    EXPECT_TRUE(next.player == player.layers && !player.Started());
    player.StreamInDestroy(&next);
}

// One that there is no room for does not play, until another has gone.
TEST(Loading, MoviesShareOneLimit)
{
    const std::vector<U8> movie = MovingSquare(3);
    AskedShell player(movie);
    gLimits.allMovieBytes = U32(2 * movie.size());
    std::string played;
    for (const char* level : {"_level1", "_level2", "_level1"}) {
        StreamData in;
        player.GetURL("b", level, nullptr, 0);
        player.Begin(&in, "b", movie);
        played += in.player->gotHeader ? "y" : "n";
        player.StreamInDestroy(&in);
    }
    EXPECT_EQ("yny", played);
    gLimits = {};
}

// A movie has the place, name and depth of the sprite, and timelines inside; variables come when
// their stream ends. Whatever is unloaded while it is fed, the stream feeds nobody from then on.
TEST(Loading, IntoSpritesAndLevelsAndOutAgain)
{
    const std::vector<U8> movie = SpriteMovie(), text = {'x'};
    const std::tuple<const char*, int, const char*, size_t> steps[] = {{"/a", 0x40, "/a/a", 1},
                                                                       {"/a/a", 0x40, "/a", 2},
                                                                       {"_level2", 0, "_level2", 1},
                                                                       {"/a", 0xC0, "_level0", 3}};
    for (const auto& [ignored, none, unloaded, gone] : steps) {
        StreamData in[4];
        StreamData* stream = in;
        AskedShell player(movie);
        player.FindTarget(nullptr, "/a")->rootObject->puppet = 1;
        for (const auto& [path, flags, other, more] : steps) {
            player.GetURL("b.vxm", path, nullptr, flags);
            player.Begin(stream++, "b.vxm?q=1%2B1", flags == 0xC0 ? text : movie);
            player.DoPlay(0);
            const SObject* obj = player.FindTarget(nullptr, path)->rootObject;
            EXPECT_TRUE(flags == 0 || (obj->depth == 3 && obj->xform.mat.tx == 600));
            EXPECT_EQ(path == std::string("/a"), obj->puppet == 1);
            EXPECT_EQ("1+1 none", player.Value(path, "q") + " " + player.Value(path, "x"));
        }
        player.GetURL("", unloaded, nullptr, unloaded[0] == '/' ? 0x40 : 0);
        EXPECT_EQ(gone, player.closed.size());
        for (StreamData& each : in) {
            const bool closed = std::count(player.closed.begin(), player.closed.end(), &each);
            EXPECT_EQ(closed ? -1 : 1, player.StreamInWrite(&each, "=", 1)) << unloaded;
            player.StreamInDestroy(&each);
        }
        EXPECT_EQ(gone == 3 ? "none" : "", player.Value("/a", "x"));
    }
}

} // namespace
