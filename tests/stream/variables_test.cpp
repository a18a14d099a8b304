#include "core/player/limits.h"
#include "core/stream/script_player.h"
#include "core/stream/str.h"

#include <gtest/gtest.h>

#include <string>

namespace {

std::string Value(ScriptThread& thread, const std::string& name)
{
    const SVariable* var = thread.FindVariable(name.c_str());
    return var ? (var->value ? var->value : "(null)") : "(none)";
}

TEST(Variables, NamesFoldAndValuesAreReplaced)
{
    ScriptThread thread;
    EXPECT_EQ(Value(thread, "foo"), "(none)");
    thread.SetVariable("Foo", "1", 0);
    thread.SetVariable("FOO", "2", 0);
    EXPECT_EQ(Value(thread, "foo"), "2");
    EXPECT_STREQ(thread.vars->name, "Foo");
    EXPECT_EQ(thread.vars, thread.varsTail);
    thread.SetVariable("foo", thread.vars->value, 0);
    EXPECT_EQ(Value(thread, "foo"), "2") << "a value that is the variable's own string";
    thread.SetVariable("foo", nullptr, 0);
    EXPECT_EQ(Value(thread, "foo"), "(null)");
    thread.SetVariable(nullptr, "x", 0);
    EXPECT_EQ(thread.vars, thread.varsTail);
}

// The list goes through all forms of its index; whoever walks it sees the order of creation.
TEST(Variables, ManyKeepTheirOrder)
{
    ScriptThread thread;
    for (int round = 0; round < 2; round++)
        for (int i = 0; i < 1000; i++)
            thread.SetVariable(("Name" + std::to_string(i)).c_str(),
                               std::to_string(i * 7 + round).c_str(), 0);
    int count = 0;
    for (const SVariable* var = thread.vars; var; var = var->next, count++) {
        ASSERT_EQ(var->name, "Name" + std::to_string(count));
        ASSERT_EQ(Value(thread, "nAME" + std::to_string(count)), std::to_string(count * 7 + 1));
    }
    EXPECT_EQ(count, 1000);
    thread.ClearVariables();
    EXPECT_EQ(Value(thread, "Name1"), "(none)");
    thread.SetVariable("Name1", "again", 0);
    EXPECT_EQ(Value(thread, "name1"), "again");
}

TEST(Variables, AreBounded)
{
    const SLimits saved = gLimits;
    gLimits.variables = 20;
    gLimits.stringBytes = 5;
    ScriptThread thread;
    for (int i = 0; i < 30; i++)
        thread.SetVariable(std::to_string(i).c_str(), "123456789", 0);
    EXPECT_EQ(Value(thread, "19"), "12345");
    EXPECT_EQ(Value(thread, "20"), "(none)");
    thread.SetVariable("3", "new", 0);
    EXPECT_EQ(Value(thread, "3"), "new");
    gLimits.variables = 100;
    thread.SetVariable("longer", "1", 0);
    EXPECT_EQ(Value(thread, "longer"), "(none)") << "dropped, not cut to another name";
    gLimits = saved;
}

} // namespace
