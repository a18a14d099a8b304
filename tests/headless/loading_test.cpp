#include "core/player/limits.h"
#include "tests/player/player_scene.h"

#include <arpa/inet.h>
#include <filesystem>
#include <fstream>
#include <map>
#include <sstream>
#include <sys/socket.h>
#include <sys/stat.h>
#include <thread>
#include <unistd.h>

namespace {

namespace fs = std::filesystem;

// A movie plays as if from a file m.vxm in folder "home". More lies beside it, and a secret
// outside.
class Loading : public testing::Test {
protected:
    Loading()
    {
        char name[] = "/tmp/vexel-loading-XXXXXX";
        root = fs::canonical(mkdtemp(name));
        home = root / "home";
        fs::create_directories(home / "sub");
        Write(root / "homework", {'x', '=', 's'});
        Write(home / "v t.txt", {'x', '=', '1'});
        Write(home / "sub/m.vxm", MovingSquare(3));
        fs::create_symlink("../homework", home / "out");
        fs::create_symlink("sub/m.vxm", home / "in.vxm");
        mkfifo((home / "pipe").c_str(), 0600);
        const std::vector<U8> movie = MovingSquare(9);
        player.SetMovieFile(home / "m.vxm");
        player.Feed(movie.data(), movie.size());
        player.EndOfData();
    }
    ~Loading() override { gLimits = {}, fs::remove_all(root); }
    static void Write(const fs::path& path, const std::vector<U8>& bytes)
    {
        std::ofstream(path).write(reinterpret_cast<const char*>(bytes.data()), S64(bytes.size()));
    }
    // Asks for variables, has them delivered, and returns x and the last word on standard error.
    std::string Ask(const std::string& url, const char* post = nullptr)
    {
        testing::internal::CaptureStderr();
        player.SetVariable("x", "-", 0);
        player.GetURL(url.c_str(), "_level0", post, 0x80);
        player.Deliver();
        std::string said = testing::internal::GetCapturedStderr();
        said = said.substr(0, said.rfind('\n')); // all of it, or without the line's end
        return player.FindVariable("x")->value + said.substr(said.rfind(' ') + 1);
    }

    fs::path root, home;
    NativePlayerWnd player{0, 0};
};

// A web server on this machine that answers each request by its path.
struct Server {
    Server()
    {
        sockaddr_in address = {AF_INET, 0, {htonl(INADDR_LOOPBACK)}, {}};
        socklen_t size = sizeof address;
        bind(listener, reinterpret_cast<sockaddr*>(&address), size);
        listen(listener, 8);
        getsockname(listener, reinterpret_cast<sockaddr*>(&address), &size);
        base = "http://127.0.0.1:" + std::to_string(ntohs(address.sin_port)) + "/";
        setenv("no_proxy", "127.0.0.1", 1);
        thread = std::thread(&Server::Run, this);
    }
    ~Server()
    {
        shutdown(listener, SHUT_RDWR);
        thread.join();
        close(listener);
    }
    // A form ends as the test's does.
    void Run()
    {
        for (int fd; (fd = accept(listener, nullptr, nullptr)) >= 0;) {
            char block[4096];
            last.clear();
            do
                last.append(block, size_t(recv(fd, block, sizeof block, 0)));
            while (!last.ends_with(last[0] == 'P' ? "%20" : "\r\n\r\n"));
            held.emplace_back(fd, "HTTP/1.0 " + answers[last.substr(0, last.find(" HTTP"))]);
            if (held.size() == together)
                Answer();
        }
    }
    // Several are answered at once, and not closed at once.
    void Answer()
    {
        for (const auto& [fd, answer] : held)
            send(fd, answer.data(), answer.size(), MSG_NOSIGNAL);
        usleep(together > 1 ? 200000 : 0);
        for (const auto& [fd, answer] : held)
            close(fd);
        held.clear();
    }

