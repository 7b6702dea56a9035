// The host root and the advanced-option tree of the simulated host.
#include <algorithm>
#include <functional>
#include <set>
#include <sstream>

#include "test_lib_support.h"
#include "util/object_printer.h"

using namespace libtest;
using HostCtl::Adv::AdvancedOption;
using HostCtl::Adv::AdvancedOptionBranch;
using HostCtl::Lib::HostCtlException;
using HostCtl::Lib::HostCtlObject;
using QorCtl::Adv::AdvancedIntegerOptionImpl;
using QorCtl::Adv::AdvancedOptionBranchImpl;
using QorCtl::Adv::AdvancedStringOptionImpl;

namespace {

std::vector<std::string> Names(std::vector<AdvancedOptionBranch *> const &branches) {
    std::vector<std::string> names;
    for (AdvancedOptionBranch *b : branches)
        names.push_back(b->GetBranchName());
    return names;
}

std::vector<std::string> Names(std::vector<AdvancedOption *> const &options) {
    std::vector<std::string> names;
    for (AdvancedOption *o : options)
        names.push_back(o->GetOptionName());
    return names;
}

bool Contains(std::vector<std::string> const &v, std::string const &s) {
    return std::find(v.begin(), v.end(), s) != v.end();
}

}  // namespace

using LibHost = LibFixture;
using LibOptions = LibFixture;

TEST_F(LibHost, FactoryHostIsOneLibraryObjectWithAllAreas) {
    HostCtl::Host *host = HostCtl::HostFactory::GetHost();
    ASSERT_NE(host, nullptr);
    EXPECT_EQ(host, HostCtl::HostFactory::GetHost());
    EXPECT_EQ(host->GetName(), "simhost");
    EXPECT_EQ(static_cast<HostCtlObject *>(host->GetAdvancedOptions())->GetName(), "/");

    std::vector<HostCtlObject *> areas = host->GetChildren();
    ASSERT_EQ(areas.size(), 12u);
    std::vector<std::string> names;
    for (HostCtlObject *a : areas)
        names.push_back(a->GetName());
    EXPECT_EQ(names, (std::vector<std::string>{"hardware", "resources", "storage", "network", "/",
                                               "access", "security", "system", "devices",
                                               "melvar", "orlume", "graphics"}));
    EXPECT_EQ(areas[0], static_cast<HostCtlObject *>(host->GetHardwareInfo()));
    EXPECT_EQ(areas[3], static_cast<HostCtlObject *>(host->GetNetworkInfo()));
    EXPECT_EQ(areas[7], static_cast<HostCtlObject *>(host->GetSystemInfo()));
    // The storage root has no HostCtlObject interface, but its object does.
    EXPECT_EQ(areas[2], dynamic_cast<HostCtlObject *>(host->GetStorageInfo()));
    EXPECT_NE(host->GetGraphicsInfo(), nullptr);
    EXPECT_NO_THROW(host->Refresh());
}

TEST_F(LibHost, HostImplHandlesShareTheHost) {
    QorCtl::HostImpl own;
    QorCtl::HostImpl copy(own);
    HostCtl::Host *host = HostCtl::HostFactory::GetHost();
    EXPECT_EQ(copy.GetName(), host->GetName());
    EXPECT_EQ(own.GetAdvancedOptions(), host->GetAdvancedOptions());
    EXPECT_EQ(copy.GetResourceInfo(), host->GetResourceInfo());

    std::ostringstream out;
    QorCtl::Util::ObjectPrinter printer(out);
    own.Print(&printer);
    EXPECT_NE(out.str().find("Host simhost:\n"), std::string::npos) << out.str();
    EXPECT_NE(out.str().find("   Advanced options: 56 (0 changed)"), std::string::npos)
        << out.str();
    IntOpt("/Net/TcpipHeapSize")->SetValue(64);
    out.str("");
    static_cast<QorCtl::Lib::QorCtlObject &>(own).Print(out, "Report", "> ");
    EXPECT_NE(out.str().find("> Report:\n>    Host simhost:\n"), std::string::npos) << out.str();
    EXPECT_NE(out.str().find("(1 changed)"), std::string::npos) << out.str();
}

