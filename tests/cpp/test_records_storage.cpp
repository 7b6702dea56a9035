// Storage records: SATP claim rules, LUN handles and the device state
// names that scripts may replace.
#include <gtest/gtest.h>

#include <cstring>
#include <functional>
#include <set>
#include <string>
#include <vector>

#include "storage/device_state.h"
#include "storage/lun_handle.h"
#include "storage/nmp/claim_rule.h"

using namespace HostCtl::Storage;
using HostCtl::Storage::Nmp::SatpClaimRule;

namespace {

// One string member of a claim rule: its setter and its getter.
struct Member {
    const char *name;
    std::function<void(SatpClaimRule &, std::string)> set;
    std::function<std::string(SatpClaimRule const &)> get;
};

const std::vector<Member> &Members()
{
    static const std::vector<Member> m = {
        {"deviceUid", &SatpClaimRule::SetDeviceUid, &SatpClaimRule::GetDeviceUid},
        {"vendor", &SatpClaimRule::SetVendor, &SatpClaimRule::GetVendor},
        {"model", &SatpClaimRule::SetModel, &SatpClaimRule::GetModel},
        {"driver", &SatpClaimRule::SetDriver, &SatpClaimRule::GetDriver},
        {"transport", &SatpClaimRule::SetTransport, &SatpClaimRule::GetTransport},
        {"options", &SatpClaimRule::SetOptions, &SatpClaimRule::GetOptions},
        {"claimOptions", &SatpClaimRule::SetClaimOptions, &SatpClaimRule::GetClaimOptions},
        {"psp", &SatpClaimRule::SetPsp, &SatpClaimRule::GetPsp},
        {"pspOptions", &SatpClaimRule::SetPspOptions, &SatpClaimRule::GetPspOptions},
        {"description", &SatpClaimRule::SetDescription, &SatpClaimRule::GetDescription},
        {"ruleGroup", &SatpClaimRule::SetRuleGroup, &SatpClaimRule::GetRuleGroup},
    };
    return m;
}

}  // namespace

TEST(RecordsSatpClaimRule, EachAccessorPairOwnsOneMember)
{
    SatpClaimRule r;
    for (auto const &m : Members()) EXPECT_EQ("", m.get(r)) << m.name;
    EXPECT_FALSE(r.GetForce());

    for (auto const &m : Members()) m.set(r, std::string("value of ") + m.name);
    for (auto const &m : Members()) EXPECT_EQ(std::string("value of ") + m.name, m.get(r)) << m.name;
    r.SetForce(true);
    EXPECT_TRUE(r.GetForce());
    // Text is kept byte for byte, embedded NULs included.
    r.SetOptions(std::string("a\0b", 3));
    EXPECT_EQ(std::string("a\0b", 3), r.GetOptions());
}

TEST(RecordsSatpClaimRule, EqualityComparesEveryMember)
{
    SatpClaimRule a;
    a.SetVendor("ACME");
    a.SetModel("Array");
    SatpClaimRule b = a;
    EXPECT_TRUE(a == b);
    for (auto const &m : Members()) {
        SatpClaimRule c = a;
        m.set(c, m.get(c) + "x");
        EXPECT_FALSE(a == c) << m.name;
    }
    b.SetForce(true);
    EXPECT_FALSE(a == b);
    // Copies are independent.
    b = a;
    b.SetVendor("Other");
    EXPECT_EQ("ACME", a.GetVendor());
}

TEST(RecordsLunHandle, HoldsWorldAndPartition)
{
    LunHandle none;
    EXPECT_EQ(0u, none.GetWorldID());
    EXPECT_EQ(0u, none.GetPartition());
    LunHandle h(4294967295u, 3);
    EXPECT_EQ(4294967295u, h.GetWorldID());
    EXPECT_EQ(3u, h.GetPartition());
}

TEST(RecordsDeviceState, NamesAreDistinctAndReplaceable)
{
    char const **all[] = {&APD_START, &APD_TIMEOUT, &PDL, &DEGRADED, &OFF};
    std::set<std::string> names;
    for (auto p : all) {
        ASSERT_NE(nullptr, *p);
        EXPECT_NE(0u, std::strlen(*p));
        names.insert(*p);
    }
    EXPECT_EQ(5u, names.size());
    char const *saved = OFF;
    OFF = "powered off";
    EXPECT_STREQ("powered off", OFF);
    OFF = saved;
}
