#include "storage/device_state.h"
#include "storage/lun_handle.h"
#include "storage/nmp/claim_rule.h"

#include <utility>

namespace HostCtl {
namespace Storage {

char const *APD_START = "APD start";
char const *APD_TIMEOUT = "APD timeout";
char const *PDL = "permanent device loss";
char const *DEGRADED = "degraded";
char const *OFF = "off";

// ---- LunHandle ----

LunHandle::LunHandle() : worldId_(0), partition_(0) {}

LunHandle::LunHandle(uint32 worldId, uint32 partition) : worldId_(worldId), partition_(partition) {}

uint32 LunHandle::GetWorldID() const { return worldId_; }

uint32 LunHandle::GetPartition() const { return partition_; }

namespace Nmp {

// ---- SatpClaimRule ----

SatpClaimRule::SatpClaimRule() : force_(false) {}

std::string SatpClaimRule::GetDeviceUid() const { return deviceUid_; }
void SatpClaimRule::SetDeviceUid(std::string deviceUid) { deviceUid_ = std::move(deviceUid); }
std::string SatpClaimRule::GetVendor() const { return vendor_; }
void SatpClaimRule::SetVendor(std::string vendor) { vendor_ = std::move(vendor); }
std::string SatpClaimRule::GetModel() const { return model_; }
void SatpClaimRule::SetModel(std::string model) { model_ = std::move(model); }
std::string SatpClaimRule::GetDriver() const { return driver_; }
void SatpClaimRule::SetDriver(std::string driver) { driver_ = std::move(driver); }
std::string SatpClaimRule::GetTransport() const { return transport_; }
void SatpClaimRule::SetTransport(std::string transport) { transport_ = std::move(transport); }
std::string SatpClaimRule::GetOptions() const { return options_; }
void SatpClaimRule::SetOptions(std::string options) { options_ = std::move(options); }
std::string SatpClaimRule::GetClaimOptions() const { return claimOptions_; }
void SatpClaimRule::SetClaimOptions(std::string claimOptions) { claimOptions_ = std::move(claimOptions); }
std::string SatpClaimRule::GetPsp() const { return psp_; }
void SatpClaimRule::SetPsp(std::string psp) { psp_ = std::move(psp); }
std::string SatpClaimRule::GetPspOptions() const { return pspOptions_; }
void SatpClaimRule::SetPspOptions(std::string pspOptions) { pspOptions_ = std::move(pspOptions); }
std::string SatpClaimRule::GetDescription() const { return description_; }
void SatpClaimRule::SetDescription(std::string description) { description_ = std::move(description); }
std::string SatpClaimRule::GetRuleGroup() const { return ruleGroup_; }
void SatpClaimRule::SetRuleGroup(std::string ruleGroup) { ruleGroup_ = std::move(ruleGroup); }
bool SatpClaimRule::GetForce() const { return force_; }
void SatpClaimRule::SetForce(bool force) { force_ = force; }

bool SatpClaimRule::operator==(SatpClaimRule const &other) const
{
    return deviceUid_ == other.deviceUid_ && vendor_ == other.vendor_ && model_ == other.model_ &&
           driver_ == other.driver_ && transport_ == other.transport_ && options_ == other.options_ &&
           claimOptions_ == other.claimOptions_ && psp_ == other.psp_ && pspOptions_ == other.pspOptions_ &&
           description_ == other.description_ && ruleGroup_ == other.ruleGroup_ && force_ == other.force_;
}

}  // namespace Nmp
}  // namespace Storage
}  // namespace HostCtl
