// The HBA API: handles, target mappings and SCSI commands.
#include "tests/simulator/simulated.h"

#include <cstring>
#include <set>
#include <vendorhbaapi.h>

namespace {

// A mapping with room for so many entries, and one more that must stay as it is.
class Mapping {
public:
    explicit Mapping(std::uint32_t room)
        : _words((sizeof(HBA_FCPTARGETMAPPING) + room * sizeof(HBA_FCPSCSIENTRY)) / 8 + 1,
                 0x7777777777777777u) {
        get()->NumberOfEntries = room;
    }
    HBA_FCPTARGETMAPPING* get() { return reinterpret_cast<HBA_FCPTARGETMAPPING*>(_words.data()); }
    const HBA_FCPSCSIENTRY& entry(std::uint32_t index) { return get()->entry[index]; }

private:
    std::vector<std::uint64_t> _words;
};

class San : public Simulated {
protected:
    HBA_HANDLE open_adapter(std::uint32_t index) {
        char name[256] = "";
        EXPECT_EQ(0u, HBA(HBA_GetAdapterName)(index, name));
        const HBA_HANDLE handle = HBA(HBA_OpenAdapter)(name);
        EXPECT_NE(0u, handle);
        return handle;
    }
    struct Answer {
        HBA_STATUS status;
        std::string response; // as many bytes as were told to be read
        std::string sense;
    };
    Answer inquire(HBA_HANDLE handle, const HBA_FCPSCSIENTRY& entry, HBA_UINT8 evpd,
                   HBA_UINT32 page, std::size_t bytes) {
        char response[256] = "", sense[128] = "";
        const HBA_STATUS status =
            HBA(HBA_SendScsiInquiry)(handle, entry.FcpId.PortWWN, entry.FcpId.FcpLun, evpd, page,
                                     response, 255, sense, sizeof sense);
        return {status, std::string(response, bytes), std::string(sense, 14)};
    }
    Answer read_capacity(HBA_HANDLE handle, const HBA_FCPSCSIENTRY& entry) {
        char response[8] = "", sense[128] = "";
        const HBA_STATUS status =
            HBA(HBA_SendReadCapacity)(handle, entry.FcpId.PortWWN, entry.FcpId.FcpLun, response,
                                      sizeof response, sense, sizeof sense);
        return {status, std::string(response, sizeof response), std::string(sense, 14)};
    }
};

TEST_F(San, TheHbaApiKnowsTheFcoeFunctions) {
    start("two-port-cna.json");
    ASSERT_EQ(2u, HBA(HBA_GetNumberOfAdapters)());
    char name[256] = "kept";
    EXPECT_EQ(HBA_STATUS_ERROR_ILLEGAL_INDEX, HBA(HBA_GetAdapterName)(2, name));
    EXPECT_STREQ("kept", name);
    const HBA_HANDLE handle = open_adapter(1);
    HBA_ADAPTERATTRIBUTES adapter{};
    ASSERT_EQ(0u, HBA(HBA_GetAdapterAttributes)(handle, &adapter));
    EXPECT_STREQ("VR10420117", adapter.SerialNumber);
    EXPECT_EQ(1u, adapter.NumberOfPorts);
    HBA_PORTATTRIBUTES port{};
    ASSERT_EQ(0u, HBA(HBA_GetAdapterPortAttributes)(handle, 0, &port));
    const AX_WWN wwn = wwn_of(5);
    EXPECT_EQ(0, std::memcmp(&wwn, port.PortWWN.wwn, 8)) << "both libraries tell the same name";
    EXPECT_EQ(HBA_STATUS_ERROR_ILLEGAL_INDEX, HBA(HBA_GetAdapterPortAttributes)(handle, 1, &port));
    EXPECT_EQ(1u, vlnsim_open_handles());
    HBA(HBA_CloseAdapter)(handle);
    EXPECT_EQ(0u, vlnsim_open_handles());
    EXPECT_EQ(0u, vlnsim_violations());
    EXPECT_EQ(HBA_STATUS_ERROR_INVALID_HANDLE, HBA(HBA_GetAdapterPortAttributes)(handle, 0, &port));
    HBA(HBA_CloseAdapter)(handle);
    EXPECT_EQ(2u, vlnsim_violations());
    char empty[] = "";
    EXPECT_EQ(0u, HBA(HBA_OpenAdapter)(empty));
}

TEST_F(San, AVendorLibraryOffersTheSameThroughATable) {
    start("two-port-cna.json");
    const Opened_Library vendor(VLN_SIMULATOR_DIR "/libvlnhba.so");
    ASSERT_TRUE(vendor) << dlerror();
    HBA_ENTRYPOINTS table{};
    ASSERT_EQ(0u, (*vendor.find<HBA_STATUS(HBA_ENTRYPOINTS*)>("HBA_RegisterLibrary"))(&table));
    EXPECT_EQ(2u, table.GetNumberOfAdaptersHandler());
    char name[256];
    ASSERT_EQ(0u, table.GetAdapterNameHandler(0, name));
    // Handles have 16 bits, however many were opened before.
    for (unsigned i = 0; i < 70000; ++i) {
        const HBA_HANDLE handle = table.OpenAdapterHandler(name);
        ASSERT_TRUE(handle > 0 && handle <= 0xFFFF) << handle;
        table.CloseAdapterHandler(handle);
    }
}

TEST_F(San, AMappingThatIsTooSmallTellsWhatItNeeds) {
    start("san-4096-luns.json");
    const HBA_HANDLE handle = open_adapter(0);
    Mapping small(256);
    EXPECT_EQ(HBA_STATUS_ERROR_MORE_DATA, HBA(HBA_GetFcpTargetMapping)(handle, small.get()));
    EXPECT_EQ(2048u, small.get()->NumberOfEntries);
    EXPECT_EQ(0x77777777u, small.entry(256).ScsiId.ScsiBusNumber) << "beyond the stated room";
    Mapping whole(2048);
    ASSERT_EQ(0u, HBA(HBA_GetFcpTargetMapping)(handle, whole.get()));
    std::set<std::string> ports, units;
    for (std::uint32_t i = 0; i < 2048; ++i) {
        const HBA_FCPID& id = whole.entry(i).FcpId;
        const std::string port(reinterpret_cast<const char*>(id.PortWWN.wwn), 8);
        ports.insert(port);
        units.insert(port + std::to_string(id.FcpLun));
    }
    EXPECT_EQ(8u, ports.size());
    EXPECT_EQ(2048u, units.size());
    EXPECT_EQ(255u, whole.entry(255).ScsiId.ScsiOSLun);
}

TEST_F(San, AMappingGrowsAndGoesByUnitsWhereTheScenarioSaysSo) {
    start_text(R"({"cards": [{"type": "fcoe", "model": "M", "wwpn": "1000024500000001",
        "functions": [{}], "hba": {"order": "units"},
        "targets": [{"number": 7, "luns": [{"count": 2}, {"fromCall": 2}]},
                    {"number": 8, "luns": [{"vendor": {"bytes": "41FF"}}]}]}]})");
    const HBA_HANDLE handle = open_adapter(0);
    const std::string expected[] = {"7:0 8:0 7:1 ", "7:0 8:0 7:1 7:2 "};
    for (const std::string& order : expected) {
        Mapping mapping(8);
        ASSERT_EQ(0u, HBA(HBA_GetFcpTargetMapping)(handle, mapping.get()));
        std::string seen;
        for (std::uint32_t i = 0; i < mapping.get()->NumberOfEntries; ++i)
            seen += std::to_string(mapping.entry(i).ScsiId.ScsiTargetNumber) + ":" +
                    std::to_string(mapping.entry(i).ScsiId.ScsiOSLun) + " ";
        EXPECT_EQ(order, seen);
        EXPECT_EQ("A\xFF      ", inquire(handle, mapping.entry(1), 0, 0, 16).response.substr(8));
    }
}