    std::string base, last;                        // URL; request
    std::map<std::string, std::string> answers;    // by method and path: all that is sent
    std::vector<std::pair<int, std::string>> held; // connections and what they will get
    size_t together = 1;
    int listener = socket(AF_INET, SOCK_STREAM, 0);
    std::thread thread;
};

TEST_F(Loading, OnlyWhatLiesAroundTheMovie)
{
    std::istringstream cases(
        "v%20t.txt 1 ./sub/../v%20t.txt?q#f 1 ../homework -folder ..%2fhomework -folder "
        "/etc/passwd -folder out -folder sub -file pipe -file none -file "
        "v%00t.txt -path //host/v -machine http://127.0.0.1/ -allowed data:x=1 -web");
    for (std::string url, result; cases >> url >> result;)
        EXPECT_EQ(result, Ask(url)) << url;
    EXPECT_EQ("1", Ask("file://localhost" + home.string() + "/v t.txt"));
    EXPECT_EQ("-data", Ask("v t.txt", "x=1"));
    gLimits.movieBytes = 2;
    EXPECT_EQ("-large", Ask("v t.txt"));
    gLimits = {};
    EXPECT_TRUE(player.AllowDir(root) && !player.AllowDir(root / "homework") && Ask("out") == "s");
    AccessPolicy web;
    web.SetOrigin("http://h/m.vxm");
    EXPECT_EQ(nullptr, web.Check("http://H:80/x").refusal);
    for (const std::string url :
         {"http://h:81/", "https://h/", "http://u:p@h/", "file:///etc/passwd"})
        EXPECT_NE(nullptr, web.Check(url).refusal) << url;
}

TEST_F(Loading, FilesArriveBeforeTheNextTick)
{
    player.GetURL("in.vxm?x=7", "_level2", nullptr, 0);
    player.GetURL("html", "", "a=b", 0);
    player.GetURL("FSCommand:quit", "now", nullptr, 0);
    EXPECT_EQ(nullptr, player.layers);
    player.Tick();
    EXPECT_STREQ("7", player.layers->FindVariable("x")->value);
    std::string record;
    for (const HostRequest& r : player.Requests())
        record +=
            r.kind + r.url.substr(r.url.rfind('/') + 1) + r.window + r.data + r.command + r.args;
    EXPECT_EQ("urlin.vxm?x=7_level2posthtml_selfa=bfscommandquitnow", record);
}

// Of too many at once, and of too many in a second, the rest is refused.
TEST_F(Loading, RequestsAreLimited)
{
    testing::internal::CaptureStderr();
    for (int i = 0; i < 68; i++) {
        player.GetURL("v t.txt", "_level0", nullptr, 0x80);
        if (i % 17 == 16)
            player.Deliver();
    }
    const std::string said = testing::internal::GetCapturedStderr();
    EXPECT_EQ(3 + 4, std::count(said.begin(), said.end(), '\n')) << said;
    AdvanceHeadlessClock(1000000);
    gLimits.postBytes = 2;
    EXPECT_EQ("-send", Ask("v t.txt", "x=1"));
}

// It is served once a tick, and can be ticked for ever.
TEST_F(Loading, AMovieLoadsItself)
{
    MovieWriter writer;
    const std::string record("\x83\x0E\0m.vxm\0_level0\0", 17);
    writer.DoAction({record.begin(), record.end()}).Show().End();
    Write(home / "m.vxm", writer.Bytes());
    player.ControlOpen((home / "m.vxm").c_str());
    for (size_t i = 0; i < 5; i++) {
        EXPECT_EQ(i, player.Requests().size());
        player.Tick();
        EXPECT_FALSE(player.gotHeader);
    }
    player.ControlOpen((home / "none.vxm").c_str());
    player.Tick();
    EXPECT_EQ(0, player.firstLoad);
    const std::vector<U8> bytes = writer.Bytes();
    NativePlayerWnd other{0, 0};
    other.SetMovieFile(home / "m.vxm");
    other.Feed(bytes.data(), bytes.size());
    EXPECT_TRUE(other.FedMovieLeft() && other.CanTick());
    Write(home / "m.vxm", MovingSquare(3));
    other.Tick();
    EXPECT_TRUE(other.gotHeader && other.CanTick());
}

TEST_F(Loading, FromTheWebWhenAllowed)
{
    if (!HttpClient::Supported())
        GTEST_SKIP();
    const std::vector<U8> movie = MovingSquare(3);
    const std::string moved = "302 Found\r\nLocation: ";
    Server server;
    server.answers["GET /a/m"] = "200 OK\r\n\r\n" + std::string(movie.begin(), movie.end());
    server.answers["GET /a/v"] = "200 OK\r\nContent-Length: 3\r\n\r\nx=3";
    server.answers["POST /a/v"] = "200 OK\r\nContent-Length: 3\r\n\r\nx=5";
    server.answers["POST /moved"] = moved + "a/v\r\n\r\nx=no";
    server.answers["POST /file"] = moved + "file://" + home.string() + "/v t.txt\r\n\r\n";
    server.answers["GET /a/loop"] = server.answers["POST /loop"] = moved + "/a/loop\r\n\r\n";
    server.answers["POST /none"] = "404 None\r\n\r\nx=no";
    EXPECT_EQ("-allowed", Ask(server.base + "a/v") + server.last);
    player.AllowNet();
    EXPECT_EQ("1", Ask("v t.txt"));
    std::istringstream cases("moved 3 file -file loop -another none -404 a/v 5");
    for (std::string path, result; cases >> path >> result;)
        EXPECT_EQ(result, Ask(server.base + path, "a=b+c&d=%20"));
    const std::string sent = server.last.substr(server.last.find("Accept"));
    EXPECT_EQ("Accept: */*\r\nContent-type: application/x-www-form-urlencoded\r\n"
              "Content-Length: 11\r\n\r\na=b+c&d=%20",
              sent);
    player.GetURL((server.base + "a/m").c_str(), "_level1", nullptr, 0);
    player.Tick();
    EXPECT_EQ(0, player.layers->curFrame);
    EXPECT_EQ("-folder", Ask("v t.txt")) << "the web could read it";
    EXPECT_EQ("-only", Ask("http://localhost/"));
    EXPECT_EQ("3", Ask(server.base + "a/v"));
    EXPECT_TRUE(player.AllowDir(home) && Ask("v t.txt") == "1");
    // The second and the third take each other's place, whichever comes first, while the first
    // ends.
    const std::string text(movie.begin(), movie.end());
    server.answers["GET /1"] = server.answers["GET /3"] =
        "200 OK\r\nContent-Length: " + std::to_string(text.size()) + "\r\n\r\n" + text;
    server.answers["GET /2"] = "200 OK\r\nContent-Length: 999\r\n\r\n" + text.substr(0, 40);
    server.together = 3;
    for (const std::string path : {"1", "2", "3"})
        player.GetURL((server.base + path).c_str(), path == "1" ? "_level1" : "_level2", nullptr,
                      0);
    player.Deliver();
    EXPECT_TRUE(FindLayer(player.layers, 1)->Complete() && FindLayer(player.layers, 2)->gotHeader);
}

} // namespace
