#include "samples/form.h"

// The record of a text field, and what the movie does about its fields.

namespace form {

void DefineDeviceFont(TagWriter& movie, U16 id, const std::string& name)
{
    movie.Raw(kTagDefineFont2, Font2Body(id, {}, {name, 0, {}, {}}));
}

void DefineField(TagWriter& movie, U16 id, const TextField& field)
{
    const S32 margin = field.flags & kFieldBorder ? Twips(2) : 0;
    FieldText record = {.box = {0, Twips(field.width), 0, Twips(field.height)},
                        .flags = field.flags | kFieldFont | kFieldColor,
                        .font = field.font,
                        .height = U16(Twips(field.size)),
                        .color = field.color,
                        .maxLen = field.mostLetters,
                        .layout = {field.align, margin, margin, 0, Twips(field.leading)},
                        .variable = field.variable,
                        .text = field.text};
    if (field.mostLetters > 0)
        record.flags |= kFieldMaxLen;
    if (field.align != kTextLeft || margin != 0 || field.leading != 0)
        record.flags |= kFieldLayout;
    if (!field.text.empty())
        record.flags |= kFieldText;
    movie.Raw(kTagDefineEditText, FieldBody(id, record));
}

std::string ScrollScript(int step)
{
    const char* const most = step < 0 ? "1" : R"("/entry:message.maxscroll" GetVariable)";
    return R"("/entry:message.scroll" GetVariable )" + std::string(most) + R"( Equals If end
        "/entry:message.scroll" "/entry:message.scroll" GetVariable )" +
           std::to_string(step) + " Add SetVariable end: <00>";
}

const char* NameChangedScript()
{
    return R"(
        "/desk:note" "" SetVariable
        "name" GetVariable "" StringEquals If nobody
          "/desk:note" "Signed, " "name" GetVariable StringAdd SetVariable
      nobody:
        <00>
    )";
}

std::string MessageChangedScript()
{
    return R"("/desk:count" "message" GetVariable StringLength ")" + kOfMost +
           R"(" StringAdd SetVariable)";
}

const char* SendScript()
{
    return R"(
        "/entry:name" GetVariable "" StringEquals Not If signed
          "/desk:note" "Please sign with your name first." SetVariable
          Jump end
      signed:
        "/desk:reply" "Your page is on its way into the book." SetVariable
        SetTarget "/entry"
        "guestbook" "/desk" GetURLExpr 0xC2 # POST, variables, into a timeline
        SetTarget ""
        GotoLabel "sent"
      end:
        <00>
    )";
}

const char* AgainScript()
{
    return R"(
        "/entry:message" "" SetVariable
        "/entry:password" "" SetVariable
        "/entry:message_changed" CallFrame
        GotoLabel "form"
        <00>
    )";
}

// The thumb of the scroll bar follows whatever scrolls the message, keys too.
std::string DeskScript(double thumbTop, double thumbWay)
{
    return R"(
        "last" "/entry:message.maxscroll" GetVariable SetVariable
        "/thumb" 7 1 "last" GetVariable Less SetProperty
        1 "last" GetVariable Less Not If end
          "/thumb" 1 "/entry:message.scroll" GetVariable 1 Subtract "last" GetVariable 1 Subtract Divide
          )" +
           std::to_string(thumbWay) + " Multiply " + std::to_string(thumbTop) + R"( Add SetProperty
      end:
        <00>
    )";
}

} // namespace form
