// What scripts and input do to a movie, as the program tells it.
#include "core/text/field_record.h"
#include "tests/support/glyph_writer.h"
#include "tests/support/script_writer.h"
#include "tests/tools/tool.h"

namespace {

using Bytes = std::vector<U8>;

// log = log + letter
Bytes Log(const std::string& letter)
{
    return AssembleScript("\"log\" \"log\" GetVariable \"" + letter +
                          "\" StringAdd SetVariable <00>");
}

// A button of 10 pixels at (20, 20) inside "Pad", seen while it is up or down, which notes what
// happens to it. The actions of the frame jump over bytes that are no records.
Bytes PadMovie()
{
    MovieWriter movie(100 * 20, 80 * 20, Fps(10));
    movie.Background({1, 2, 255, 255}).DefineShape(1, Square());
    const U16 press = 4 | 65 << 9;
    movie.DefineButton(2, kTagDefineButton2, {{0x0D, 1, 1}},
                       {{1, Log("o")}, {press, Log("p")}, {16, Log("x")}, {64, Log("r")}});
    TagWriter pad;
    pad.Place(2, 3).Show(2).End();
    movie.DefineSprite(3, pad).DefineButton(4, kTagDefineButton, {{0x01, 1, 1}}, {{0, {0x07, 0}}});
    PlaceOptions named = {.character = U16(3), .matrix = Mat::Translate(400, 400)};
    named.name = "Pad";
    movie.Place2(1, named);
    named.matrix = Mat::Translate(0, 1000);
    movie.Place2(5, named).Place(4, 9, Mat::Translate(800, -20));
    movie.DoAction(AssembleScript("Jump on <55 96 09 09> on: \"pad:n\" 0.5 SetVariable "
                                  "<9D 03 00 00 70 00> If -28 <00 96 09>"));
    movie.Show(9).End();
    return movie.Bytes();
}

void ExpectInOrder(const std::string& text, const std::vector<std::string>& parts)
{
    size_t at = 0;
    for (const std::string& part : parts) {
        at = text.find(part, at);
        ASSERT_NE(std::string::npos, at) << part << "\nis not in\n" << text;
        at += part.size();
    }
}

TEST_F(Tool, RefusesWrongEventsByTheirLine)
{
    Write("../m", PadMovie());
    const std::pair<std::string, const char*> cases[] = {
        {"# all\\r\\n\\n1 move 1 2 # here\\n0 move 1 2", "line 4: an event begins with"},
        {"1 click 1 2", "line 1: an event is one of move, down"},
        {"1 up 1", "line 1: the pointer needs X Y"},
        {"1 up -1 2 3", "line 1: nothing is expected before 3"},
        {"1 key 13 shift meta", "not with meta"},
        {"1 text \\tx", "line 1: no key is the character 9"}};
    for (const auto& [events, said] : cases)
        for (const char* words : {"state ../m --input ../e", "render ../m -o x.png --input ../e"}) {
            const Outcome outcome = Shell("printf '" + events + "' >../e; $vexel " + words);
            EXPECT_EQ(2, outcome.code) << events;
            EXPECT_EQ("", outcome.out + Files()) << events;
            ExpectInOrder(outcome.err, {"vexel: ../e: ", said, "\n"});
        }
    EXPECT_EQ(3, Run("state ../m --input none").code);
}

// Press, drag off, release outside; press again and release; then keys. What the states say the
// pictures show.
TEST_F(Tool, FollowsInput)
{
    Write("../m", PadMovie());
    Shell("printf '3 up 60 60\\n1 down 25 25\\n2 move 60 60 # off\\n4 move 25 25\\n5 down 25 25\\n"
          "5 up 29 29\\n6 text A # A\\n' >../e");
    const std::pair<const char*, const char*> notes[] = {
        {"op", "down"}, {"opx", "outside"}, {"opxr", "up"}, {"opxro", "over"}, {"opxrop", "over"}};
    EXPECT_EQ(0, Run("render ../m --input ../e -o %d.png --frames 1-5").code);
    for (int n = 1; n <= 5; n++) {
        const auto& [log, state] = notes[n - 1];
        ExpectInOrder(Run("state ../m --input ../e --frame " + std::to_string(n)).out,
                      {"picture     " + std::to_string(n) + "\n", "\n      1 sprite id=3 ",
                       std::string("\"log\" = \"") + log + "\"\n",
                       std::string(" button id=2 state=") + state});
        EXPECT_EQ(n == 1 || n == 3, Load(std::to_string(n) + ".png").At(25, 25) == 0xFFC81E1Eu);
    }
    ExpectInOrder(Run("state ../m --input ../e --frame 6").out, {"\"opxroppp\"", "\"pp\""});
}

TEST_F(Tool, TellsTheStateAsJson)
{
    Write("../m", PadMovie());
    const std::string cx = R"("cxform":{"mul":[256,256,256,256],"add":[0,0,0,0]},)"
                           R"("ratio":0,"clipDepth":0,"visible":true,"bounds":)";
    const std::string in = R"("matrix":[65536,0,0,65536,0,0],)" + cx;
    const std::string pad = R"("type":"sprite","character":3,"matrix":[65536,0,0,65536,)";
    const std::string frame = R"("frame":2,"frames":2,"playing":true,"variables":)";
    const std::string child = R"("children":[{"name":null,"path":null,"depth":)";
    ExpectInOrder(
        Run("state ../m --frame 2 --json").out,
        {R"({"schema":1,"picture":2,"frame":2,"frames":9,"playing":true,"size":[100,80],)"
         R"("background":"#0102ff","quality":"high","levels":[{"name":null,"path":"/","depth":0,)"
         R"("type":"movie","character":null,)" +
             in + R"([0,-1,50,60],"level":0,"url":")",
         R"("frame":2,"frames":9,"playing":true,"variables":{"$version":")",
         R"("},"children":[{"name":"Pad","path":"/Pad","depth":1,)" + pad + "400,400]," + cx +
             "[20,20,30,30]," + frame + R"({"n":"0.5"},)" + child +
             R"(3,"type":"button","character":2,)" + in + R"([20,20,30,30],"state":"up",)" + child +
             R"(4,"type":"shape","character":1,)" + in + R"([20,20,30,30],"children":[]}]}]})" +
             R"(,{"name":"Pad","path":null,"depth":5,)" + pad + "0,1000]," + cx + "[0,50,10,60]," +
             frame + "{},",
         "\"depth\":9,\"type\":\"button\"", "]}]}],\"focus\":null,\"requests\":[]}\n"});
}

