#include "samples/viaduct.h"

// The main timeline: the course of the light, and where everything stands under it.

namespace viaduct {

// What time it is: how far dusk, dawn and night have come, 0..1 each.
struct Light {
    double t, dusk, night;

    // The light changes on every other frame only, which nobody sees and halves the movie.
    explicit Light(int frame)
        : t((frame & ~1) / double(kFrames)), dusk(Bump(0.38, 0.17, t) + 0.75 * Bump(0.9, 0.1, t)),
          night(Ease(0.38, 0.52, t) * (1 - Ease(0.82, 0.95, t)))
    {
    }

    // How the light falls on a thing: 1 takes it all, less keeps some of the thing's own colour.
    Cx On(double share) const
    {
        auto channel = [&](double atDusk, double atNight) {
            double lit = Blend(Blend(1, atDusk, dusk), atNight, night);
            return RoundSteadily(256 * Blend(1, lit, share));
        };
        return Cx::Multiply(channel(0.98, 0.22), channel(0.72, 0.30), channel(0.74, 0.52));
    }
};

// The mirror image in the lake of something that stands at `line`.
static Mat Mirrored(const Mat& mat, double line)
{
    return mat.Then(At(0, -line)).Then(Mat::Scale(1, -0.72)).Then(At(0, line));
}

static Spot SunPlace(double t)
{
    if (t > 0.84) { // it comes up in the east, quickly, to where the day begins
        double u = Ease(0.84, 1.02, t);
        return {Blend(40, 120, u), Blend(330, 74, u)};
    }
    double u = t / 0.5;
    return {Blend(120, 330, u), 74 + 256 * u * u};
}

static Spot MoonPlace(double t)
{
    double u = (t - 0.44) / 0.46, side = 2 * u - 1;
    return {Blend(120, 600, u), 76 + 250 * side * side};
}

static void PlaceSky(Stage& stage, const Light& light)
{
    stage.Put(1, kSkyDay, Mat());
    stage.Put(2, kSkyDusk, Mat(), Cx::Alpha(light.dusk));
    stage.Put(3, kSkyNight, Mat(), Cx::Alpha(light.night));
    stage.Put(4, kStars, Mat(), Cx::Alpha(light.night));
    Spot sun = SunPlace(light.t), moon = MoonPlace(light.t);
    bool isUp = light.t < 0.5 || light.t > 0.84, moonUp = light.t > 0.44 && light.t < 0.9;
    if (isUp)
        stage.Put(5, kSun, At(sun.x, sun.y),
                  Cx::Multiply(256, RoundSteadily(256 - 70 * light.dusk),
                               RoundSteadily(256 - 150 * light.dusk)));
    else
        stage.Drop(5);
    if (moonUp)
        stage.Put(6, kMoon, At(moon.x, moon.y));
    else
        stage.Drop(6);

    double show = 1 - light.night, drift = light.t < 0.66 ? light.t : light.t - 1;
    Cx paint = light.On(0.9);
    paint.mul[3] = RoundSteadily(256 * show);
    stage.Put(7, kCloud, At(210 + 130 * drift, 96), paint);
    stage.Put(8, kCloud, Pose(396 + 80 * drift, 58, -0.7, 0.6), paint);
    stage.Put(9, kCloud, Pose(560 + 170 * drift, 150, 0.8, 0.55), paint);
    if (light.t < 0.4)
        stage.Put(10, kFlock, Pose(90 + 1450 * light.t, 150 - 190 * light.t, 1, 1, -6));
    else
        stage.Drop(10);
}

static void PlaceLake(Stage& stage, const Light& light, const Mat& train, const Mat& boat)
{
    Spot sun = SunPlace(light.t), moon = MoonPlace(light.t);
    stage.Put(20, kWaterMask, Mat(), Cx(), 39);
    Mat sky = Mirrored(Mat(), kShore);
    stage.Put(21, kSkyDay, sky);
    stage.Put(22, kSkyDusk, sky, Cx::Alpha(light.dusk));
    stage.Put(23, kSkyNight, sky, Cx::Alpha(light.night));
    stage.Put(24, kPeaks, sky, light.On(0.85));
    stage.Put(25, kHills, sky, light.On(1));
    stage.Put(26, kShoreLights, sky, Cx::Alpha(light.night));
    if (light.t < 0.44 || light.t >= 0.9)
        stage.Put(27, kStreak, At(sun.x, 400),
                  Cx{{256, 220, 160, RoundSteadily(60 + 190 * light.dusk)}, {}});
    else
        stage.Put(27, kStreak, At(moon.x, 400),
                  Cx{{200, 220, 256, RoundSteadily(200 * light.night)}, {}});
    stage.Put(28, kBridge, Mirrored(Mat(), kFoot), light.On(1));
    stage.Put(29, kTrain, Mirrored(train, kFoot), light.On(0.9));
    stage.Put(30, kTrainLights, Mirrored(train, kFoot), Cx::Alpha(light.night));
    stage.Put(31, kBoat, Mirrored(boat, 424), light.On(1));
    stage.Put(32, kWaterDay, Mat(), Cx::Alpha(1 - light.night));
    stage.Put(33, kWaterDusk, Mat(), Cx::Alpha(light.dusk));
    stage.Put(34, kWaterNight, Mat(), Cx::Alpha(light.night));
    stage.Put(35, kRipples, Mat(), Cx::Alpha(1 - 0.5 * light.night));
}

static void PlaceScene(Stage& stage, int frame)
{
    Light light(frame);
    double lamp = light.night, t = frame / double(kFrames);
    Mat train = At(-10 + 1060 * t, kRail - 1), boat = At(150 + 60 * Turns(t), 424);
    PlaceSky(stage, light);
    stage.Put(11, kPeaks, Mat(), light.On(0.85));
    stage.Put(12, kHills, Mat(), light.On(1));
    stage.Put(13, kShoreLights, Mat(), Cx::Alpha(lamp));
    PlaceLake(stage, light, train, boat);
    Spot balloon{486 + 46 * Turns(t), 118 + 16 * Turns(2 * t + 0.1)};
    stage.Put(40, kBalloon, At(balloon.x, balloon.y), light.On(0.55));
    stage.Put(41, kBridge, Mat(), light.On(1));
    stage.Put(42, kTrain, train, light.On(0.9));
    stage.Put(43, kTrainLights, train, Cx::Alpha(lamp));
    stage.Put(44, kBoat, boat, light.On(1));
    stage.Put(45, kLantern, boat.Then(At(-27, -16)), Cx::Alpha(lamp));
    stage.Put(46, kBank, Mat(), light.On(1));
    stage.Put(47, kReeds, Mat(), light.On(1));
    stage.Put(48, kFireflies, Mat(), Cx::Alpha(lamp));
}

} // namespace viaduct

std::vector<U8> MakeViaduct()
{
    using namespace viaduct;
    MovieWriter movie(640 * 20, 480 * 20, Fps(24));
    movie.Background(Hex(0x9fc6e0));
    DefineSky(movie);
    DefineLand(movie);
    DefineVessels(movie);
    DefineTrain(movie);
    const std::map<int, const char*> labels = {
        {0, "day"}, {38, "dusk"}, {62, "night"}, {102, "dawn"}};
    Stage stage(movie);
    for (int frame = 0; frame < kFrames; frame++) {
        if (labels.count(frame))
            movie.Label(labels.at(frame));
        PlaceScene(stage, frame);
        stage.Next();
    }
    movie.End();
    return movie.Bytes();
}
