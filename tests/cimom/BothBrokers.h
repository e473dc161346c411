/// Runs a test with both kinds of broker.
#ifndef TESTS_CIMOM_BOTH_BROKERS_H
#define TESTS_CIMOM_BOTH_BROKERS_H

#include <gtest/gtest.h>

#include "Server.h"

class BothBrokers : public testing::TestWithParam<cimom::Character> {
protected:
    bool lean() const { return GetParam() == cimom::Character::Lean; }
};

inline std::string brokerName(const testing::TestParamInfo<cimom::Character>& info) {
    return info.param == cimom::Character::Full ? "Full" : "Lean";
}

#define ON_BOTH_BROKERS(suite)                                                                \
    INSTANTIATE_TEST_SUITE_P(Brokers, suite,                                                  \
                             testing::Values(cimom::Character::Full, cimom::Character::Lean), \
                             brokerName)

#endif
