// Shared pieces of the library tests: a fixture that puts the host back to
// its built-in defaults and a scratch directory for configuration files.
#ifndef QORCTL_TESTS_LIB_SUPPORT_H
#define QORCTL_TESTS_LIB_SUPPORT_H

#include <gtest/gtest.h>

#include <cstdlib>
#include <string>

#include "../../libqorctl/host/model.h"
#include "adv/option_impl.h"
#include "host.h"
#include "lib/exception.h"

namespace libtest {

// The library's option object for a path.
inline HostCtl::Adv::AdvancedOption *Opt(std::string const &path) {
    return QorCtl::Adv::AdvancedOptionImpl::FindOption(path);
}
inline QorCtl::Adv::AdvancedIntegerOptionImpl *IntOpt(std::string const &path) {
    return CastAdvInt(Opt(path));
}
inline QorCtl::Adv::AdvancedStringOptionImpl *StrOpt(std::string const &path) {
    return CastAdvString(Opt(path));
}

// The message of the HostCtlException that f throws ("" if none).
template <class F>
std::string ErrorOf(F f) {
    try {
        f();
    } catch (HostCtl::Lib::HostCtlException const &e) {
        return e.GetMessage();
    }
    return std::string();
}

class LibFixture : public ::testing::Test {
protected:
    void SetUp() override {
        QorCtl::Model::ResetToDefault();
        char tmpl[] = "/tmp/qorctl-libtest-XXXXXX";
        ASSERT_NE(mkdtemp(tmpl), nullptr);
        dir_ = tmpl;
    }
    void TearDown() override {
        QorCtl::Model::ResetToDefault();
        Host()->SetConfigFile("");
        std::string cmd = "rm -rf '" + dir_ + "'";
        EXPECT_EQ(std::system(cmd.c_str()), 0);
    }
    static QorCtl::HostImpl *Host() {
        return dynamic_cast<QorCtl::HostImpl *>(HostCtl::HostFactory::GetHost());
    }
    std::string dir_;
};

}  // namespace libtest

#endif
