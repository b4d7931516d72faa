#include "tests/operations/fake_bound.h"

#include <cstring>

Fake_Bound fake;

AX_STATUS AX_InitLib(void) {
    return fake.initLib();
}

AX_STATUS AX_GetVersion(char* text, uint32_t* size) {
    return fake.version(text, size);
}

AX_STATUS AX_NimaVersion(char* text, uint32_t* size) {
    return fake.version(text, size);
}

// Fills the buffer to the last byte when the text is that long, as a careless library would.
AX_STATUS AX_StatusString(AX_STATUS, char* text, uint32_t size) {
    std::strncpy(text, fake.statusText, size);
    return AX_STATUS_OK;
}

AX_STATUS AX_IsLocalHBA(AX_WWN, uint32_t* isLocal) {
    *isLocal = fake.isLocal;
    return fake.isLocalStatus;
}

AX_STATUS AX_GetHBAFeature(AX_WWN, uint32_t identifier, uint32_t* value) {
    fake.featureQueries.push_back(identifier);
    const auto failure = fake.featureFailures.find(identifier);
    if (failure != fake.featureFailures.end())
        return failure->second;
    *value = fake.features[identifier];
    return AX_STATUS_OK;
}

AX_STATUS AX_GetHBAFeatureList(AX_WWN wwn, uint32_t size, uint8_t* list) {
    return size == AX_FEATURE_LIST_SIZE ? fake.featureList(wwn, list) : AX_STATUS_ERROR;
}

AX_STATUS AX_GetServerAttributes(AX_ServerAttributes* attributes) {
    return fake.serverAttributes ? fake.serverAttributes(attributes) : AX_STATUS_ERROR;
}
