#pragma once

#include "samples/scene.h"

// The viaduct scene: a train crosses a lake at dusk, one day in five seconds. Pixels of the 640 by
// 480 stage; the rails run at kRail, the water begins at kShore and the piers stand at kFoot.
namespace viaduct {

constexpr int kFrames = 120;
constexpr double kRail = 252, kShore = 316, kFoot = 352;

enum Id : U16 {
    kSkyDay = 1,
    kSkyDusk,
    kSkyNight,
    kStar,
    kTwinkle,
    kStars,
    kSun,
    kMoon,
    kCloud,
    kPeaks,
    kHills,
    kShoreLights,
    kWaterMask,
    kWaterDay,
    kWaterDusk,
    kWaterNight,
    kStreak,
    kRipple,
    kRipples,
    kBridge,
    kBank,
    kReed,
    kReeds,
    kFirefly,
    kFireflies,
    kWingsUp,
    kWingsDown,
    kBird,
    kFlock,
    kHull,
    kSail,
    kBoat,
    kLantern,
    kEnvelope,
    kBasket,
    kFlame,
    kFlicker,
    kBalloon,
    kWheel,
    kRolling,
    kRod,
    kRods,
    kEngineBody,
    kPuff,
    kSmoke,
    kEngine,
    kCoachBody,
    kCoach,
    kCoachLights,
    kTrain,
    kTrainLights,
    kBeam,
};

void DefineSky(TagWriter& movie);     // heavens, sun, moon, clouds, birds
void DefineLand(TagWriter& movie);    // peaks, hills, water, bridge, bank
void DefineTrain(TagWriter& movie);   // origin: the engine's front, on the rail
void DefineVessels(TagWriter& movie); // balloon and sailing boat

} // namespace viaduct
