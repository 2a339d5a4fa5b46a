#pragma once

// What the tests of reservations share: a small tree, and who holds what in it as text.

#include <memory>
#include <string>

#include <gtest/gtest.h>

#include "restree/ResTreeNode.h"
#include "support/ExactText.h"
#include "support/TreeMaking.h"

namespace zkhw {

// The text of "ZKHWReservation", "(none)" if there is no such entry.
inline std::string ReservationText(const ResTreeNode& node) {
    const NodeEntry* entry = node.FindRaw(u"ZKHWReservation");
    return entry == nullptr || !entry->IsText() ? "(none)" : qn::dsc::ExactText(*entry->Text());
}

class ReservedTree : public ::testing::Test {
  protected:
    // A child of `parent`, or of the root, whose "Reserves" is `reserves` if that isn't null.
    ResTreeNode* Make(const char16_t* name, const char16_t* reserves = nullptr, ResTreeNode* parent = nullptr) const {
        ResTreeNode* made = AddChild(parent == nullptr ? *root : *parent, name);
        if (reserves != nullptr) {
            AddText(*made, u"Reserves", reserves);
        }
        return made;
    }

    // Every node of the tree that anybody holds, parents first, as "A(a:=r,b:=w) B(c:=!)".
    std::string Held() const {
        std::string text;
        AppendHeld(*root, text);
        return text;
    }

    std::unique_ptr<ResTreeNode> root = MakeRootNode(true);

  private:
    static void AppendHeld(const ResTreeNode& node, std::string& text) {
        if (ReservationText(node) != "(none)") {
            text += (text.empty() ? "" : " ") + qn::dsc::ExactText(node.GetName()) + "(" + ReservationText(node) + ")";
        }
        for (ConstEntryIterator entry = node.Begin(); !entry.IsEnd(); ++entry) {
            if (entry->Child() != nullptr) {
                AppendHeld(*entry->Child(), text);
            }
        }
    }
};

}  // namespace zkhw
