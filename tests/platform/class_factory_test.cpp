// The entry points, reached as a host reaches them: by loading the built library at run time.
#include <dlfcn.h>
#include <gtest/gtest.h>

#include "partnerkit/class_factory.h"
#include "partnerkit/translator.h"
#include "support/trading_fixture.h"

namespace partnerkit {
namespace {

class ClassFactory : public ::testing::Test {
 protected:
  void SetUp() override { ASSERT_NE(library_, nullptr) << dlerror(); }
  ~ClassFactory() override {
    if (library_ != nullptr) dlclose(library_);
  }

  template <class F>
  F* Entry(const char* name) {
    return reinterpret_cast<F*>(dlsym(library_, name));
  }

  void* library_ = dlopen(PARTNERKIT_LIBRARY, RTLD_NOW | RTLD_LOCAL);
};

TEST_F(ClassFactory, CreatesByProgIdAndMayUnloadOnceTheObjectIsGone) {
  const auto create = Entry<decltype(DllGetClassObject)>("DllGetClassObject");
  const auto mayUnload = Entry<decltype(DllCanUnloadNow)>("DllCanUnloadNow");
  ASSERT_TRUE(create && mayUnload);
  EXPECT_EQ(mayUnload(), kPartnerKitOk);

  Translator* object = nullptr;
  EXPECT_EQ(create("partnerkit.CLSMGB850CSV", nullptr, &object), kPartnerKitOk);
  ASSERT_NE(object, nullptr);
  EXPECT_EQ(object->ProgId(), "PartnerKit.clsMGB850csv");
  EXPECT_EQ(mayUnload(), kPartnerKitFalse);
  delete object;
  EXPECT_EQ(mayUnload(), kPartnerKitOk);

  EXPECT_EQ(create("PartnerKit.clsNobody", nullptr, &object), kPartnerKitNoSuchClass);
  EXPECT_EQ(object, nullptr);
  EXPECT_EQ(create(nullptr, nullptr, &object), kPartnerKitBadPointer);
  EXPECT_EQ(create("PartnerKit.clsMGB850csv", nullptr, nullptr), kPartnerKitBadPointer);
}

TEST_F(ClassFactory, RegistersItsClassesBesideThoseOfOthers) {
  const auto enter = Entry<decltype(DllRegisterServer)>("DllRegisterServer");
  const auto leave = Entry<decltype(DllUnregisterServer)>("DllUnregisterServer");
  ASSERT_TRUE(enter && leave);
  const testing::TempFolder folder;
  setenv("XDG_DATA_HOME", (folder / "").c_str(), 1);
  std::filesystem::create_directories(folder / "partnerkit");
  folder.Write("partnerkit/classes",
               "Other.clsThing\t/opt/other.so\nPartnerKit.clsMGB850csv\t/gone/libpartnerkit.so\n");

  EXPECT_EQ(enter(), kPartnerKitOk);
  const std::string library = std::filesystem::absolute(PARTNERKIT_LIBRARY).lexically_normal().string();
  const std::string entered = folder.Read("partnerkit/classes");
  EXPECT_THAT(entered, ::testing::StartsWith("Other.clsThing\t/opt/other.so\n"));
  EXPECT_THAT(entered, ::testing::HasSubstr("PartnerKit.clsMGB850csv\t" + library + "\n"));
  EXPECT_THAT(entered, ::testing::Not(::testing::HasSubstr("/gone/")));

  EXPECT_EQ(leave(), kPartnerKitOk);
  EXPECT_EQ(folder.Read("partnerkit/classes"), "Other.clsThing\t/opt/other.so\n");

  setenv("XDG_DATA_HOME", "/proc/nowhere", 1);
  EXPECT_EQ(enter(), kPartnerKitCannotRegister);
  unsetenv("XDG_DATA_HOME");
}

}  // namespace
}  // namespace partnerkit