TEST_F(San, UnitsAnswerInquiriesOfTheirType) {
    start("san-4096-luns.json");
    const HBA_HANDLE handle = open_adapter(1);
    Mapping mapping(2048);
    ASSERT_EQ(0u, HBA(HBA_GetFcpTargetMapping)(handle, mapping.get()));
    const HBA_FCPSCSIENTRY& disk = mapping.entry(256);
    const Answer inquiry = inquire(handle, disk, 0, 0, 36);
    EXPECT_EQ(0u, inquiry.status);
    EXPECT_EQ(0, inquiry.response[0]);
    EXPECT_EQ("VORLAN  SIM ARRAY 1     0001", inquiry.response.substr(8));
    EXPECT_EQ(std::string("\0\x80\0\x09P1T01L000", 13),
              inquire(handle, disk, 1, 0x80, 13).response);
    EXPECT_EQ(std::string("\0\x83\0\x14\x01\x03\0\x10\x60\x25\x64\xC0", 12),
              inquire(handle, disk, 1, 0x83, 12).response);
    EXPECT_EQ(std::string("\0\x1F\xFF\xFF\0\0\x02\0", 8), read_capacity(handle, disk).response);
    std::set<int> types;
    for (std::uint32_t i = 0; i < 16; ++i)
        types.insert(inquire(handle, mapping.entry(i), 0, 0, 1).response[0]);
    EXPECT_EQ((std::set<int>{0, 1, 3, 4, 5, 6, 7, 8, 12, 13, 14, 17, 31}), types);
    // A tape has no capacity to read: illegal request, invalid command.
    const Answer tape = read_capacity(handle, mapping.entry(3));
    EXPECT_EQ(HBA_STATUS_SCSI_CHECK_CONDITION, tape.status);
    EXPECT_EQ(5, tape.sense[2]);
    EXPECT_EQ(0x20, tape.sense[12]);
}

