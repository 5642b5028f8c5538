#pragma once

#include "tests/module/agent/Agent_Fixture.h"
#include "tests/module/agent/Method_Facts.h"

namespace KPRV {

class Methods : public Agent_Fixture
{
protected:
    template <class Body>
    void for_each(Body body)
    {
        for (const Fact& fact : facts) {
            SCOPED_TRACE(fact.wire);
            library.calls.clear();
            body(fact);
        }
    }
    /// All but those with a body of their own.
    template <class Body>
    void for_each_of_the_table(Body body)
    {
        size_t methods = 0;
        for_each([&](const Fact& fact) {
            if (fact.form == OWN)
                return;
            body(fact);
            methods++;
        });
        EXPECT_EQ(119u - 12, methods);
    }
    std::vector<Fake_Library::Call> asked(const Fact& fact, const Json::Value& params)
    {
        return {{fact.symbol, expected_query(fact, params)}};
    }
};

} // namespace KPRV
