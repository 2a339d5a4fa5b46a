// Which operations of a host read the description of a board that comes from the cache.

#include <string>

#include <gtest/gtest.h>

#include "install/ExampleHost.h"

namespace zkhw {
namespace {

struct OperationFacts {
    const char* operation;  // As StubProbe.cpp names it.
    const char* outcome;
};

constexpr OperationFacts operationFacts[] = {
    {"nothing", "stub"},
    {"GetName", "stub"},
    {"GetPath", "stub"},
    {"GetType", "stub"},
    {"GetParent", "stub"},
    {"HasParent", "stub"},
    {"SetName", "stub"},
    {"GetProperty kept", "stub"},
    {"GetProperty missing", "loaded"},
    {"GetProperty TargetDir", "stub"},
    {"SetProperty kept", "stub"},
    {"SetProperty missing", "loaded"},
    {"IsLocalizedProperty kept", "stub"},
    {"IsLocalizedProperty missing", "loaded"},
    {"RemoveEntry kept", "stub"},
    {"RemoveEntry missing", "loaded"},
    {"IsOfType", "stub"},
    {"GetTypes", "stub"},
    {"IsOfType without Protocols", "loaded"},
    {"IsOfType Target without Protocols", "stub"},
    {"FindNode itself", "stub"},
    {"FindNode below", "loaded"},
    {"Advise", "stub"},
    {"Advise for reservations", "loaded"},
    {"Unadvise", "stub"},
    {"Unreserve", "stub"},
    {"Reserve", "loaded"},
    {"GetReservation", "loaded"},
    {"CloneDetached", "stub"},
    {"LoadContent", "stub"},
    {"GetChildren", "loaded"},
    {"HasChildren", "loaded"},
    {"GetPropertyNames", "loaded"},
    {"GetXml", "loaded"},
    {"GetDisplayPath", "loaded"},
    {"GetChildren of the root", "stub"},
    {"GetChildrenOfType of the root", "stub"},
    {"GetChildNames of the root", "stub"},
    {"GetChildNames of the root for display", "loaded"},
    {"GetDescendantsOfType of the root", "loaded"},
    {"GetXml of the root", "loaded"},
};

TEST(Stub, LoadsAtTheOperationsThatTheGuideNames) {
    const ExampleHost host(STUB_PROBE);
    // Writes the cache.
    ExpectSuccess(host.Run({"nothing"}), "loaded\n");
    for (const OperationFacts& facts : operationFacts) {
        SCOPED_TRACE(facts.operation);
        ExpectSuccess(host.Run({facts.operation}), std::string(facts.outcome) + "\n");
    }
}

}  // namespace
}  // namespace zkhw
