#include "tools/vexel/player_state.h"

#include "tools/vexel/object_path.h"

#include <algorithm>
#include <cstring>
#include <set>

namespace {

constexpr size_t kLongestName = 127; // that a path can hold

// The name as paths compare it: only ASCII letters fold.
std::string Folded(const char* name)
{
    std::string folded = name;
    for (char& c : folded)
        c = c >= 'A' && c <= 'Z' ? static_cast<char>(c - 'A' + 'a') : c;
    return folded;
}

// A path can hold the name: it is none of the words that mean something else there.
bool FitsPath(const char* name, const std::string& parent)
{
    if (name == nullptr || name[0] == 0 || std::strlen(name) > kLongestName)
        return false;
    if (std::strchr(name, '/') != nullptr || std::strcmp(name, "..") == 0)
        return false;
    return parent != "/" || LayerNum(name) < 0;
}

// Rounds down below zero too.
S32 FloorDiv(S64 n, int d)
{
    return static_cast<S32>((n < 0 ? n - d + 1 : n) / d);
}

SRECT BoundsOf(const SObject* object)
{
    SRECT bounds = object->devBounds;
    for (const SObject* child = object->bottomChild; child != nullptr; child = child->above) {
        const SRECT inner = BoundsOf(child);
        if (!RectIsEmpty(&inner))
            RectUnion(&bounds, &inner, &bounds);
    }
    return bounds;
}

} // namespace

bool StateNode::IsButton() const
{
    return Character() != nullptr && Character()->type == kCharButton;
}

const char* StateNode::Type() const
{
    if (level >= 0)
        return "movie";
    if (Character() == nullptr)
        return nullptr;
    switch (Character()->type) {
    case kCharShape:
        return "shape";
    case kCharBitmap:
        return "bitmap";
    case kCharButton:
        return "button";
    case kCharFont:
        return "font";
    case kCharText:
        return "text";
    case kCharSound:
        return "sound";
    case kCharSprite:
        return "sprite";
    case kCharMorphShape:
        return "morph";
    case kCharEditText:
        return "edit";
    case kCharLoadedMovie:
    case kCharMovieRoot:
        return "movie";
    default:
        return nullptr;
    }
}

int StateNode::CharacterId() const
{
    const SCharacter* character = Character();
    const bool known = Type() != nullptr && character != nullptr;
    return known && character->tag < kIdFirstReserved ? character->tag : -1;
}

const char* StateNode::ButtonState() const
{
    constexpr const char* kStates[] = {"none", "up", "over", "down", "outside"};
    return kStates[object->state < 5 ? object->state : 0];
}

SRECT StateNode::Bounds(int units) const
{
    SRECT bounds;
    RectSetEmpty(&bounds);
    if (object != nullptr)
        bounds = BoundsOf(object);
    if (RectIsEmpty(&bounds) || units == 1)
        return bounds;
    return {FloorDiv(bounds.xmin, units), -FloorDiv(-S64(bounds.xmax), units),
            FloorDiv(bounds.ymin, units), -FloorDiv(-S64(bounds.ymax), units)};
}

// A path leads to the first child of a name that has a timeline, and through timelines only.
std::vector<StateNode> StateNode::Children() const
{
    std::vector<StateNode> children;
    std::set<std::string> names;
    const SObject* child = object != nullptr ? object->bottomChild : nullptr;
    for (; child != nullptr; child = child->above) {
        ScriptThread* thread = child->OwnsThread() ? child->thread : nullptr;
        StateNode node = {child, thread, -1, ""};
        if (thread != nullptr && !path.empty() && FitsPath(child->name, path) &&
            names.insert(Folded(child->name)).second)
            node.path = JoinPath(path, child->name);
        children.push_back(std::move(node));
    }
    return children;
}

std::vector<StateNode> LevelsOf(SPlayer* player)
{
    std::vector<StateNode> levels = {{player->rootObject, player, 0, LevelPath(0)}};
    for (ScriptPlayer* movie = player->layers; movie != nullptr; movie = movie->nextLayer)
        levels.push_back({movie->rootObject, movie, movie->layerNum, LevelPath(movie->layerNum)});
    std::sort(levels.begin(), levels.end(),
              [](const StateNode& a, const StateNode& b) { return a.level < b.level; });
    return levels;
}

const char* LevelUrl(const StateNode& level)
{
    const char* url = static_cast<ScriptPlayer*>(level.timeline)->sourceName;
    return url != nullptr ? url : "";
}

std::string FocusPath(const SPlayer& player)
{
    const SObject* text = player.focusText.Get();
    const SObject* focused = text != nullptr ? text : player.buttonFocus.object.Get();
    if (focused == nullptr)
        return "";
    const std::string path = TimelinePath(focused);
    const bool named = focused->name != nullptr && focused->name[0] != 0;
    return named && !focused->OwnsThread() ? JoinPath(path, focused->name) : path;
}

const char* QualityName(const SPlayer& player)
{
    if (!player.highQuality)
        return "low";
    return player.bestQuality ? "best" : "high";
}

int UnitsPerPixel(const SPlayer& player)
{
    return player.scene.antialias ? 4 : 1;
}
