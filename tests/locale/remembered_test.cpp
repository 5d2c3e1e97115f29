// Objects that a thread has validated before, after removals that it did or did not make itself.

#include "nls2.h"

#include <gtest/gtest.h>
#include <thread>
#include <vector>

namespace {

// The head of the list stays the same object, so that it does not give a removal away.
class Remembered : public testing::Test {
protected:
  void SetUp() override { head_ = make(); }
  void TearDown() override { EXPECT_EQ(NLS2_ReleaseLocale(head_), 0); }

  static NLS2_Locale *make() {
    int32_t status = 0;
    NLS2_Locale *object = NLS2_GetLocale(0x03480001, 37, 0, &status);
    EXPECT_EQ(status, 0);
    EXPECT_EQ(NLS2_ValidateLocale(object), 0);
    EXPECT_EQ(NLS2_ValidateLocale(nullptr), NLS2_ERR_INVALID_LOCALE);
    return object;
  }

private:
  NLS2_Locale *head_ = nullptr;
};

} // namespace

TEST_F(Remembered, IsForgottenWhenAnotherThreadReleasesIt) {
  NLS2_Locale *object = make();
  std::thread([object] { EXPECT_EQ(NLS2_ReleaseLocale(object), 0); }).join();
  EXPECT_EQ(NLS2_ValidateLocale(object), NLS2_ERR_INVALID_LOCALE);
}

// More objects than a thread remembers, each valid until its own release and not after.
TEST_F(Remembered, IsEachOfManyUntilItsOwnRelease) {
  std::vector<NLS2_Locale *> objects(9);
  for (NLS2_Locale *&object : objects) {
    object = make();
  }
  for (std::size_t released = 0; released < objects.size(); ++released) {
    EXPECT_EQ(NLS2_ReleaseLocale(objects[released]), 0);
    for (std::size_t i = 0; i < objects.size(); ++i) {
      EXPECT_EQ(NLS2_ValidateLocale(objects[i]), i <= released ? NLS2_ERR_INVALID_LOCALE : 0)
          << i << " after the release of " << released;
    }
  }
}

TEST_F(Remembered, IsForgottenWhileTheListIsSetAside) {
  NLS2_Locale *object = make();
  NLS2_Locale *list = pLocaleObjectList;
  pLocaleObjectList = nullptr;
  EXPECT_EQ(NLS2_ValidateLocale(object), NLS2_ERR_INVALID_LOCALE);
  pLocaleObjectList = list;
  EXPECT_EQ(NLS2_ValidateLocale(object), 0);
  EXPECT_EQ(NLS2_ReleaseLocale(object), 0);
}
