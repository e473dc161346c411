/// The built provider library, loaded by a broker of each character, over an appliance of its own.
#pragma once

#include <gtest/gtest.h>

#include <memory>

#include "Server.h"
#include "TestAppliance.h"

namespace testing_support {

class ServedProviders : public ::testing::TestWithParam<cimom::Character> {
public:
    static auto brokers() {
        return ::testing::Values(cimom::Character::Full, cimom::Character::Lean);
    }
    static std::string nameOf(const ::testing::TestParamInfo<cimom::Character>& broker) {
        return broker.param == cimom::Character::Full ? "full" : "lean";
    }

protected:
    void SetUp() override {
        ASSERT_EQ(m_appliance.run("appliance init").exit, 0);
        cimom::Options options;
        options.character = GetParam();
        options.classes = cimom::ClassRepository::load(ZEM_SCHEMA);
        m_server = std::make_unique<cimom::Server>(options);
        m_server->loadRegistration(ZEM_REGISTRATION);
    }

    TestAppliance m_appliance{ZEM_PROGRAMS};
    std::unique_ptr<cimom::Server> m_server;
    cimom::Request m_request;
};

}  // namespace testing_support
