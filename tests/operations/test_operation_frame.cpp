// The frame of the operations: tests of argument and feature, reply buffers.
#include "operations/operation_frame.h"
#include "tests/device/log_capture.h"
#include "tests/operations/fake_bound.h"

#include <cstring>
#include <gtest/gtest.h>

using namespace cimple;

namespace {

const HBA_WWN NAME{{1}};

class Frame : public testing::Test {
protected:
    void SetUp() override {
        fake = Fake_Bound();
        log_capture::take();
    }
};

using Lines = std::vector<std::string>;

} // namespace

TEST_F(Frame, EntryTestsAndExit) {
    const Feature_Test test{437, "Unable to determine if adapter supports it",
                            "It is not supported on this adapter"};
    {
        Operation_Frame frame("entry", "exit");
        EXPECT_FALSE(frame.given(nullptr));
        EXPECT_EQ(frame.status(), AX_STATUS_INVALID_ARGUMENT);
    }
    EXPECT_EQ(log_capture::take(), (Lines{"5:entry", "5:Invalid Output pointer", "5:exit"}));
    {
        Operation_Frame frame("entry");
        EXPECT_FALSE(frame.offers(&NAME, test));
        EXPECT_EQ(frame.status(), AX_STATUS_NOT_SUPPORTED);
        fake.featureFailures = {{437, 190}};
        EXPECT_FALSE(frame.offers(&NAME, test));
        EXPECT_EQ(frame.status(), 190U);
        fake.featureFailures.clear();
        fake.features = {{437, 2}};
        EXPECT_TRUE(frame.offers(&NAME, test));
    }
    EXPECT_EQ(log_capture::take(),
              (Lines{"5:entry", "3:It is not supported on this adapter",
                     "3:Unable to determine if adapter supports it", "5:Status: <190>"}));
}

// A list with a head of two words and a count in the first, against a library that answers as the
// row says.
TEST_F(Frame, ReplyRepeatsOnceWithinBounds) {
    struct Answer {
        AX_STATUS status;
        uint32 count;
    };
    const struct {
        Answer first, second;
        AX_STATUS result;
        int calls;
        uint32 room;
        bool data;
    } cases[] = {
        {{0, 3}, {}, 0, 1, 4, true},
        {{5, 0}, {}, 5, 1, 4, true},
        {{7, 100}, {0, 100}, 0, 2, 132, true},  // 32 spare
        {{191, 100}, {0, 90}, 0, 2, 132, true}, // the other word for it
        {{7, 100}, {7, 500}, 7, 2, 132, true},  // no third attempt
        {{7, 0x80000000U}, {}, 1, 1, 0, false}, // asks for 1 TB
        {{7, 0xFFFFFFFFU}, {}, 1, 1, 0, false}, // and wraps with the spare entries
        {{0, 5}, {}, 1, 1, 4, false},           // wrote past its room, or says so
        {{7, 10}, {0, 0xFFFFFFFFU}, 1, 2, 42, false},
    };
    for (const auto& c : cases) {
        const Reply_Shape shape{.head = offsetof(AX_iSCSI_TargetList, entry),
                                .entry = sizeof(AX_iSCSI_Target),
                                .first = 4,
                                .spare = 32,
                                .tooSmallToo = AX_STATUS_LIST_TOO_SMALL};
        int calls = 0;
        Reply reply;
        log_capture::take();
        const AX_STATUS status = reply.fetch(
            shape, {"no memory"}, counted<AX_iSCSI_TargetList>([&](AX_iSCSI_TargetList* list) {
                std::memset(list->entry, 1, list->count * sizeof *list->entry);
                const Answer& answer = calls++ == 0 ? c.first : c.second;
                list->count = answer.count;
                return answer.status;
            }));
        EXPECT_EQ(status, c.result) << c.first.count;
        EXPECT_EQ(calls, c.calls) << c.first.count;
        EXPECT_EQ(reply.room(), c.room) << c.first.count;
        EXPECT_EQ(reply.data() != nullptr, c.data) << c.first.count;
        // A refusal of what the library says is never silent.
        EXPECT_EQ(log_capture::take().size(), c.data ? 0U : 1U) << c.first.count;
    }
}

TEST_F(Frame, ReplyIsHandedOver) {
    Reply reply;
    EXPECT_EQ(reply.fetch({8, 516, 1}, {"no memory"}, [](void*, uint32&) { return AX_STATUS_OK; }),
              0U);
    void* data = reply.release();
    EXPECT_NE(data, nullptr);
    EXPECT_EQ(reply.data(), nullptr);
    std::free(data);
}
