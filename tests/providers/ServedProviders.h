/// The built provider library, loaded by a broker of each character, over an appliance of its own.
#pragma once

#include <memory>

#include "../cimom/BothBrokers.h"
#include "PathText.h"
#include "TestAppliance.h"

namespace testing_support {

/// The value of a property, key or argument without quotes; empty when there is none.
inline std::string textOf(const cimom::NamedValues& values, const std::string& name) {
    const cimom::Value* const value = values.find(name);
    return value == nullptr || value->isNull() ? "" : cimom::plainText(*value);
}
inline std::string textOf(const cimom::Instance& instance, const std::string& property) {
    return textOf(instance.properties, property);
}

class ServedProviders : public BothBrokers {
protected:
    void SetUp() override {
        m_server = std::make_unique<cimom::Server>(cimom::Options{GetParam(), "", {}, m_classes});
        m_server->loadRegistration(ZEM_REGISTRATION);
    }

    DemoAppliance m_appliance{ZEM_PROGRAMS};
    std::shared_ptr<const cimom::ClassRepository> m_classes =
        cimom::ClassRepository::load(ZEM_SCHEMA);
    std::unique_ptr<cimom::Server> m_server;
    cimom::Request m_request;
};

}  // namespace testing_support
