#include "allocations/Given.h"

#include <utility>

namespace allocations {

namespace {

std::string TakeObjects(ULONG count, IUnknown** objects) {
    if (objects == nullptr) {
        return count == 0 ? "[]" : "null";
    }
    for (ULONG i = 0; i < count; ++i) {
        objects[i]->Release();
    }
    CoTaskMemFree(objects);
    return "[" + std::to_string(count) + " objects]";
}

std::string TakeObject(IUnknown* object) {
    if (object == nullptr) {
        return "null";
    }
    object->Release();
    return "object";
}

}  // namespace

std::string Given::Take() {
    const Given given = std::exchange(*this, Given());
    const Given untouched;
    std::string taken;
    const auto add = [&taken](bool isStored, const auto& take) {
        if (isStored) {
            taken += " " + take();
        }
    };
    add(given.text != untouched.text, [&] { return zkhw::TakeText(given.text); });
    add(given.objects != untouched.objects, [&] { return TakeObjects(given.objectCount, given.objects); });
    add(given.texts != untouched.texts, [&] { return zkhw::TakeTexts(given.count, given.texts); });
    add(given.displayTexts != untouched.displayTexts, [&] { return zkhw::TakeTexts(given.count, given.displayTexts); });
    add(given.node != untouched.node, [&] { return zkhw::TakeNode(given.node); });
    add(given.nodes != untouched.nodes, [&] { return zkhw::TakeNodes(given.count, given.nodes); });
    add(given.object != untouched.object, [&] { return TakeObject(given.object); });
    add(given.number != untouched.number, [&] { return std::to_string(given.number); });
    add(given.flag != untouched.flag, [&] { return std::to_string(given.flag); });
    return taken;
}

}  // namespace allocations