TEST_F(LibOptions, TreeWalkReachesEveryOptionOnce) {
    AdvancedOptionBranch *root = HostCtl::HostFactory::GetHost()->GetAdvancedOptions();
    EXPECT_EQ(root->GetBranchName(), "");
    EXPECT_EQ(Names(root->GetBranches()),
              (std::vector<std::string>{"Net", "Disk", "Mem", "Misc", "UserVars"}));
    EXPECT_TRUE(root->GetOptions().empty());

    std::set<std::string> seen;
    unsigned ints = 0, strings = 0, hidden = 0;
    std::function<void(HostCtlObject *)> walk = [&](HostCtlObject *o) {
        if (auto *opt = dynamic_cast<AdvancedOption *>(o)) {
            EXPECT_TRUE(seen.insert(opt->GetOptionPath()).second) << opt->GetOptionPath();
            EXPECT_EQ(o->GetName(), opt->GetOptionPath());
            EXPECT_FALSE(opt->GetDescription().empty()) << opt->GetOptionPath();
            (opt->GetType() == AdvancedOption::ADV_OPTION_INT_TYPE ? ints : strings)++;
            hidden += dynamic_cast<QorCtl::Adv::AdvancedOptionImpl *>(o)->IsHidden();
            EXPECT_TRUE(o->GetChildren().empty());
        }
        for (HostCtlObject *child : o->GetChildren())
            walk(child);
    };
    walk(root);
    EXPECT_EQ(seen.size(), 56u);
    EXPECT_EQ(ints, 46u);
    EXPECT_EQ(strings, 10u);
    EXPECT_EQ(hidden, 6u);
    EXPECT_EQ(seen.size(), QorCtl::Model::AllOptions().size());

    AdvancedOptionBranch *net = root->GetBranchByName("Net");
    AdvancedOptionBranch *tcpip = net->GetBranchByName("Tcpip");
    EXPECT_EQ(static_cast<HostCtlObject *>(tcpip)->GetName(), "/Net/Tcpip");
    AdvancedOption *cc = tcpip->GetOptionByName("CongestionControl");
    EXPECT_EQ(cc->GetOptionPath(), "/Net/Tcpip/CongestionControl");
    EXPECT_EQ(cc->GetOptionName(), "CongestionControl");
    EXPECT_EQ(cc, Opt("Net/Tcpip/CongestionControl"));  // library objects are unique
    // Branches without options, and without anything at all.
    EXPECT_TRUE(net->GetBranchByName("Experimental")->GetOptions().empty());
    EXPECT_TRUE(static_cast<HostCtlObject *>(net->GetBranchByName("Experimental"))->GetChildren().empty());
}

TEST_F(LibOptions, UnknownNamesAreRefusedByName) {
    AdvancedOptionBranch *net = HostCtl::HostFactory::GetHost()->GetAdvancedOptions()->GetBranchByName("Net");
    EXPECT_EQ(ErrorOf([&] { net->GetOptionByName("NoSuch"); }),
              "No advanced option \"NoSuch\" in branch /Net");
    EXPECT_EQ(ErrorOf([&] { net->GetBranchByName("NoSuch"); }),
              "No advanced option branch \"NoSuch\" in branch /Net");
    // A name is one level: no paths and no empty names.
    EXPECT_NE(ErrorOf([&] { net->GetOptionByName("Tcpip/DelayedAck"); }), "");
    EXPECT_NE(ErrorOf([&] { net->GetOptionByName(""); }), "");
    EXPECT_NE(ErrorOf([&] { net->GetBranchByName("Tcpip/"); }), "");
    // Options are not branches and branches are not options.
    EXPECT_NE(ErrorOf([&] { net->GetOptionByName("Tcpip"); }), "");
    EXPECT_NE(ErrorOf([&] { net->GetBranchByName("TcpipHeapSize"); }), "");
    EXPECT_EQ(ErrorOf([] { Opt("/Net/Nope"); }), "No advanced option /Net/Nope on this host");
    EXPECT_EQ(ErrorOf([] { AdvancedOptionBranchImpl({"Net"}, "Nope"); }),
              "No advanced option branch /Net/Nope on this host");
}

