#include "allocations/WorldOperation.h"

namespace allocations {

namespace {

class WorldScene final : public Scene {
  public:
    WorldScene(const WorldOperation& operation, const ContentsFile* file) : world(file), call(operation.call) {
        if (operation.prepare != nullptr) {
            operation.prepare(world);
        }
    }

    void GetReady() override { world.GetReady(); }
    HRESULT Call() override { return call(world, given); }
    std::string Take() override { return given.Take(); }
    std::string State() override { return world.State(); }
    std::string Rest() override { return world.Rest(); }

  private:
    World world;
    Given given;
    WorldCall call;
};

}  // namespace

std::vector<Operation> OperationsOf(const std::vector<WorldOperation>& table) {
    std::vector<Operation> operations;
    for (const WorldOperation& each : table) {
        const auto make = [each](Contents contents) {
            static const ContentsFile file;
            return std::make_unique<WorldScene>(each, contents == Contents::InFile ? &file : nullptr);
        };
        operations.push_back({.name = each.name,
                              .make = make,
                              .answer = each.answer,
                              .withoutMemory = each.withoutMemory,
                              .effect = each.effect,
                              .answerFromFile = each.answerFromFile == nullptr ? each.answer : each.answerFromFile});
    }
    return operations;
}

}  // namespace allocations