TEST_F(San, UnitsFailAsTheScenarioSays) {
    start("flaky.json");
    vlnsim_clear_faults();
    const HBA_HANDLE handle = open_adapter(0);
    Mapping mapping(6);
    EXPECT_EQ(HBA_STATUS_ERROR_STALE_DATA, HBA(HBA_GetFcpTargetMapping)(handle, mapping.get()));
    EXPECT_EQ(HBA_STATUS_ERROR_STALE_DATA, HBA(HBA_GetFcpTargetMapping)(handle, mapping.get()));
    HBA(HBA_RefreshInformation)(handle);
    ASSERT_EQ(0u, HBA(HBA_GetFcpTargetMapping)(handle, mapping.get()));
    ASSERT_EQ(6u, mapping.get()->NumberOfEntries);
    // Two check conditions for each command, then an answer, and again at the next.
    for (int round = 0; round < 2; ++round) {
        EXPECT_EQ(9u, inquire(handle, mapping.entry(2), 0, 0, 1).status);
        EXPECT_EQ(9u, read_capacity(handle, mapping.entry(2)).status);
        EXPECT_EQ(6, inquire(handle, mapping.entry(2), 0, 0, 1).sense[2]) << "unit attention";
        EXPECT_EQ(0u, inquire(handle, mapping.entry(2), 0, 0, 1).status);
        EXPECT_EQ(9u, read_capacity(handle, mapping.entry(2)).status);
        EXPECT_EQ(0u, read_capacity(handle, mapping.entry(2)).status);
    }
    EXPECT_EQ(HBA_STATUS_ERROR, inquire(handle, mapping.entry(3), 0, 0, 1).status);
    EXPECT_EQ(9u, inquire(handle, mapping.entry(4), 1, 0x80, 1).status);
    EXPECT_EQ(std::string("\0\x83\0\x0C", 4),
              inquire(handle, mapping.entry(4), 1, 0x83, 4).response);
    EXPECT_EQ(20, inquire(handle, mapping.entry(5), 1, 0x83, 8).response[7]);
    EXPECT_EQ(9u, inquire(handle, mapping.entry(0), 1, 0xB0, 1).status) << "a page nobody has";
    HBA_FCPSCSIENTRY stranger = mapping.entry(0);
    stranger.FcpId.PortWWN.wwn[7] ^= 0xFF;
    EXPECT_EQ(HBA_STATUS_ERROR_ILLEGAL_WWN, inquire(handle, stranger, 0, 0, 1).status);
    EXPECT_EQ(1u, vlnsim_violations());
}

} // namespace
