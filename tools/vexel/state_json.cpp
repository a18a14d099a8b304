// The state of a player as one JSON object.
#include "core/display/display_list.h"
#include "core/display/edit_text.h"
#include "tools/vexel/json_writer.h"
#include "tools/vexel/player_state.h"
#include "tools/vexel/text_form.h"

namespace {

class StateWriter {
public:
    explicit StateWriter(NativePlayerWnd* nativePlayer) : player(*nativePlayer) {}
    std::string Write(int picture);

private:
    void AddHead(int picture);
    void AddNode(const StateNode& node);
    void AddPlace(const StateNode& node);
    void AddBounds(const StateNode& node);
    void AddOwn(const StateNode& node);
    void AddField(const EditText& field);
    void AddTimeline(const ScriptThread& timeline);
    void AddRequests();
    void StringOrNull(const char* text) { text != nullptr ? json.String(text) : json.Null(); }

    NativePlayerWnd& player;
    JsonWriter json;
};

void StateWriter::AddHead(int picture)
{
    json.Key("schema").Int(1).Key("picture").Int(picture);
    json.Key("frame").Int(player.curFrame + 1).Key("frames").Int(player.numFrames);
    json.Key("playing").Bool(player.playing);
    json.Key("size").BeginArray().Int(player.Width()).Int(player.Height()).EndArray();
    json.Key("background").String(ColorText(player.scene.backgroundColor));
    json.Key("quality").String(QualityName(player));
}

void StateWriter::AddBounds(const StateNode& node)
{
    const SRECT bounds = node.Bounds(UnitsPerPixel(player));
    json.Key("bounds");
    if (RectIsEmpty(&bounds)) {
        json.Null();
        return;
    }
    json.BeginArray().Int(bounds.xmin).Int(bounds.ymin).Int(bounds.xmax).Int(bounds.ymax);
    json.EndArray();
}

void StateWriter::AddPlace(const StateNode& node)
{
    PlaceInfo nowhere; // a level that shows nothing yet lies as if it were at its place
    nowhere.Clear();
    const MATRIX& m = node.object ? node.object->xform.mat : nowhere.mat;
    const ColorTransform& cx = node.object ? node.object->xform.cxform : nowhere.cxform;
    json.Key("matrix").BeginArray();
    for (const S32 value : {m.a, m.b, m.c, m.d, m.tx, m.ty})
        json.Int(value);
    json.EndArray().Key("cxform").BeginObject().Key("mul").BeginArray();
    json.Int(cx.redMul).Int(cx.greenMul).Int(cx.blueMul).Int(cx.alphaMul);
    json.EndArray().Key("add").BeginArray();
    json.Int(cx.redAdd).Int(cx.greenAdd).Int(cx.blueAdd).Int(cx.alphaAdd);
    json.EndArray().EndObject();
    json.Key("ratio").Int(node.object ? node.object->ratio : 0);
    json.Key("clipDepth").Int(node.object ? node.object->clipDepth : 0);
    json.Key("visible").Bool(node.object == nullptr || node.object->visible);
    AddBounds(node);
}

void StateWriter::AddTimeline(const ScriptThread& timeline)
{
    json.Key("frame").Int(timeline.curFrame + 1).Key("frames").Int(timeline.numFrames);
    json.Key("playing").Bool(timeline.playing).Key("variables").BeginObject();
    for (const SVariable* var = timeline.vars; var != nullptr; var = var->next) {
        json.Key(var->name);
        StringOrNull(var->value);
    }
    json.EndObject();
}

void StateWriter::AddField(const EditText& field)
{
    json.Key("text").String(field.Text());
    json.Key("scroll").Int(field.Scroll()).Key("maxscroll").Int(field.MaxScroll());
    json.Key("selection").BeginArray().Int(S32(field.Anchor())).Int(S32(field.Caret())).EndArray();
}

// What only some kinds of nodes have.
void StateWriter::AddOwn(const StateNode& node)
{
    if (node.level >= 0)
        json.Key("level").Int(node.level).Key("url").String(LevelUrl(node));
    if (node.IsButton())
        json.Key("state").String(node.ButtonState());
    if (node.object != nullptr && node.object->editText != nullptr)
        AddField(*node.object->editText);
    if (node.timeline != nullptr)
        AddTimeline(*node.timeline);
}

void StateWriter::AddNode(const StateNode& node)
{
    json.BeginObject().Key("name");
    StringOrNull(node.Name());
    json.Key("path");
    StringOrNull(node.path.empty() ? nullptr : node.path.c_str());
    json.Key("depth").Int(node.object ? node.object->depth : node.level).Key("type");
    StringOrNull(node.Type());
    json.Key("character");
    node.CharacterId() >= 0 ? json.Int(node.CharacterId()) : json.Null();
    AddPlace(node);
    AddOwn(node);
    json.Key("children").BeginArray();
    for (const StateNode& child : node.Children())
        AddNode(child);
    json.EndArray().EndObject();
}

void StateWriter::AddRequests()
{
    json.Key("requests").BeginArray();
    for (const HostRequest& request : player.Requests()) {
        json.BeginObject().Key("kind").String(request.kind).Key("url").String(request.url);
        json.Key("window").String(request.window).Key("data").String(request.data);
        json.Key("command").String(request.command).Key("args").String(request.args);
        json.EndObject();
    }
    json.EndArray();
}

std::string StateWriter::Write(int picture)
{
    json.BeginObject();
    AddHead(picture);
    json.Key("levels").BeginArray();
    for (const StateNode& level : LevelsOf(&player))
        AddNode(level);
    json.EndArray().Key("focus");
    const std::string focus = FocusPath(player);
    StringOrNull(focus.empty() ? nullptr : focus.c_str());
    AddRequests();
    json.EndObject();
    return json.Text();
}

} // namespace

std::string StateJson(NativePlayerWnd* player, int picture)
{
    return StateWriter(player).Write(picture);
}
