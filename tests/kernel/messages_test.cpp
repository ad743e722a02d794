// The extension entry and the forwarders, through a message object whose
// operations record what they received.
#include <gtest/gtest.h>

#include <cstdarg>
#include <string>

#include "nlssm/host.h"
#include "nlssm/nlssm.h"

namespace {

struct MessageObject {
  void *slots[8] = {};
  uint32_t number = 0, status = 0;
  void *args[5] = {};
  int count = 0;     // first variable argument
  std::string text;  // second variable argument

  static int64_t take(void *object, int slot, uint32_t number, uint32_t status,
                      std::initializer_list<void *> args, va_list rest) {
    auto &m = *static_cast<MessageObject *>(object);
    m.number = number, m.status = status;
    std::copy(args.begin(), args.end(), m.args);
    m.count = va_arg(rest, int);
    m.text = va_arg(rest, const char *);
    return 100 + slot;
  }
  MessageObject() {
    NLSHostMessageToBufFn to_buf = [](void *o, void *a, void *b, void *c, void *d, void *e,
                                      va_list v) {
      return take(o, 2, 0, 0, {a, b, c, d, e}, v);
    };
    NLSHostMessageToJnlFn to_jnl = [](void *o, uint32_t n, void *a, void *b, va_list v) {
      return take(o, 3, n, 0, {a, b}, v);
    };
    NLSHostStatusToBufFn status_to_buf = [](void *o, uint32_t s, void *a, void *b, void *c,
                                            va_list v) {
      return take(o, 4, 0, s, {a, b, c}, v);
    };
    NLSHostStatusToJnlFn status_to_jnl = [](void *o, uint32_t n, uint32_t s, va_list v) {
      return take(o, 5, n, s, {}, v);
    };
    NLSHostGetLocaleFn get_locale = [](void *o, va_list v) { return take(o, 7, 0, 0, {}, v); };
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
  EXPECT_EQ(qvlMessageToBuf(&m, arg(1), arg(2), arg(3), arg(4), arg(5), 11, "buf"), 102);
  for (int i = 0; i < 5; ++i) EXPECT_EQ(m.args[i], arg(i + 1));
  EXPECT_EQ(m.count, 11);
  EXPECT_EQ(m.text, "buf");

  EXPECT_EQ(qvlMessageToJnl(&m, 0x1234, arg(6), arg(7), 12, "jnl"), 103);
  EXPECT_EQ(m.number, 0x1234u);
  EXPECT_EQ(m.args[1], arg(7));
  EXPECT_EQ(m.text, "jnl");

  EXPECT_EQ(qvlStatusToBuf(&m, NLSSM_E_NO_MEMORY, arg(8), arg(9), arg(10), 13, "sbuf"), 104);
  EXPECT_EQ(m.status, NLSSM_E_NO_MEMORY);
  EXPECT_EQ(m.args[2], arg(10));
  EXPECT_EQ(m.count, 13);

  EXPECT_EQ(qvlStatusToJnl(&m, NLSHOST_JOURNAL_LEVEL_ERROR, NLSSM_E_BAD_OPTIONS, 14, "sjnl"), 105);
  EXPECT_EQ(m.number, 4u);
  EXPECT_EQ(m.status, NLSSM_E_BAD_OPTIONS);
  EXPECT_EQ(m.text, "sjnl");

  EXPECT_EQ(qvlGetLocale(&m, 15, "en_US"), 107);
  EXPECT_EQ(m.count, 15);
  EXPECT_EQ(m.text, "en_US");
}

TEST(Messages, MissingObjectOrOperationCallsNothing) {
  MessageObject empty;
  std::fill(std::begin(empty.slots), std::end(empty.slots), nullptr);
  for (void *object : {static_cast<void *>(nullptr), static_cast<void *>(&empty)}) {
    EXPECT_EQ(qvlStatusToJnl(object, 4, NLSSM_E_NO_MEMORY), 0);
    EXPECT_EQ(qvlMessageToJnl(object, 1, nullptr, nullptr), 0);
    EXPECT_EQ(qvlMessageToBuf(object, nullptr, nullptr, nullptr, nullptr, nullptr),
              int64_t{NLSSM_E_NULL_ARGUMENT});
    EXPECT_EQ(qvlStatusToBuf(object, 0, nullptr, nullptr, nullptr), int64_t{NLSSM_E_NULL_ARGUMENT});
    EXPECT_EQ(qvlGetLocale(object), 0);
  }
}

TEST(Messages, ExtensionEntryKeepsTheHostHandle) {
  int host = 0, other = 0;
  int64_t major = 0, minor = 0;
  EXPECT_EQ(qvextver(&host, &major, &minor), 0);
  EXPECT_EQ(Exported_QVHandle, &host);
  EXPECT_EQ(qvextent(&other), 0);
  EXPECT_EQ(Exported_QVHandle, &other);
  EXPECT_EQ(qvextver(nullptr, nullptr, nullptr), 0);
  EXPECT_EQ(Exported_QVHandle, nullptr);
}

}  // namespace
