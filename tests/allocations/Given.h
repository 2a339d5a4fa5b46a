#pragma once

// Where operations of the interfaces store what they give.

#include <string>

#include "interfaces/support/HostMemory.h"

namespace allocations {

struct Given {
    BSTR text = zkhw::Untouched<BSTR>();
    // Of the texts, or of the nodes, or of the objects.
    ULONG count = zkhw::untouchedNumber;
    BSTR* texts = zkhw::Untouched<BSTR*>();
    BSTR* displayTexts = zkhw::Untouched<BSTR*>();
    IzkhwResourceTreeNode* node = zkhw::Untouched<IzkhwResourceTreeNode*>();
    IzkhwResourceTreeNode** nodes = zkhw::Untouched<IzkhwResourceTreeNode**>();
    ULONG objectCount = zkhw::untouchedNumber;
    IUnknown** objects = zkhw::Untouched<IUnknown**>();
    IUnknown* object = zkhw::Untouched<IUnknown*>();
    ULONG number = zkhw::untouchedNumber;
    BOOL flag = static_cast<BOOL>(zkhw::untouchedNumber);

    // All that was stored, in this order, each behind a blank; what wasn't is passed over. An object is "object",
    // several of them are their number. Frees everything, and makes all as at first.
    std::string Take();
};

}  // namespace allocations
