/// The built provider library, loaded by a broker of each character, over an appliance of its own.
#pragma once

#include <memory>

#include "../cimom/BothBrokers.h"
#include "TestAppliance.h"

namespace testing_support {

class ServedProviders : public BothBrokers {
protected:
    void SetUp() override {
        ASSERT_EQ(m_appliance.run("appliance init").exit, 0);
        m_server = std::make_unique<cimom::Server>(cimom::Options{GetParam(), "", {}, m_classes});
        m_server->loadRegistration(ZEM_REGISTRATION);
    }

    TestAppliance m_appliance{ZEM_PROGRAMS};
    std::shared_ptr<const cimom::ClassRepository> m_classes =
        cimom::ClassRepository::load(ZEM_SCHEMA);
    std::unique_ptr<cimom::Server> m_server;
    cimom::Request m_request;
};

}  // namespace testing_support
