// The extension entry and the forwarders, through a message object whose
// operations record what they received.
#include <gtest/gtest.h>

#include <cstdarg>
#include <string>

#include "nlssm/host.h"
#include "nlssm/nlssm.h"

namespace {

struct Received {
  int slot = -1;
  void *object = nullptr;
  uint32_t number = 0, status = 0;
  void *args[5] = {};
  int count = 0;     // first variable argument
  std::string text;  // second variable argument
};

struct MessageObject {
  void *slots[8] = {};
  Received got;

  static Received &record(void *object, int slot, va_list args) {
    Received &r = static_cast<MessageObject *>(object)->got;
    r.slot = slot;
    r.object = object;
    r.count = va_arg(args, int);
    r.text = va_arg(args, const char *);
    return r;
  }
  static int64_t to_buf(void *o, void *a1, void *a2, void *a3, void *a4, void *a5, va_list v) {
    Received &r = record(o, NLSHOST_SLOT_MESSAGE_TO_BUF, v);
    r.args[0] = a1, r.args[1] = a2, r.args[2] = a3, r.args[3] = a4, r.args[4] = a5;
    return 101;
  }
  static int64_t to_jnl(void *o, uint32_t number, void *a1, void *a2, va_list v) {
    Received &r = record(o, NLSHOST_SLOT_MESSAGE_TO_JNL, v);
    r.number = number, r.args[0] = a1, r.args[1] = a2;
    return 102;
  }
  static int64_t status_to_buf(void *o, uint32_t status, void *a1, void *a2, void *a3, va_list v) {
    Received &r = record(o, NLSHOST_SLOT_STATUS_TO_BUF, v);
    r.status = status, r.args[0] = a1, r.args[1] = a2, r.args[2] = a3;
    return 103;
  }
  static int64_t status_to_jnl(void *o, uint32_t number, uint32_t status, va_list v) {
    Received &r = record(o, NLSHOST_SLOT_STATUS_TO_JNL, v);
    r.number = number, r.status = status;
    return 104;
  }
  static int64_t get_locale(void *o, va_list v) {
    record(o, NLSHOST_SLOT_GET_LOCALE, v);
    return 105;
  }

  MessageObject() {
    slots[NLSHOST_SLOT_MESSAGE_TO_BUF] = reinterpret_cast<void *>(to_buf);
    slots[NLSHOST_SLOT_MESSAGE_TO_JNL] = reinterpret_cast<void *>(to_jnl);
    slots[NLSHOST_SLOT_STATUS_TO_BUF] = reinterpret_cast<void *>(status_to_buf);
    slots[NLSHOST_SLOT_STATUS_TO_JNL] = reinterpret_cast<void *>(status_to_jnl);
    slots[NLSHOST_SLOT_GET_LOCALE] = reinterpret_cast<void *>(get_locale);
  }
};

void *arg(int i) {
  return reinterpret_cast<void *>(static_cast<uintptr_t>(0x1000 + i));
}

TEST(Messages, ForwardersPassEveryArgumentToTheirSlot) {
  MessageObject m;
  EXPECT_EQ(qvlMessageToBuf(&m, arg(1), arg(2), arg(3), arg(4), arg(5), 11, "buf"), 101);
  EXPECT_EQ(m.got.slot, NLSHOST_SLOT_MESSAGE_TO_BUF);
  for (int i = 0; i < 5; ++i) EXPECT_EQ(m.got.args[i], arg(i + 1));
  EXPECT_EQ(m.got.count, 11);
  EXPECT_EQ(m.got.text, "buf");

  m.got = {};
  EXPECT_EQ(qvlMessageToJnl(&m, 0x1234, arg(1), arg(2), 12, "jnl"), 102);
  EXPECT_EQ(m.got.slot, NLSHOST_SLOT_MESSAGE_TO_JNL);
  EXPECT_EQ(m.got.number, 0x1234u);
  EXPECT_EQ(m.got.args[1], arg(2));
  EXPECT_EQ(m.got.text, "jnl");

  m.got = {};
  EXPECT_EQ(qvlStatusToBuf(&m, NLSSM_E_NO_MEMORY, arg(1), arg(2), arg(3), 13, "sbuf"), 103);
  EXPECT_EQ(m.got.slot, NLSHOST_SLOT_STATUS_TO_BUF);
  EXPECT_EQ(m.got.status, NLSSM_E_NO_MEMORY);
  EXPECT_EQ(m.got.args[2], arg(3));
  EXPECT_EQ(m.got.count, 13);

  m.got = {};
  EXPECT_EQ(qvlStatusToJnl(&m, NLSHOST_JOURNAL_LEVEL_ERROR, NLSSM_E_NO_MEMORY, 14, "sjnl"), 104);
  EXPECT_EQ(m.got.slot, NLSHOST_SLOT_STATUS_TO_JNL);
  EXPECT_EQ(m.got.object, &m);
  EXPECT_EQ(m.got.number, 4u);
  EXPECT_EQ(m.got.status, NLSSM_E_NO_MEMORY);
  EXPECT_EQ(m.got.text, "sjnl");

  m.got = {};
  EXPECT_EQ(qvlGetLocale(&m, 15, "en_US"), 105);
  EXPECT_EQ(m.got.slot, NLSHOST_SLOT_GET_LOCALE);
  EXPECT_EQ(m.got.count, 15);
  EXPECT_EQ(m.got.text, "en_US");
}

TEST(Messages, MissingObjectOrOperationCallsNothing) {
  for (MessageObject *object : {static_cast<MessageObject *>(nullptr), new MessageObject}) {
    if (object != nullptr) std::fill(std::begin(object->slots), std::end(object->slots), nullptr);
    EXPECT_EQ(qvlStatusToJnl(object, 4, NLSSM_E_NO_MEMORY), 0);
    EXPECT_EQ(qvlMessageToJnl(object, 1, nullptr, nullptr), 0);
    EXPECT_EQ(qvlMessageToBuf(object, nullptr, nullptr, nullptr, nullptr, nullptr),
              int64_t{NLSSM_E_NULL_ARGUMENT});
    EXPECT_EQ(qvlStatusToBuf(object, 0, nullptr, nullptr, nullptr), int64_t{NLSSM_E_NULL_ARGUMENT});
    EXPECT_EQ(qvlGetLocale(object), 0);
    delete object;
  }
}

TEST(Messages, ExtensionEntryKeepsTheHostHandle) {
  int host = 0, other = 0;
  int64_t major = 0, minor = 0;
  EXPECT_EQ(qvextver(&host, &major, &minor), 0);
  EXPECT_EQ(major, 6);
  EXPECT_EQ(minor, 1);
  EXPECT_EQ(Exported_QVHandle, &host);
  EXPECT_EQ(qvextent(&other), 0);
  EXPECT_EQ(Exported_QVHandle, &other);
  EXPECT_EQ(qvextver(nullptr, nullptr, nullptr), 0);
  EXPECT_EQ(Exported_QVHandle, nullptr);
}

}  // namespace
