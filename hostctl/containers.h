// The containers that scripts see as classes: one typedef per class, named
// as scripts name the class. The binding generator makes a vector class of
// each std::vector typedef and a set class of the std::set typedef, in the
// order they appear here. Element types are spelled as the library spells
// them (qualified, without const).
#ifndef HOSTCTL_CONTAINERS_H
#define HOSTCTL_CONTAINERS_H

#include <set>
#include <string>
#include <vector>

#include "adv/option.h"
#include "annotate.h"
#include "hardware/boot.h"
#include "hardware/cpu.h"
#include "hardware/numa.h"
#include "hardware/pci.h"
#include "lib/object.h"
#include "network/address.h"
#include "network/dvport.h"
#include "network/dvswitch.h"
#include "network/pnic.h"
#include "network/port.h"
#include "network/portgroup.h"
#include "network/qornic.h"
#include "network/range.h"
#include "network/vnic.h"
#include "network/vswitch.h"
#include "resource/allocation.h"
#include "resource/group.h"
#include "resource/stats.h"
#include "storage/adapter.h"
#include "storage/filesystem.h"
#include "storage/identifier.h"
#include "storage/iscsi.h"
#include "storage/lun.h"
#include "storage/lun_handle.h"
#include "storage/nmp/array_type.h"
#include "storage/nmp/claim_rule.h"
#include "storage/nmp/psp.h"
#include "storage/partition.h"
#include "storage/path.h"
#include "storage/unresolved.h"
#include "system/module.h"
#include "types.h"

// Numbers and strings.
typedef std::vector< std::string > StringVector;
typedef std::vector< uint32 > Uint32Vector;
typedef std::vector< uint64 > Uint64Vector;
typedef std::vector< HostCtl::Hardware::CpuInfo::HVReplayDisabledReason > HVReplayVector;

// Value records.
typedef std::vector< HostCtl::Hardware::BootDevice > BootDeviceVector;
typedef std::vector< QorCtl::Hardware::SimplePciDevice > SimplePciDeviceVector;
typedef std::vector< HostCtl::Resource::HostCpuStats > HostCpuStatsVector;
typedef std::vector< HostCtl::Resource::ResourceGroupSpec > ResourceGroupSpecVector;
typedef std::vector< HostCtl::Network::Ipv4Address > Ipv4AddressVector;
typedef std::vector< HostCtl::Network::Ipv6Network > Ipv6NetworkVector;
typedef std::vector< HostCtl::Network::PortAddress > PortAddressVector;
typedef std::vector< HostCtl::Network::PortRange > PortRangeVector;
typedef std::vector< HostCtl::Storage::LunHandle > LunHandleVector;
typedef std::vector< HostCtl::Storage::Nmp::SatpClaimRule > SatpClaimRuleVector;

// Library objects (the library keeps them; the vectors hold pointers).
typedef std::vector< HostCtl::Adv::AdvancedOption * > AdvancedOptionVector;
typedef std::vector< HostCtl::Adv::AdvancedOptionBranch * > AdvancedOptionBranchVector;
typedef std::vector< HostCtl::Hardware::Cpu * > CpuVector;
typedef std::vector< HostCtl::Hardware::NumaNode * > NumaNodeVector;
typedef std::vector< HostCtl::Hardware::PciDevice * > PciDeviceVector;
typedef std::vector< HostCtl::Lib::HostCtlObject * > HostCtlObjectVector;
typedef std::vector< HostCtl::System::Module * > ModuleVector;
typedef std::vector< HostCtl::Resource::VirtualMachine * > VirtualMachineVector;
typedef std::vector< HostCtl::Resource::ResourceGroup * > ResourceGroupVector;
typedef std::vector< QorCtl::Resource::ResourceGroupImpl * > ResourceGroupImplVector;
typedef std::vector< HostCtl::Network::Pnic * > PnicVector;
typedef std::vector< HostCtl::Network::FcoePnic * > FcoePnicVector;
typedef std::vector< HostCtl::Network::MacAddress * > MacAddressVector;
typedef std::vector< HostCtl::Network::Port * > PortVector;
typedef std::vector< QorCtl::Network::PortImpl * > PortImplVector;
typedef std::vector< HostCtl::Network::PortGroup * > PortGroupVector;
typedef std::vector< HostCtl::Network::VirtualSwitch * > VirtualSwitchVector;
typedef std::vector< HostCtl::Network::DVSwitch * > DVSwitchVector;
typedef std::vector< HostCtl::Network::DVPortVlanRange * > DVPortVlanRangeVector;
typedef std::vector< HostCtl::Network::Vnic * > VnicVector;
typedef std::vector< HostCtl::Network::QorNic * > QorNicVector;
typedef std::vector< HostCtl::Storage::DeviceUid * > DeviceUidVector;
typedef std::vector< HostCtl::Storage::DurableName * > DurableNameVector;
typedef std::vector< HostCtl::Storage::Lun * > LunVector;
typedef std::vector< HostCtl::Storage::DiskLun * > DiskLunVector;
typedef std::vector< HostCtl::Storage::ScsiPath * > ScsiPathVector;
typedef std::vector< HostCtl::Storage::Partition * > PartitionVector;
typedef std::vector< HostCtl::Storage::DiskLunPartition * > DiskLunPartitionVector;
typedef std::vector< HostCtl::Storage::DiagnosticPartition * > DiagnosticPartitionVector;
typedef std::vector< HostCtl::Storage::StaticTarget * > StaticTargetVector;
typedef std::vector< HostCtl::Storage::TargetAddress * > TargetAddressVector;
typedef std::vector< HostCtl::Storage::ScsiInterface * > ScsiInterfaceVector;
typedef std::vector< HostCtl::Storage::BlockScsiInterface * > BlockScsiInterfaceVector;
typedef std::vector< HostCtl::Storage::FibreChannelInterface * > FibreChannelInterfaceVector;
typedef std::vector< HostCtl::Storage::IdeScsiInterface * > IdeScsiInterfaceVector;
typedef std::vector< HostCtl::Storage::ParallelScsiInterface * > ParallelScsiInterfaceVector;
typedef std::vector< HostCtl::Storage::iScsiInterface * > iScsiInterfaceVector;
typedef std::vector< HostCtl::Storage::FileSystem * > FileSystemVector;
typedef std::vector< HostCtl::Storage::VmFileSystem * > VmFileSystemVector;
typedef std::vector< HostCtl::Storage::NetworkFileSystem * > NetworkFileSystemVector;
typedef std::vector< HostCtl::Storage::VFATFileSystem * > VFATFileSystemVector;
typedef std::vector< HostCtl::Storage::UFSFileSystem * > UFSFileSystemVector;
typedef std::vector< HostCtl::Storage::UnresolvedKobfsVolume * > UnresolvedVolumesVector;
typedef std::vector< HostCtl::Storage::UnresolvedKobfsExtent * > UnresolvedExtentsVector;
typedef std::vector< HostCtl::Storage::Nmp::PathSelectionPolicy * > PathSelectionPolicyVector;
typedef std::vector< HostCtl::Storage::Nmp::StorageArrayType * > StorageArrayTypeVector;
typedef std::vector< HostCtl::Storage::Nmp::SatpClaimRule * > SatpClaimRulePtrVector;

// The string set.
typedef std::set< std::string > StringSet;

#endif
