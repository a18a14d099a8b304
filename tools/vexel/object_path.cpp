#include "tools/vexel/object_path.h"

#include "core/display/display_list.h"
#include "core/stream/script_thread.h"

#include <vector>

std::string LevelPath(int level)
{
    return level == 0 ? "/" : "_level" + std::to_string(level);
}

std::string JoinPath(const std::string& parent, const char* name)
{
    return (parent == "/" ? "" : parent) + "/" + name;
}

// Upwards through the objects whose timelines these are: what a button shows belongs to the
// timeline around it.
std::string TimelinePath(const SObject* obj)
{
    std::vector<const char*> names;
    const SObject* root = nullptr;
    while (obj != nullptr && obj->thread != nullptr && obj->thread->rootObject != nullptr) {
        root = obj->thread->rootObject;
        obj = root->parent;
        if (obj == nullptr || obj == &root->display->root)
            break;
        if (root->name != nullptr && root->name[0] != 0)
            names.push_back(root->name);
    }
    if (root == nullptr)
        return "?";
    std::string path = LevelPath(root->thread->layerNum);
    for (; !names.empty(); names.pop_back())
        path = JoinPath(path, names.back());
    return path;
}
