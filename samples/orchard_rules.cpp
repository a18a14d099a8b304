#include "samples/orchard.h"
#include "tests/support/script_writer.h"

// What the game does. The timeline /game counts the time and lets apples go; each apple is a clone
// of /apple with a timeline of its own, in which it falls. The root has what outlives both: length
// (of a game, ms), playing, score, caught, missed and best.

namespace orchard {

const char* const kShowDigits = R"(
    "tens" "count" GetVariable 10 Divide ToInteger SetVariable
    "where" GetVariable "/tens:" StringAdd "tens" GetVariable 1 Add StringAdd GotoFrameExpr 0
    "ones" "count" GetVariable "tens" GetVariable 10 Multiply Subtract SetVariable
    "where" GetVariable "/ones:" StringAdd "ones" GetVariable 1 Add StringAdd GotoFrameExpr 0
)";

const char* TitleScript()
{
    return R"(Stop "length" 30000 SetVariable "playing" 0 SetVariable)";
}

const char* BeginScript()
{
    return R"(GotoLabel "play")";
}

const char* OverScript()
{
    return R"(
        Stop "playing" 0 SetVariable
        EndDrag StopSounds
        GetURL "orchard_end.vxm" "_level1"
    )";
}

// The level of the button goes with the last record.
const char* AgainScript()
{
    return R"(SetTarget "_level0" GotoLabel "play" GetURL "" "_level1")";
}

const char* EndScript()
{
    return R"(
        Stop
        "score" "_level0:score" GetVariable SetVariable
        "score" GetVariable "_level0:best" GetVariable Less If known
          "_level0:best" "score" GetVariable SetVariable
      known:
        "where" "/board/score" SetVariable "count" "score" GetVariable SetVariable
        "digits" CallFrame
        "where" "/board/best" SetVariable "count" "_level0:best" GetVariable SetVariable
        "digits" CallFrame
        "/board/verdict:" 1 "score" GetVariable 12 Less Not Add "score" GetVariable 24 Less Not Add
        "score" GetVariable 36 Less Not Add StringAdd GotoFrameExpr 0
    )";
}

std::string KeyScript(int step)
{
    return R"(
        "playing" GetVariable Not If done
        "x" "/basket" 0 GetProperty )" +
           std::to_string(step) + R"( Add SetVariable
        44 "x" GetVariable Less If right
          "x" 44 SetVariable
      right:
        "x" GetVariable 596 Less If inside
          "x" 596 SetVariable
      inside:
        "/basket" 0 "x" GetVariable SetProperty
      done:
        <00>
    )";
}

static const char* const kStart = R"(
    "/:playing" 1 SetVariable
    "/:score" 0 SetVariable
    "/:caught" 0 SetVariable
    "/:missed" 0 SetVariable
    "started" GetTime SetVariable
    "next" 400 SetVariable
    "number" 0 SetVariable
    "quarter" -1 SetVariable
    "/basket/body/heap:1" GotoFrameExpr 0
    44 414 596 414 1 1 "/basket" StartDrag
    "score" CallFrame
)";

static const char* const kTick = R"(
    "now" GetTime "started" GetVariable Subtract SetVariable
    "clock" CallFrame
    "now" GetVariable "/:length" GetVariable Less If going
      SetTarget "/" GotoLabel "over" Jump done
  going:
    "now" GetVariable "next" GetVariable Less If done
      "spawn" CallFrame
  done:
)";

