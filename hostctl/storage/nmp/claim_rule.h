// Claim rules of the storage array type plugins.
#ifndef HOSTCTL_STORAGE_NMP_CLAIM_RULE_H
#define HOSTCTL_STORAGE_NMP_CLAIM_RULE_H

#include <string>

#include "annotate.h"
#include "types.h"

namespace HostCtl {
namespace Storage {
namespace Nmp {

// One rule that gives the devices it matches to a storage array type: the
// device it names (by identifier, or by vendor, model, driver and
// transport), the options for the array type and the claim, the path
// selection policy with its options, a description, the rule group it
// belongs to, and whether it was forced (forced rules survive
// StorageArrayType::DeleteNonForceClaimRules). A plain value: the accessors
// read and write the members and never throw. A new rule is all empty and
// not forced.
class SatpClaimRule {
public:
    SatpClaimRule();
    std::string GetDeviceUid() const;
    void SetDeviceUid(std::string deviceUid);
    std::string GetVendor() const;
    void SetVendor(std::string vendor);
    std::string GetModel() const;
    void SetModel(std::string model);
    std::string GetDriver() const;
    void SetDriver(std::string driver);
    std::string GetTransport() const;
    void SetTransport(std::string transport);
    std::string GetOptions() const;
    void SetOptions(std::string options);
    std::string GetClaimOptions() const;
    void SetClaimOptions(std::string claimOptions);
    std::string GetPsp() const;
    void SetPsp(std::string psp);
    std::string GetPspOptions() const;
    void SetPspOptions(std::string pspOptions);
    std::string GetDescription() const;
    void SetDescription(std::string description);
    std::string GetRuleGroup() const;
    void SetRuleGroup(std::string ruleGroup);
    bool GetForce() const;
    void SetForce(bool force);

    // Every member equal (how an array type finds the rule to delete).
    QC_HIDDEN bool operator==(SatpClaimRule const &other) const;

private:
    std::string deviceUid_;
    std::string vendor_;
    std::string model_;
    std::string driver_;
    std::string transport_;
    std::string options_;
    std::string claimOptions_;
    std::string psp_;
    std::string pspOptions_;
    std::string description_;
    std::string ruleGroup_;
    bool force_;
};

}  // namespace Nmp
}  // namespace Storage
}  // namespace HostCtl

#endif