TEST_F(LibOptions, IntegerRangeIsEnforcedAndRefusalsChangeNothing) {
    AdvancedIntegerOptionImpl *heap = IntOpt("/Net/TcpipHeapSize");
    ASSERT_NE(heap, nullptr);
    EXPECT_EQ(heap->GetValue(), 32u);
    EXPECT_EQ(heap->GetDefaultValue(), 32u);
    EXPECT_EQ(heap->GetMinimum(), 0u);
    EXPECT_EQ(heap->GetMaximum(), 1024u);
    heap->SetValue(1024);
    EXPECT_EQ(heap->GetValue(), 1024u);
    heap->SetValue(0);
    EXPECT_EQ(heap->GetValue(), 0u);
    EXPECT_EQ(ErrorOf([&] { heap->SetValue(70000); }),
              "Value 70000 for option /Net/TcpipHeapSize is out of range [0, 1024]");
    EXPECT_EQ(heap->GetValue(), 0u);

    AdvancedIntegerOptionImpl *rate = IntOpt("/Misc/SerialBaudRate");
    EXPECT_EQ(ErrorOf([&] { rate->SetValue(9599); }),
              "Value 9599 for option /Misc/SerialBaudRate is out of range [9600, 921600]");
    EXPECT_EQ(rate->GetValue(), 115200u);

    // The full uint32 range, above what a signed 32-bit number holds.
    AdvancedIntegerOptionImpl *scrub = IntOpt("/Mem/ScrubPattern");
    EXPECT_EQ(scrub->GetValue(), 0xA5A5A5A5u);
    scrub->SetValue(4294967295u);
    EXPECT_EQ(scrub->GetValue(), 4294967295u);
    scrub->SetToDefault();
    EXPECT_EQ(scrub->GetValue(), 0xA5A5A5A5u);

    try {
        heap->SetValue(2000);
        FAIL() << "no exception";
    } catch (HostCtlException const &e) {
        EXPECT_EQ(e.GetVobMessage().GetId(), "adv.option.refused");
        EXPECT_STREQ(e.what(), e.GetMessage().c_str());
        std::string verbose = e.GetMessage(true);
        EXPECT_EQ(verbose.find(e.GetMessage()), 0u);
        EXPECT_NE(verbose.find("Message: adv.option.refused(/Net/TcpipHeapSize)"), std::string::npos);
        // The trace names the library frame that refused the value.
        EXPECT_NE(e.GetStackTrace().find("QorCtl::Model::SetIntValue"), std::string::npos)
            << e.GetStackTrace();
        EXPECT_NE(verbose.find("Stack trace:\n#0 "), std::string::npos) << verbose;
    }
}

TEST_F(LibOptions, StringValidCharactersAreEnforced) {
    AdvancedStringOptionImpl *cc = StrOpt("/Net/Tcpip/CongestionControl");
    ASSERT_NE(cc, nullptr);
    EXPECT_EQ(cc->GetValue(), "newreno");
    EXPECT_EQ(cc->GetValidCharacters(), "abcdefghijklmnopqrstuvwxyz0123456789-_");
    cc->SetValue("cubic");
    EXPECT_EQ(cc->GetValue(), "cubic");
    EXPECT_EQ(ErrorOf([&] { cc->SetValue("Bad Value"); }),
              "Value \"Bad Value\" for option /Net/Tcpip/CongestionControl contains \"B\" at "
              "position 0, which is not a valid character; valid characters are "
              "\"abcdefghijklmnopqrstuvwxyz0123456789-_\"");
    EXPECT_NE(ErrorOf([&] { cc->SetValue(std::string("cu\0bic", 6)); }).find("\"\\x00\" at position 2"),
              std::string::npos);
    EXPECT_EQ(cc->GetValue(), "cubic");
    cc->SetValue("");  // empty has no invalid character
    EXPECT_EQ(cc->GetValue(), "");
    EXPECT_NE(ErrorOf([&] { cc->SetValue(std::string(1025, 'a')); }).find("too long"),
              std::string::npos);
    cc->SetValue(std::string(1024, 'a'));
    cc->SetToDefault();
    EXPECT_EQ(cc->GetValue(), "newreno");
    StrOpt("/Misc/HostDescription")->SetValue("Rack 4, slot 2 (lab)");
    EXPECT_EQ(StrOpt("/Misc/HostDescription")->GetValue(), "Rack 4, slot 2 (lab)");
}

