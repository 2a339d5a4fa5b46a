#include "restree/LoadChain.h"

namespace zkhw {

using qn::dsc::NarrowString;
using qn::dsc::String;

namespace {

thread_local const LoadChain* innermost = nullptr;

}  // namespace

LoadChain::LoadChain(const NarrowString* path, const LoadChain* includer)
    : path(path), includer(includer), outer(innermost), depth(includer == nullptr ? 0 : includer->depth + 1) {
    innermost = this;
}

LoadChain::~LoadChain() {
    innermost = outer;
}

LoadChain::Identity LoadChain::IdentityOf(const NarrowString& path) {
    qn::dsc::osdep::FileIdentity identity;
    if (qn::dsc::osdep::GetFileSystem().ReadIdentity(String(path), identity) != 0) {
        return std::nullopt;
    }
    return identity;
}

bool LoadChain::IsReading(const Identity& file) const {
    if (path == nullptr || !file.has_value()) {
        return false;
    }
    if (!ownIdentity.has_value()) {
        ownIdentity = IdentityOf(*path);
    }
    return ownIdentity == file;
}

bool LoadChain::IsIncludeRefused(const NarrowString& included) const {
    if (depth >= maximalDepth) {
        return true;
    }
    const Identity file = IdentityOf(included);
    for (const LoadChain* load = this; load != nullptr; load = load->includer) {
        if (load->IsReading(file)) {
            return true;
        }
    }
    return false;
}

bool LoadChain::IsBeingRead(const NarrowString& path) {
    if (innermost == nullptr) {
        return false;
    }
    const Identity file = IdentityOf(path);
    for (const LoadChain* load = innermost; load != nullptr; load = load->outer) {
        if (load->IsReading(file)) {
            return true;
        }
    }
    return false;
}

}  // namespace zkhw
