// The state of a player in lines for people.
#include "core/display/display_list.h"
#include "core/display/edit_text.h"
#include "tools/vexel/message.h"
#include "tools/vexel/player_state.h"
#include "tools/vexel/text_form.h"

namespace {

std::string QuoteOrNone(const char* text)
{
    return text != nullptr ? Quote(text) : "none";
}

std::string FrameText(const ScriptThread& timeline)
{
    return Format("frame=%d/%d %s", timeline.curFrame + 1, timeline.numFrames,
                  timeline.playing ? "playing" : "stopped");
}

std::string BoundsText(const SRECT& b)
{
    return RectIsEmpty(&b) ? "" : Format(" bounds=%d,%d,%d,%d", b.xmin, b.ymin, b.xmax, b.ymax);
}

// What differs from an object that was just placed, as it is.
std::string PlaceText(const SObject& object)
{
    std::string text;
    if (!MatrixIsIdentity(&object.xform.mat))
        text += " matrix=" + MatrixText(object.xform.mat);
    ColorTransform cx = object.xform.cxform;
    cx.CalcFlags();
    if (cx.flags != 0)
        text += " cxform=" + CxformText(cx);
    if (object.ratio != 0)
        text += Format(" ratio=%u", object.ratio);
    if (object.clipDepth != 0)
        text += Format(" clip=%u", object.clipDepth);
    return object.visible ? text : text + " hidden";
}

std::string FieldState(const EditText& field)
{
    return " text=" + Quote(field.Text()) +
           Format(" scroll=%d/%d selection=%u,%u", field.Scroll(), field.MaxScroll(),
                  field.Anchor(), field.Caret());
}

std::string NodeTitle(const StateNode& node)
{
    const char* type = node.Type();
    if (node.level >= 0)
        return Format("level %d ", node.level) + Quote(LevelUrl(node));
    std::string text = Format("%5u %s", node.object->depth, type != nullptr ? type : "nothing");
    if (node.CharacterId() >= 0)
        text += Format(" id=%d", node.CharacterId());
    if (node.Name() != nullptr)
        text += " name=" + Quote(node.Name());
    return text;
}

void AddNode(const StateNode& node, size_t indent, int units, std::string* text)
{
    *text += std::string(indent, ' ') + NodeTitle(node);
    if (node.timeline != nullptr)
        *text += " " + FrameText(*node.timeline);
    if (node.IsButton())
        (*text += " state=") += node.ButtonState();
    if (node.object != nullptr && node.object->editText != nullptr)
        *text += FieldState(*node.object->editText);
    if (node.object != nullptr)
        *text += PlaceText(*node.object) + BoundsText(node.Bounds(units));
    *text += '\n';
    const SVariable* var = node.timeline != nullptr ? node.timeline->vars : nullptr;
    for (; var != nullptr; var = var->next)
        *text += std::string(indent + 8, ' ') + Quote(var->name) + " = " + QuoteOrNone(var->value) +
                 '\n';
    for (const StateNode& child : node.Children())
        AddNode(child, indent + 2, units, text);
}

std::string RequestText(const HostRequest& request)
{
    if (request.kind == "fscommand")
        return "  fscommand " + Quote(request.command) + " " + Quote(request.args) + '\n';
    std::string text = "  " + request.kind + " " + Quote(request.url);
    text += " window=" + Quote(request.window);
    if (!request.data.empty())
        text += " data=" + Quote(request.data);
    return text + '\n';
}

} // namespace

std::string StateText(NativePlayerWnd* player, int picture)
{
    std::string text = Format("picture     %d\n", picture);
    text += "timeline    " + FrameText(*player) + '\n';
    text += Format("size        %dx%d pixels\n", player->Width(), player->Height());
    text += "background  " + ColorText(player->scene.backgroundColor) + '\n';
    text += Format("quality     %s\n", QualityName(*player));
    const std::string focus = FocusPath(*player);
    text += "focus       " + (focus.empty() ? "none" : Quote(focus)) + '\n';
    for (const StateNode& level : LevelsOf(player))
        AddNode(level, 0, UnitsPerPixel(*player), &text);
    text += "requests\n";
    for (const HostRequest& request : player->Requests())
        text += RequestText(request);
    return text;
}