// Typed at the first line's start; then the second line is selected from its end, the one in view.
TEST_F(Tool, TellsWhatFieldsHold)
{
    FieldText field = {{0, 2000, 0, 560}, kFieldFont | kFieldMultiline | kFieldText};
    field.variable = "v", field.text = "one\rtw\xE9\rthree";
    MovieWriter movie(4000, 2000);
    movie.Raw(kTagDefineEditText, FieldBody(2, field)).Place2(1, {.character = 2, .name = "f"});
    Write("../m", (movie.Show(4).End(), movie.Bytes()));
    Shell("printf '2 down 3 5\\n2 up 3 5\\n2 text x\xC3\xA9\xE2\x82\xAC\xE9\xC3\\n2 key 15\\n2 key "
          "4\\n2 key 3 shift' >../e");
    ExpectInOrder(Run("state ../m --frame 2 --input ../e").out,
                  {R"("/f")", R"("v" = "x\xe9?\xe9\xc3one\x0dtw\xe9\x0dthree")",
                   R"(text="x\xe9?\xe9\xc3one\x0dtw\xe9\x0dthree" scroll=2/3 selection=12,9)"});
    ExpectInOrder(
        Run("state ../m --frame 2 --input ../e --json").out,
        {R"("text":"x\u00e9?\u00e9\u00c3one\u000dtw\u00e9\u000dthree","scroll":2,"maxscroll":3,"selection":[12,9],)"});
    ExpectInOrder(Run("dump ../m").out, {R"(bounds=0,2000,0,560 flags=0x00a1 font=1 height=400 )"
                                         R"(variable="v" text="one\x0dtw\xe9\x0dthree")"});
}

TEST_F(Tool, SignsTheBookByAFile)
{
    const std::string form = VEXEL_SOURCE_DIR "/samples/form.";
    ExpectInOrder(Run("state " + form + "vxm --frame 14 --input " + form + "txt").out,
                  {"frame=2/2 stopped", "edit id=39 text=\"Ada Lovelace\"", "post \"file://",
                   "/samples/guestbook\" window=\"/desk\" data=\"name=Ada+Lovelace&guests=12&"
                   "password=s3cret&message=Clouds+until+ten%2E+Then%0DSaturn%2C+wide+open%2E\""});
}