TEST_F(LibOptions, HiddenOptionsAreListedOnlyOnRequest) {
    auto *mem = dynamic_cast<AdvancedOptionBranchImpl *>(
        HostCtl::HostFactory::GetHost()->GetAdvancedOptions()->GetBranchByName("Mem"));
    ASSERT_NE(mem, nullptr);
    std::vector<std::string> visible = Names(mem->GetOptions());
    std::vector<std::string> all = Names(mem->GetOptions(true));
    EXPECT_FALSE(Contains(visible, "ScrubPattern"));
    EXPECT_TRUE(Contains(all, "ScrubPattern"));
    EXPECT_EQ(all.size(), visible.size() + 1);
    EXPECT_EQ(Names(mem->GetOptions(false)), visible);
    // Still reachable by name, and marked.
    auto *scrub = dynamic_cast<QorCtl::Adv::AdvancedOptionImpl *>(mem->GetOptionByName("ScrubPattern"));
    EXPECT_TRUE(scrub->IsHidden());
    EXPECT_FALSE(IntOpt("/Mem/MinFreePct")->IsHidden());
    EXPECT_TRUE(StrOpt("/Misc/Debug/CoreDumpDir")->IsHidden());
}

TEST_F(LibOptions, DowncastsFollowTheVirtualBases) {
    AdvancedOption *asInt = Opt("/Disk/QueueDepth");
    AdvancedOption *asStr = Opt("/UserVars/Locale");
    EXPECT_EQ(CastAdvInt(nullptr), nullptr);
    EXPECT_EQ(CastAdvString(nullptr), nullptr);
    EXPECT_EQ(CastAdvString(asInt), nullptr);
    EXPECT_EQ(CastAdvInt(asStr), nullptr);
    EXPECT_EQ(asInt->GetType(), AdvancedOption::ADV_OPTION_INT_TYPE);
    EXPECT_EQ(asStr->GetType(), AdvancedOption::ADV_OPTION_STRING_TYPE);

    AdvancedIntegerOptionImpl *impl = CastAdvInt(asInt);
    ASSERT_NE(impl, nullptr);
    EXPECT_EQ(static_cast<AdvancedOption *>(impl), asInt);
    // The bases live at different addresses within the object, and every
    // view reaches the same option.
    HostCtlObject *root = impl;
    QorCtl::Lib::QorCtlObject *qor = impl;
    HostCtl::Adv::AdvancedIntegerOption *iface = impl;
    QorCtl::Adv::AdvancedOptionImpl *base = impl;
    std::set<void const *> addresses = {impl, root, qor, asInt, iface, base};
    EXPECT_GT(addresses.size(), 1u);
    EXPECT_EQ(root->GetName(), "/Disk/QueueDepth");
    EXPECT_EQ(qor->GetName(), "/Disk/QueueDepth");
    EXPECT_EQ(base->GetOptionName(), "QueueDepth");
    iface->SetValue(128);
    EXPECT_EQ(impl->GetValue(), 128u);
    EXPECT_EQ(CastAdvInt(static_cast<AdvancedOption *>(iface)), impl);
    EXPECT_EQ(dynamic_cast<void *>(root), dynamic_cast<void *>(asInt));
    EXPECT_EQ(CastAdvString(asStr)->GetValue(), "en_US.UTF-8");
}