// The light changes four times a second, which is enough.
static const char* const kClock = R"(
    "was" "quarter" GetVariable SetVariable
    "quarter" "now" GetVariable 250 Divide ToInteger SetVariable
    "was" GetVariable "quarter" GetVariable Equals If done
    "where" "/clock" SetVariable
    "count" "/:length" GetVariable "now" GetVariable Subtract 999 Add 1000 Divide ToInteger
    SetVariable
    "digits" CallFrame
    "dark" "quarter" GetVariable 25000 Multiply "/:length" GetVariable Divide SetVariable
    "night" "dark" GetVariable 50 Subtract 2 Multiply SetVariable
    0 "night" GetVariable Less If late
      "night" 0 SetVariable
  late:
    "/sun" 1 "dark" GetVariable 1.15 Multiply 186 Add SetProperty
    "/dusk" 6 "dark" GetVariable SetProperty
    "/night" 6 "night" GetVariable SetProperty
    "/moon" 1 330 "night" GetVariable 1.5 Multiply Subtract SetProperty
    "/shade" 6 "dark" GetVariable "dark" GetVariable Multiply 100 Divide SetProperty
    "/lamps" 6 "night" GetVariable SetProperty
    "/glow" 6 "dark" GetVariable SetProperty
    "/fireflies" 6 "night" GetVariable SetProperty
  done:
)";

// One more apple: where, how fast, and of what kind. They come quicker as the light goes.
static const char* const kSpawn = R"(
    "next" "now" GetVariable 850 Add 500 RandomNumber Add "now" GetVariable 60 Divide Subtract
    SetVariable
    "number" "number" GetVariable 1 Add SetVariable
    "path" "apple" "number" GetVariable StringAdd SetVariable
    "/apple" "path" GetVariable 16384 "number" GetVariable Add CloneSprite
    "path" "/" "path" GetVariable StringAdd SetVariable
    "path" GetVariable 0 480 RandomNumber 80 Add SetProperty
    "path" GetVariable 1 32 RandomNumber 82 Add SetProperty
    "path" GetVariable ":speed" StringAdd
    "now" GetVariable 12000 Divide 20 RandomNumber 10 Divide Add SetVariable
    "path" GetVariable ":spin" StringAdd 9 RandomNumber 4 Subtract SetVariable
    "kind" 2 RandomNumber SetVariable
    7 RandomNumber If common
      "kind" 2 SetVariable
  common:
    "path" GetVariable ":worth" StringAdd "kind" GetVariable 2 Equals 4 Multiply 1 Add SetVariable
    "path" GetVariable "/skin:" StringAdd "kind" GetVariable 1 Add StringAdd GotoFrameExpr 0
)";

static const char* const kScore = R"(
    "where" "/score" SetVariable
    "count" "/:score" GetVariable SetVariable
    "count" GetVariable 100 Less If fits
      "count" 99 SetVariable
  fits:
    "digits" CallFrame
)";

// The apple has put its worth into the root.
static const char* const kCaught = R"(
    "/:caught" "/:caught" GetVariable 1 Add SetVariable
    "/:score" "/:score" GetVariable "/:worth" GetVariable Add SetVariable
    "heap" "/:caught" GetVariable 2 Divide ToInteger 2 Add SetVariable
    "heap" GetVariable 8 Less If fits
      "heap" 8 SetVariable
  fits:
    "/basket/body/heap:" "heap" GetVariable StringAdd GotoFrameExpr 0
    SetTarget "/basket/body" GotoLabel "bump" Play SetTarget ""
    "score" CallFrame
)";

static const char* const kMissed = R"("/:missed" "/:missed" GetVariable 1 Add SetVariable)";

// Playing goes from the third frame back to the second, for ever.
TagWriter GameTimeline()
{
    TagWriter game;
    game.DoAction(AssembleScript(kStart)).Show();
    game.DoAction(AssembleScript(kTick)).Show();
    game.DoAction(AssembleScript("GotoFrame 1 Play")).Show();
    const std::pair<const char*, const char*> routines[] = {
        {"clock", kClock},   {"spawn", kSpawn},   {"score", kScore},
        {"caught", kCaught}, {"missed", kMissed}, {"digits", kShowDigits}};
    for (const auto& [label, script] : routines)
        game.Label(label).DoAction(AssembleScript(script)).Show();
    return game.End();
}

