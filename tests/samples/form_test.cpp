#include "core/display/edit_text.h"
#include "core/player/stream_data.h"
#include "platform/headless/native_player.h"
#include "samples/scene.h"

#include <gtest/gtest.h>

namespace {

// Somebody who signs the book, and the server that is sent the page. A pixel here is the movie's.
struct Visitor : NativePlayerWnd {
    Visitor() : NativePlayerWnd(480, 360)
    {
        SetMovieFile(VEXEL_SOURCE_DIR "/samples/form.vxm");
        Feed(movie.data(), movie.size());
    }
    void StreamPostURLNotify(const char* to, const char*, U32 length, const char* data,
                             void* notifyData) override
    {
        url = to, sent.assign(data, length), asked = notifyData;
    }
    void Drag(S32 x, S32 y, S32 toX)
    {
        MouseMove(x, y, 0), MouseDown(x, y), MouseMove(toX, y, 1), MouseUp(toX, y);
    }
    void Click(S32 x, S32 y) { Drag(x, y, x); }
    void Type(const std::string& keys)
    {
        for (char key : keys)
            HandleKeyDown(U8(key), 0);
    }
    EditText* Field(const std::string& variable)
    {
        EditText* f = scene.fields.first;
        while (f && f->Record().variable != variable)
            f = f->next;
        return f;
    }
    double Thumb(int property) // once it has followed
    {
        Tick();
        return GetProperty(FindTarget(nullptr, "/thumb"), property);
    }
    const std::vector<U8> movie = MakeForm();
    std::string url, sent;
    void* asked = nullptr;
};

TEST(Form, IsFilledInSentAndFilledInAgain)
{
    Visitor v;
    v.Click(407, 310); // to send an empty page
    EXPECT_STREQ(v.Field("/desk:note")->Text(), "Please sign with your name first.");
    EXPECT_TRUE(v.curFrame == 0 && v.sent.empty() && v.Thumb(7) == 0);

    v.Click(200, 105), v.Type("Ada Lovelace of Ockham Park");
    EXPECT_STREQ(v.Field("/entry:name")->Text(), "Ada Lovelace of Ockham P");
    v.Type(std::string(12, 8));
    EXPECT_STREQ(v.Field("/desk:note")->Text(), "Signed, Ada Lovelace");
    v.Drag(443, 105, 398), v.Type("12"); // over the number that is there
    v.Click(200, 148), v.Type("s3\r=&");
    v.Click(200, 200), v.Type("moon\rmoon\rmoon\rmoon\rmoon\rmoon\rmoon\rmoon\r\xFC & all");
    EXPECT_STREQ(v.Field("/desk:count")->Text(), "47 of 400 letters");

    EditText* message = v.Field("/entry:message");
    ASSERT_EQ(message->MaxScroll(), 5); // five of the nine lines are in view
    EXPECT_TRUE(message->Scroll() == 5 && v.Thumb(7) == 1 && v.Thumb(1) == 199 + 41);
    v.Click(438, 190), v.Click(438, 190);
    EXPECT_TRUE(message->Scroll() == 3 && v.Thumb(1) == 199 + 20.5);
    for (int i = 0; i < 4; i++)
        v.Click(438, 190);
    EXPECT_TRUE(message->Scroll() == 1 && v.Thumb(1) == 199);
    for (int i = 0; i < 6; i++)
        v.Click(438, 265);
    EXPECT_EQ(message->Scroll(), 5);

    v.Click(200, 105), v.Type({18, 18, 18, 13}); // Tab over the two arrows to "Send", and Enter
    EXPECT_EQ(v.curFrame, 1);
    EXPECT_TRUE(v.url.ends_with("/samples/guestbook")) << v.url;
    const std::string page = "name=Ada+Lovelace&guests=12&password=s3%3D%26&message="
                             "moon%0Dmoon%0Dmoon%0Dmoon%0Dmoon%0Dmoon%0Dmoon%0Dmoon%0D%FC+%26+all";
    ASSERT_EQ(v.sent, "Content-type: application/x-www-form-urlencoded\nContent-length: " +
                          std::to_string(page.size()) + "\n\n" + page + "\n" + '\0');
    EXPECT_STREQ(v.Field("/entry:name")->Text(), "Ada Lovelace"); // which is thanked
    StreamData answer;
    v.StreamInNew(&answer, v.url.c_str(), v.asked);
    v.StreamInWrite(&answer, reinterpret_cast<const U8*>("reply=You+are+guest+9."), 22);
    v.StreamInDestroy(&answer);
    EXPECT_STREQ(v.Field("/desk:reply")->Text(), "You are guest 9.");

    v.Click(309, 308);
    EXPECT_STREQ(v.Field("/entry:name")->Text(), "Ada Lovelace");
    EXPECT_EQ(v.Field("/entry:message")->Length() + v.Field("/entry:password")->Length(), 0u);
    EXPECT_STREQ(v.Field("/desk:count")->Text(), "0 of 400 letters");
}

} // namespace