TEST_F(Tool, ListsAndTracesActions)
{
    Write("../m", PadMovie());
    ExpectInOrder(
        Run("dump ../m").out,
        {" id=2\n            part up,down,hit id=1 layer=1 matrix=identity cxform=r*256",
         "\n      72    on idle-over\n      76      Push \"log\"\n      84      Push \"",
         "     100      SetVariable\n     101      End\n     102    on over-down key=65\n",
         " id=4\n            part up id=1 layer=1 matrix=identity\n     222    Stop\n",
         "     266    Jump -> 275\n     271    Action0x55\n     272    data: 3 bytes\n"
         "     275    Push \"pad:n\"\n     285    Push 0.5\n     293    SetVariable\n"
         "     294    If -> 28972 unused=1 (outside)\n     300    If -> 277 (no record)\n"
         "     305    End\n     306    incomplete: 2 bytes\n"});
    Shell("printf '2 move 25 25' >../e");
    for (const char* words : {"state ../m --frame 2", "render ../m --frame 2 -o x.png"})
        ExpectInOrder(Run(std::string(words) + " --input ../e --trace").err,
                      {"trace: 1 / 266 Jump -> 275 stack=0\ntrace: 1 / 275 Push \"pad:n\" stack=0\n"
                       "trace: 1 / 285 Push 0.5 stack=1 top=\"pad:n\"\n",
                       "\ntrace: 2 /Pad 99 StringAdd stack=3 top=\"o\"\n"});
}

// A script that asks how much is there gets an answer that no picture asked for decides, and a
// movie that takes itself away leaves pictures behind. What it asks for is around it, or noted.
TEST_F(Tool, PlaysLoadersAndLeavers)
{
    MovieWriter loader(200, 200);
    loader.DoAction(AssembleScript("WaitForFrame 2 3 \"in\" \"yes\" SetVariable")).Show();
    loader.DoAction(AssembleScript("GotoFrame 0 Play")).Show();
    loader.Raw(500, Bytes(300000)).Show().End();
    Write("../loader", loader.Bytes());
    for (const char* line :
         {"$vexel state ../loader --frame 3", "cat ../loader | $vexel state - --frame 3"})
        ExpectInOrder(Shell(line).out, {"\"in\" = \"yes\"\n"});
    MovieWriter leaver(200, 200);
    leaver.DoAction(AssembleScript("GetURL \"FSCommand:go\" \"now\" \"v.txt\" \"_level0\" "
                                   "GetURLExpr 128 GetURL \"p.html\" \"_blank\""));
    leaver.DefineShape(1, Square()).Place(1, 1).Show(2);
    leaver.DoAction(AssembleScript("GetURL \"\" \"_level0\"")).Show(3).End();
    Write("../leaver", leaver.Bytes());
    Write("../v.txt", {'x', '=', '7'});
    const std::string none = R"("data":"","command":"","args":""},)";
    ExpectInOrder(Run("state ../leaver --frame 2 --json").out,
                  {R"("variables":{)", R"("x":"7"})",
                   R"("requests":[{"kind":"fscommand","url":"","window":"","data":"",)"
                   R"("command":"go","args":"now"},{"kind":"url","url":"file:///tmp/vexel-test-)",
                   R"(/v.txt","window":"_level0",)" + none + R"({"kind":"url","url":"file:///)",
                   R"(/p.html","window":"_blank",)"});
    // From a folder below the file lies outside, until it is allowed.
    MovieWriter asker(200, 200);
    asker.DoAction(AssembleScript("\"../v.txt\" \"_level0\" GetURLExpr 128")).Show(3).End();
    std::filesystem::create_directory(folder + "../in");
    Write("../in/asker", asker.Bytes());
    const Outcome refused = Run("state ../in/asker --frame 2");
    EXPECT_TRUE(refused.code == 0 && refused.out.find("\"x\"") == std::string::npos);
    ExpectInOrder(refused.err, {"v.txt: refused"});
    ExpectInOrder(Run("state ../in/asker --frame 2 --allow-dir ..").out, {"\"x\" = \"7\"\n"});
    EXPECT_EQ(0, Run("render ../leaver -o %d.png").code);
    EXPECT_EQ("1.png 2.png 3.png 4.png 5.png", Files());
    EXPECT_EQ(0xFFC81E1Eu, Load("2.png").At(5, 5));
    ExpectInOrder(Run("state ../leaver --frame 9 --json").out,
                  {R"("frame":0,)", R"("bounds":null,"level":0)", R"("children":[]}],"focus")"});
}

} // namespace