static const char* const kHang = R"(
    "" 13 GetProperty "apple" StringEquals Not If clone
      Stop
  clone:
)";

static const char* const kFall = R"(
    "speed" "speed" GetVariable 0.42 Add SetVariable
    "y" "" 1 GetProperty "speed" GetVariable Add SetVariable
    "" 1 "y" GetVariable SetProperty
    "" 10 "" 10 GetProperty "spin" GetVariable Add SetProperty
    "y" GetVariable 452 Less If above
      "" 1 452 SetProperty "" 10 0 SetProperty
      "/game:missed" CallFrame
      GotoLabel "rest" Play Jump done
  above:
    "/:playing" GetVariable 402 "y" GetVariable Less And "y" GetVariable 432 Less And Not If done
    "off" "" 0 GetProperty "/basket" 0 GetProperty Subtract SetVariable
    -46 "off" GetVariable Less "off" GetVariable 46 Less And Not If done
      "" 10 0 SetProperty
      "/:worth" "worth" GetVariable SetVariable
      "/game:caught" CallFrame
      "worth" GetVariable 5 Equals If golden
      GotoLabel "caught" Play Jump done
  golden:
      GotoLabel "golden" Play
  done:
)";

static TagWriter& StartSound(TagWriter& timeline, U16 id)
{
    return timeline.Raw(kTagStartSound, ByteWriter().PutU16(id).PutU8(0));
}

// What is left of a caught apple: its worth, rising.
static void Pop(TagWriter& apple, Stage& stage, const char* label, U16 sound, U16 pop)
{
    constexpr int kPopFrames = 14;
    stage.Drop(1);
    stage.Drop(2);
    StartSound(apple.Label(label), sound);
    for (int i = 0; i < kPopFrames; i++) {
        double t = i / double(kPopFrames - 1), size = 0.5 + 0.6 * Ease(0, 0.3, t);
        stage.Put(2, pop, Pose(0, -16 - 44 * t, size, size), Cx::Alpha(1 - Ease(0.55, 1, t)));
        stage.Next();
    }
    apple.DoAction(AssembleScript(R"("" RemoveSprite)"));
    stage.Next();
}

// The skin is named and stays the same through all frames, so it keeps the frame that it was given.
TagWriter AppleTimeline()
{
    TagWriter apple;
    apple.Place2(1, {.character = kSkins, .matrix = Mat::Scale(0.1), .name = "skin"});
    apple.DoAction(AssembleScript(kHang)).Show();
    for (int i = 1; i <= 7; i++)
        apple.Move(1, Mat::Scale(Ease(0, 7, i))).Show();
    for (double angle : {8.0, 12.0, 4.0, -8.0, -12.0, -4.0, 6.0, 0.0})
        apple.Move(1, Mat::Rotate(angle)).Show();
    const std::string fall = std::to_string(apple.Frames());
    apple.Label("fall").DoAction(AssembleScript(kFall)).Show();
    apple.DoAction(AssembleScript("GotoFrame " + fall + " Play")).Show();

    StartSound(apple.Label("rest"), kMissSound);
    constexpr int kRestFrames = 22;
    for (int i = 0; i < kRestFrames; i++) {
        double t = i / double(kRestFrames), hop = t < 0.4 ? Turns(t / 0.8) : 0;
        double squash = i < 2 ? 0.8 : 1;
        Mat mat = Pose(10 * Ease(0, 0.6, t), -13 * hop, 1, squash, 70 * Ease(0, 0.6, t));
        apple.Move(1, mat, Cx::Alpha(1 - Ease(0.6, 1, t))).Show();
    }
    apple.DoAction(AssembleScript(R"("" RemoveSprite)")).Show().RemoveDepth(1);

    Stage stage(apple);
    Pop(apple, stage, "caught", kCatchSound, kPopOne);
    Pop(apple, stage, "golden", kGoldSound, kPopFive);
    return apple.End();
}

} // namespace orchard
