// What a target makes of a unit's answers.

#include "tests/device/fake_san.h"
#include "tests/device/model_fixture.h"

#include "device/fcoe_adapter.h"

#include <cstdlib>
#include <cstring>
#include <memory>

namespace cimple {

class Target_Test : public Model_Test {
protected:
    void SetUp() override {
        Model_Test::SetUp();
        fake_san = Fake_San{};
        fake_library.add(3, FCOE).adapterValues = {{553, number(1)}};
        fake_library.addHba("fcoe3", 3);
        adapter = std::make_unique<FCoEAdapter>("Vorlan", 0, identifier, info());
        fake_library.openHandles = 0;
        log_capture::take();
    }
    Target make(const Fake_Unit& unit) { return Target(*adapter, unit.entry); }

    std::unique_ptr<FCoEAdapter> adapter;
};

TEST_F(Target_Test, FieldsComeFromTheMappingAndTheUnit) {
    Fake_Unit& unit = fake_san.add(0x0102030400000000);
    unit.entry.FcpId.FcId = 0x010203;
    unit.entry.ScsiId.ScsiBusNumber = 4;
    unit.entry.ScsiId.ScsiTargetNumber = 5;
    unit.entry.ScsiId.ScsiOSLun = 6;
    std::memset(unit.entry.ScsiId.OSDeviceName, 'd', sizeof unit.entry.ScsiId.OSDeviceName);
    unit.responses[INQUIRY] = standard_inquiry(0x60 | 5, "VENDOR12", "PRODUCT 12345678", "4321");
    unit.responses[SERIAL_PAGE] = std::string("\0\x80\0\x05", 4) + "SN123" + '\0' + "behind";
    unit.responses[IDENTITY_PAGE] = identity_page(16, "\x60\x06\x01\x60 0123456789A");
    unit.responses[READ_CAPACITY] = std::string("\x80\xFF\xFF\xFE\0\0\x02\x08", 8);
    const Target target = make(unit);
    EXPECT_EQ(target.fcId, 0x010203u);
    EXPECT_EQ(target.nodeWWN, "50060160C6E01A2B");
    EXPECT_EQ(target.portWWN, "5006016446E01A2B");
    EXPECT_EQ(target.fcpLun, 0x0102030400000000u);
    EXPECT_EQ(target.osDeviceName, std::string(256, 'd'));
    EXPECT_EQ(target.scsiBusNumber, 4u);
    EXPECT_EQ(target.scsiTargetNumber, 5u);
    EXPECT_EQ(target.scsiOSLun, 6u);
    EXPECT_EQ(target.deviceType, 5u);
    EXPECT_EQ(target.vendor, "VENDOR12");
    EXPECT_EQ(target.product, "PRODUCT 12345678");
    EXPECT_EQ(target.revision, "4321");
    EXPECT_EQ(target.serialNumber, "SN123");
    EXPECT_EQ(target.lastLBA, 0x80FFFFFEu);
    EXPECT_EQ(target.blockLength, 520u);
    EXPECT_EQ(target.descriptor.deviceType, 0u);
    EXPECT_EQ(target.descriptor.pageCode, 0x83u);
    EXPECT_EQ(target.descriptor.pageLength, 20u);
    EXPECT_EQ(target.descriptor.identifierType, 3u);
    EXPECT_EQ(target.descriptor.identifierLength, 16u);
    EXPECT_EQ(descriptorText(target.descriptor), "60060160203031323334353637383941");
    EXPECT_EQ(fake_library.openHandles, 0);
}

TEST_F(Target_Test, CheckConditionsAreRetriedTwiceAndOthersNot) {
    const struct {
        std::deque<HBA_STATUS> script;
        std::size_t sent;
        bool answered;
        const char* line;
    } rows[] = {
        {{9, 0}, 2, true, "5:HBA_SendScsiInquiry_t(0x80) returns 9."},
        {{9, 9, 0}, 3, true, "5:HBA_SendScsiInquiry_t(0x80) returns 9."},
        {{9, 9, 9, 0}, 3, false, "5:HBA_SendScsiInquiry_t(0x80) returns 9."},
        {{9, 1, 0}, 2, false, "5:HBA_SendScsiInquiry_t(0x80) returns 1."},
        {{7, 0}, 1, false, "5:HBA_SendScsiInquiry_t(0x80) returns 7."},
    };
    Fake_Unit& unit = fake_san.add(1);
    unit.responses[INQUIRY] = standard_inquiry(1, "V", "P", "R");
    unit.responses[SERIAL_PAGE] = std::string(4, '\0') + "S";
    unit.responses[IDENTITY_PAGE] = identity_page(8, "12345678");
    unit.responses[READ_CAPACITY] = std::string("\0\0\0\x01\0\0\x02\0", 8);
    for (const auto& row : rows) {
        for (int command = 0; command < FAKE_COMMANDS; ++command) {
            unit.status = {};
            unit.status[static_cast<std::size_t>(command)] = row.script;
            fake_san.commands.clear();
            const Target target = make(unit);
            EXPECT_EQ(fake_san.commands.size(), 3 + row.sent);
            const bool known[] = {
                target.deviceType == 1 && target.vendor == "V       " &&
                    target.product == "P               " && target.revision == "R   ",
                target.serialNumber == "S", target.descriptor.identifierLength == 8,
                target.lastLBA == 1 && target.blockLength == 512};
            const bool unknown[] = {target.deviceType == 0 && target.vendor == "Unknown" &&
                                        target.product == "Unknown" && target.revision == "Unknown",
                                    target.serialNumber == "Unknown",
                                    descriptorText(target.descriptor).empty() &&
                                        target.descriptor.pageCode == 0,
                                    target.lastLBA == 0 && target.blockLength == 0};
            for (int other = 0; other < FAKE_COMMANDS; ++other)
                EXPECT_TRUE(other != command || row.answered ? known[other] : unknown[other])
                    << "command " << other << " with trouble in " << command;
            EXPECT_EQ(logged(row.line), row.answered ? 0 : 1);
        }
    }
}

TEST_F(Target_Test, SenseDataOfTheIdentityPageAreLogged) {
    Fake_Unit& unit = fake_san.add(1);
    unit.sense = std::string("\x70\0\x05", 3) + std::string(40, '\xAB');
    unit.status[INQUIRY] = {9, 9, 9};
    unit.status[IDENTITY_PAGE] = {9, 9, 9};
    make(unit);
    std::string line = "5:Sense Data: 70 00 05 ";
    for (int i = 3; i < 24; ++i)
        line += "ab ";
    EXPECT_EQ(logged(line), 1);
    unit.status[IDENTITY_PAGE] = {9, 9, 2};
    make(unit);
    EXPECT_EQ(logged(line), 0);
}

} // namespace cimple
