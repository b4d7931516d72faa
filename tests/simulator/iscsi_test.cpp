// What an iSCSI function sees: targets, sessions and logical units.
#include "tests/simulator/simulated.h"

#include <cstring>
#include <memory>

namespace {

// A list with room for so many entries, and what lies behind it.
template <class List>
class Room {
public:
    explicit Room(std::uint32_t entries)
        : _words((offsetof(List, entry) + (entries + 1) * sizeof(List{}.entry[0])) / 4 + 1,
                 0x77777777u) {
        get()->count = entries;
    }
    List* get() { return reinterpret_cast<List*>(_words.data()); }
    List* operator->() { return get(); }

private:
    std::vector<std::uint32_t> _words;
};

class Iscsi : public Simulated {
protected:
    void SetUp() override {
        Simulated::SetUp();
        start("iscsi-sessions.json");
        wwn = wwn_of(2);
    }
    AX_WWN wwn{};
    const char* array_b = "iqn.2010-04.com.example:array-b";
};

TEST_F(Iscsi, ListsTellWhatTheyNeedAndKeepToTheirRoom) {
    Room<AX_iSCSI_TargetList> small(128);
    EXPECT_EQ(AX_STATUS_MORE_DATA, LOCAL(AX_iSCSI_GetTargets)(wwn, small.get()));
    EXPECT_EQ(130u, small->count);
    EXPECT_EQ(0x77, small->entry[0].name[0]) << "nothing is written";
    Room<AX_iSCSI_TargetList> whole(131);
    ASSERT_EQ(0u, LOCAL(AX_iSCSI_GetTargets)(wwn, whole.get()));
    EXPECT_EQ(130u, whole->count);
    EXPECT_STREQ("iqn.2010-04.com.example:array-a", whole->entry[0].name);
    EXPECT_EQ(AX_ISCSI_TARGET_HAS_SESSIONS | AX_ISCSI_TARGET_BOOT, whole->entry[0].flags);
    EXPECT_EQ(AX_ISCSI_TARGET_HAS_SESSIONS, whole->entry[1].flags);
    EXPECT_STREQ("iqn.2010-04.com.example:shelf-129", whole->entry[129].name);
    EXPECT_EQ(0, whole->entry[129].flags);
    EXPECT_EQ(static_cast<char>(0xA5), whole->entry[130].name[0]) << "soiled";
    EXPECT_EQ(0x77, whole->entry[131].name[0]) << "beyond the stated room";
    EXPECT_EQ(0u, vlnsim_violations());
}

TEST_F(Iscsi, SessionsAndUnitsAnswerAsTheScenarioSays) {
    Room<AX_iSCSI_SessionList> sessions(8);
    ASSERT_EQ(0u, LOCAL(AX_iSCSI_GetSessions)(wwn, array_b, sessions.get()));
    ASSERT_EQ(5u, sessions->count);
    EXPECT_EQ(0, sessions->entry[0].closed);
    EXPECT_EQ(1, sessions->entry[2].closed);
    AX_iSCSI_SessionInfo info{};
    ASSERT_EQ(0u, LOCAL(AX_iSCSI_GetSessionInfo)(wwn, array_b, &sessions->entry[0], &info));
    EXPECT_EQ(sessions->entry[0].isid, info.isid);
    EXPECT_EQ(AX_IP_FLAG_V6, info.targetAddress.flags);
    EXPECT_EQ(0x20, info.targetAddress.address[0]);
    EXPECT_EQ(3261, info.targetAddress.tcpPort);
    EXPECT_EQ(262144u, info.negotiated.maxBurstLength) << "of the initiator's login options";

    Room<AX_iSCSI_LunList> luns(3);
    ASSERT_EQ(0u, LOCAL(AX_iSCSI_GetLuns)(wwn, array_b, luns.get()));
    ASSERT_EQ(3u, luns->count);
    EXPECT_STREQ("300", luns->entry[2].text);
    AX_iSCSI_LunProperties unit;
    EXPECT_EQ(AX_STATUS_NOT_ANSWERING, LOCAL(AX_iSCSI_GetLunProperties)(wwn, array_b, 3, &unit));
    ASSERT_EQ(0u, LOCAL(AX_iSCSI_GetLunProperties)(wwn, array_b, 5, &unit));
    EXPECT_STREQ("VO\xFFL", unit.vendor);
    EXPECT_EQ(0u, vlnsim_violations());
}

TEST_F(Iscsi, WhatNobodyHasIsABreachOfContract) {
    Room<AX_iSCSI_TargetList> targets(1);
    EXPECT_EQ(AX_STATUS_NOT_SUPPORTED, LOCAL(AX_iSCSI_GetTargets)(wwn_of(0), targets.get()));
    EXPECT_EQ(0u, vlnsim_violations()) << "a NIC function may be asked";
    Room<AX_iSCSI_SessionList> sessions(8);
    EXPECT_EQ(AX_STATUS_ERROR, LOCAL(AX_iSCSI_GetSessions)(wwn, "iqn.nobody", sessions.get()));
    AX_iSCSI_LunProperties unit;
    EXPECT_EQ(AX_STATUS_ERROR, LOCAL(AX_iSCSI_GetLunProperties)(wwn, array_b, 6, &unit));
    ASSERT_EQ(0u, LOCAL(AX_iSCSI_GetSessions)(wwn, array_b, sessions.get()));
    AX_iSCSI_SessionInfo info{};
    info.reserved[0] = 1;
    EXPECT_EQ(0u, LOCAL(AX_iSCSI_GetSessionInfo)(wwn, array_b, &sessions->entry[0], &info));
    sessions->entry[0].sessionId = 99;
    info = {};
    EXPECT_EQ(AX_STATUS_ERROR,
              LOCAL(AX_iSCSI_GetSessionInfo)(wwn, array_b, &sessions->entry[0], &info));
    EXPECT_EQ(4u, vlnsim_violations());
}

} // namespace
