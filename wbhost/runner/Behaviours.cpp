// The host behaviours behind the program files.
#include "runner/Behaviours.h"

#include "runner/UniqueName.h"

#include <array>
#include <string_view>

namespace wbhost::runner {

namespace {

constexpr int32_t kTrue = 1;
constexpr int32_t kFalse = 0;

template <class T> T InputOr(const Terminals& inputs, uint32_t index, T fallback) {
    const auto found = inputs.find(index);
    if (found != inputs.end()) {
        if (const T* value = std::get_if<T>(&found->second)) {
            return *value;
        }
    }
    return fallback;
}

using Strings = std::vector<std::u16string>;

Terminals UniqueNameOutputs(const Terminals& in) {
    return {{4, UniqueName(InputOr(in, 0, std::u16string()), InputOr(in, 1, Strings()))}};
}

// A dialog closed without a choice: the cancel flag set and the inputs handed back unchanged.
Terminals PropertiesOutputs(const Terminals& in) {
    return {{0, kTrue}, {1, InputOr(in, 9, Strings())}};
}
Terminals SelectResourceOutputs(const Terminals& in) {
    return {{0, kTrue}, {1, InputOr(in, 9, std::u16string())}, {2, kFalse}};
}
Terminals ExplainErrorOutputs(const Terminals&) {
    return {{0, kFalse}};
}
Terminals DragAndDropOutputs(const Terminals&) {
    return {};
}
// The wizard keeps the caller's last choice and creates nothing.
Terminals WizardOutputs(const Terminals& in) {
    return {{0, kTrue}, {1, InputOr(in, 1, int32_t{0})}, {3, Strings()}};
}
// The name-control handlers report success through output 4.
Terminals NameControlOutputs(const Terminals&) {
    return {{4, kFalse}};
}

// This host's name controls have kept one data layout: the upgrade hands the value back as it
// came.
Terminals NameControlMutationOutputs(const Terminals& in) {
    return {{4, InputOr(in, 0, int32_t{0})}};
}

struct Behaviour {
    std::string_view name;
    Terminals (*outputs)(const Terminals&);
};

constexpr std::array kBehaviours = {
    Behaviour{"unique-name", UniqueNameOutputs},
    Behaviour{"properties", PropertiesOutputs},
    Behaviour{"select-resource", SelectResourceOutputs},
    Behaviour{"explain-error", ExplainErrorOutputs},
    Behaviour{"drag-and-drop", DragAndDropOutputs},
    Behaviour{"new-item-wizard", WizardOutputs},
    Behaviour{"name-control-config", NameControlOutputs},
    Behaviour{"name-control-on-select", NameControlOutputs},
    Behaviour{"name-control-on-mutation", NameControlMutationOutputs},
};

const Behaviour* Find(const std::string& name) {
    for (const Behaviour& behaviour : kBehaviours) {
        if (behaviour.name == name) {
            return &behaviour;
        }
    }
    return nullptr;
}

} // namespace

bool IsKnownBehaviour(const std::string& behaviour) {
    return Find(behaviour) != nullptr;
}

std::optional<Terminals> RunBehaviour(const std::string& behaviour, const Terminals& inputs,
                                      const Terminals& answers) {
    const Behaviour* found = Find(behaviour);
    if (!found) {
        return std::nullopt;
    }
    Terminals outputs = found->outputs(inputs);
    for (const auto& [index, value] : answers) {
        outputs[index] = value;
    }
    return outputs;
}

} // namespace wbhost::runner
