#include <gtest/gtest.h>
#include <windows.h>

#include <string>

#include "platform/system.h"

namespace kestrune::platform {
namespace {

// Each run works below a key of its own under HKEY_CURRENT_USER and removes it afterwards.
class RegistryStoreTest : public ::testing::Test {
 protected:
  void TearDown() override { RegDeleteTreeW(HKEY_CURRENT_USER, subkey_.c_str()); }

  std::u16string Subkey() const { return std::u16string(subkey_.begin(), subkey_.end()); }

  void SetRaw(const wchar_t* name, DWORD type, const void* data, DWORD size) {
    HKEY key = nullptr;
    ASSERT_EQ(RegCreateKeyExW(HKEY_CURRENT_USER, subkey_.c_str(), 0, nullptr, 0, KEY_WRITE, nullptr,
                              &key, nullptr),
              ERROR_SUCCESS);
    RegSetValueExW(key, name, 0, type, static_cast<const BYTE*>(data), size);
    RegCloseKey(key);
  }

  std::wstring subkey_ = L"Software\\KestruneTest-" + std::to_wstring(GetCurrentProcessId());
  std::unique_ptr<SettingsStore> store_ = MakeSystemSettingsStore();
};

TEST_F(RegistryStoreTest, WritesTerminatedStringsThatTheRegistryReadsBack) {
  EXPECT_EQ(store_->OpenKey(RegistryRoot::kCurrentUser, Subkey()), nullptr);
  auto key = store_->CreateKey(RegistryRoot::kCurrentUser, Subkey());
  ASSERT_NE(key, nullptr);
  ASSERT_TRUE(key->SetString(u"OuputPath", u"D:\\Music \u00E9"));

  wchar_t buffer[64] = {};
  DWORD type = 0, size = sizeof buffer;
  ASSERT_EQ(RegGetValueW(HKEY_CURRENT_USER, subkey_.c_str(), L"OuputPath",
                         RRF_RT_ANY | RRF_NOEXPAND, &type, buffer, &size),
            ERROR_SUCCESS);
  EXPECT_EQ(type, static_cast<DWORD>(REG_SZ));
  EXPECT_EQ(size, (std::wstring(L"D:\\Music \u00E9").size() + 1) * 2);
  EXPECT_EQ(std::wstring(buffer), L"D:\\Music \u00E9");
}

TEST_F(RegistryStoreTest, QueriesValuesOfAnyTypeAndLengthWhole) {
  const std::wstring longText(700, L'x');
  SetRaw(L"Long", REG_EXPAND_SZ, longText.c_str(), static_cast<DWORD>((longText.size() + 1) * 2));
  const DWORD number = 7;
  SetRaw(L"Number", REG_DWORD, &number, sizeof number);
  auto key = store_->OpenKey(RegistryRoot::kCurrentUser, Subkey());
  ASSERT_NE(key, nullptr);
  const auto value = key->QueryValue(u"long");
  ASSERT_TRUE(value);
  EXPECT_EQ(value->type, kRegExpandSz);
  EXPECT_EQ(value->data.size(), 1402u);
  const auto dword = key->QueryValue(u"Number");
  ASSERT_TRUE(dword);
  EXPECT_EQ(dword->type, kRegDword);
  EXPECT_EQ(dword->data, (std::vector<unsigned char>{7, 0, 0, 0}));
  EXPECT_FALSE(key->QueryValue(u"Missing"));
}

}  // namespace
}  // namespace kestrune::platform
