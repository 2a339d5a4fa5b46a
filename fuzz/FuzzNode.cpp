// A node's collection beside a plain list that does the same the slow way: any sequence of changes must leave the same
// entries in the same order, in both forms of the collection and across the sizes where its layout changes.

#include <algorithm>
#include <string>
#include <utility>
#include <vector>

#include "FuzzInput.h"
#include "TreeLaws.h"
#include "qn/dsc/osdep/Compare.h"
#include "restree/Parameters.h"
#include "restree/ResTreeNode.h"

namespace {

using qn::dsc::String;
using qn::dsc::osdep::Compare;
using zkhw::ResTreeNode;

// What a node must hold, found by looking at every entry.
class Model {
  public:
    explicit Model(bool ordered) : ordered(ordered) {}

    size_t Find(const std::u16string& key) const {
        size_t at = 0;
        while (at < items.size() && Compare(items[at].first, key) != 0) {
            ++at;
        }
        return at;
    }
    bool Has(const std::u16string& key) const { return Find(key) < items.size(); }

    bool Add(const std::u16string& key, const std::u16string& value, const std::u16string* before) {
        if (!ordered && Has(key)) {
            return false;
        }
        size_t at = before == nullptr ? items.size() : Find(*before);
        if (!ordered) {
            at = 0;
            while (at < items.size() && Compare(items[at].first, key) < 0) {
                ++at;
            }
        }
        items.insert(items.begin() + static_cast<ptrdiff_t>(at), {key, value});
        return true;
    }
    void Remove(const std::u16string& key) {
        if (Has(key)) {
            items.erase(items.begin() + static_cast<ptrdiff_t>(Find(key)));
        }
    }
    bool Rename(const std::u16string& oldKey, const std::u16string& newKey) {
        if (!Has(oldKey)) {
            return false;
        }
        if (ordered) {
            items[Find(oldKey)].first = newKey;
            return true;
        }
        const std::u16string value = items[Find(oldKey)].second;
        Remove(oldKey);
        return Add(newKey, value, nullptr);
    }
    void Set(const std::u16string& key, const std::u16string& value) {
        if (Has(key)) {
            items[Find(key)].second = value;
        } else {
            Add(key, value, nullptr);
        }
    }

    // A value that asks for a parameter is "#{...}" and nothing else.
    void Expand(const std::u16string& parameter) {
        for (auto& item : items) {
            std::u16string& value = item.second;
            if (value.starts_with(u"#{") && Compare(value.substr(2, value.size() - 3), parameter) == 0) {
                value = u"expanded";
            }
        }
    }

    std::vector<std::pair<std::u16string, std::u16string>> items;
    const bool ordered;
};

std::u16string ShortKey(uint8_t number) {
    std::u16string key(number % 2 == 0 ? u"k" : u"K");
    for (number = static_cast<uint8_t>(number / 2); number != 0; number = static_cast<uint8_t>(number / 10)) {
        key.push_back(static_cast<char16_t>(u'0' + number % 10));
    }
    return key;
}

void Expand(ResTreeNode& node, const std::u16string& parameter) {
    zkhw::ParameterMap values;
    values.emplace(parameter, u"expanded");
    node.ApplyParameters(zkhw::MapParameters(std::move(values)));
}

void Same(ResTreeNode& node, const Model& model) {
    size_t at = 0;
    for (auto entry = node.Begin(); entry != node.End(); ++entry, ++at) {
        fuzz::Require(at < model.items.size(), "no entry too many");
        fuzz::Require(entry.Key() == model.items[at].first, "the keys stand in their order");
        fuzz::Require(entry->Text() == model.items[at].second, "each has its value");
    }
    fuzz::Require(at == model.items.size(), "no entry too few");
}

}  // namespace

extern "C" int LLVMFuzzerTestOneInput(const uint8_t* data, size_t size) {
    fuzz::Input input(data, size);
    const bool ordered = (input.TakeByte() & 1) != 0;
    ResTreeNode node(u"n", u"N", ordered);
    Model model(ordered);
    // The model takes its time, so it stays small; 500 entries reach every layout.
    while (!input.IsEmpty() && model.items.size() < 500) {
        const uint8_t operation = input.TakeByte();
        const std::u16string key = ShortKey(input.TakeByte());
        const std::u16string other = ShortKey(input.TakeByte());
        if (operation >= 0xE0) {
            if (operation % 2 == 0) {
                const std::u16string value = u"#{" + other + u"}";
                node.SetProperty(key, value);
                model.Set(key, value);
            } else {
                Expand(node, key);
                model.Expand(key);
            }
            continue;
        }
        switch (operation % 7) {
            case 0: {
                const bool isNew = node.AddTextEntry(key, other, zkhw::TextEntry).isNew;
                fuzz::Require(isNew == model.Add(key, other, nullptr), "an entry is new to both");
                break;
            }
            case 1: {
                const String before(other);
                const bool isNew = node.AddTextEntry(key, u"v", zkhw::TextEntry, &before).isNew;
                fuzz::Require(isNew == model.Add(key, u"v", &other), "an entry is new to both");
                break;
            }
            case 2:
                node.RemoveEntryByName(key);
                model.Remove(key);
                break;
            case 3:
                // A renaming onto an entry of an unordered node loses what it renames for good; that isn't followed.
                if (ordered || !model.Has(other) || !model.Has(key) || Compare(key, other) == 0) {
                    fuzz::Require(node.RenameEntry(key, other) == model.Rename(key, other), "a renaming works in both");
                }
                break;
            case 4:
                node.SetProperty(key, other);
                model.Set(key, other);
                break;
            case 5:
                // Many at once, so that the larger layouts are reached.
                for (uint8_t i = 0; i < operation; ++i) {
                    const std::u16string many = ShortKey(static_cast<uint8_t>(i * 7 + key.back()));
                    node.AddTextEntry(many, many, zkhw::TextEntry);
                    model.Add(many, many, nullptr);
                }
                break;
            default: {
                const auto value = node.GetProperty(key);
                fuzz::Require(value.has_value() == model.Has(key), "what one finds, the other finds");
                fuzz::Require(!value || *value == model.items[model.Find(key)].second, "the first of a key is found");
            }
        }
    }
    Same(node, model);
    fuzz::CheckTree(node);
    const std::unique_ptr<ResTreeNode> clone = node.Clone();
    fuzz::Require(clone->IsOrdered() == ordered, "a clone has the same form");
    Same(*clone, model);
    return 0;
}