TEST_F(LibOptions, HandlesOnOneOptionShareItsValue) {
    AdvancedIntegerOptionImpl own({"Disk", "Scsi"}, "TimeoutSeconds");
    AdvancedIntegerOptionImpl copy(own);
    AdvancedIntegerOptionImpl *library = IntOpt("/Disk/Scsi/TimeoutSeconds");
    EXPECT_NE(&own, library);
    EXPECT_EQ(own.GetName(), "/Disk/Scsi/TimeoutSeconds");
    own.SetValue(45);
    EXPECT_EQ(copy.GetValue(), 45u);
    EXPECT_EQ(library->GetValue(), 45u);
    library->SetToDefault();
    EXPECT_EQ(own.GetValue(), 30u);
    EXPECT_NO_THROW(copy.Refresh());

    AdvancedStringOptionImpl str({"Disk", "Multipath"}, "DefaultPolicy");
    AdvancedStringOptionImpl strCopy(str);
    strCopy.SetValue("round_robin");
    EXPECT_EQ(StrOpt("/Disk/Multipath/DefaultPolicy")->GetValue(), "round_robin");

    AdvancedOptionBranchImpl rootHandle;
    AdvancedOptionBranchImpl disk({}, "Disk");
    AdvancedOptionBranchImpl diskCopy(disk);
    EXPECT_EQ(rootHandle.GetName(), "/");
    EXPECT_EQ(diskCopy.GetName(), "/Disk");
    EXPECT_EQ(diskCopy.GetBranchName(), "Disk");
    EXPECT_EQ(diskCopy.GetBranchByName("Scsi"), disk.GetBranchByName("Scsi"));

    // A handle is made only for an existing option of the right kind.
    EXPECT_EQ(ErrorOf([] { AdvancedIntegerOptionImpl({"Disk"}, "Nope"); }),
              "No advanced option /Disk/Nope on this host");
    EXPECT_EQ(ErrorOf([] { AdvancedIntegerOptionImpl({"Disk"}, "DeviceFilter"); }),
              "Option /Disk/DeviceFilter is a string option, not an integer option");
    EXPECT_EQ(ErrorOf([] { AdvancedStringOptionImpl({"Disk"}, "MaxLun"); }),
              "Option /Disk/MaxLun is an integer option, not a string option");
    EXPECT_NE(ErrorOf([] { AdvancedIntegerOptionImpl({"Disk"}, ""); }), "");
}

TEST_F(LibOptions, PrintShowsLabelsAndValues) {
    std::ostringstream out;
    QorCtl::Util::ObjectPrinter printer(out);
    IntOpt("/Net/Tcpip/RetransmitLimit")->Print(&printer);
    EXPECT_EQ(out.str(),
              "Option /Net/Tcpip/RetransmitLimit:\n"
              "   Type: integer\n"
              "   Value: 15\n"
              "   Default: 15\n"
              "   Minimum: 3\n"
              "   Maximum: 50\n"
              "   Hidden: no\n"
              "   Description: Retransmissions before a TCP connection fails.\n");
    out.str("");
    auto *tcpip = dynamic_cast<AdvancedOptionBranchImpl *>(
        HostCtl::HostFactory::GetHost()->GetAdvancedOptions()->GetBranchByName("Net")->GetBranchByName(
            "Tcpip"));
    ASSERT_NE(tcpip, nullptr);
    tcpip->Print(&printer);
    EXPECT_EQ(out.str(),
              "Branch /Net/Tcpip:\n"
              "   DelayedAck: 1\n"
              "   KeepAliveSeconds: 7200\n"
              "   RetransmitLimit: 15\n"
              "   InitialWindowKiB: 64\n"
              "   CongestionControl: \"newreno\"\n");
    out.str("");
    static_cast<HostCtlObject *>(StrOpt("/Misc/Debug/CoreDumpDir"))->Print(out);
    EXPECT_NE(out.str().find("   Valid characters: \""), std::string::npos);
    EXPECT_NE(out.str().find("   Hidden: yes\n"), std::string::npos);

    // Multi-line values continue one level deeper.
    out.str("");
    printer.Field("Lines", std::string("one\ntwo"));
    EXPECT_EQ(out.str(), "Lines:\n   one\n   two\n");
}
