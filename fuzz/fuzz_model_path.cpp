// Object paths in text: of a plain class, of one with a number among its keys, and of associations,
// whose keys are paths themselves.
#include "classes/VLNMPCA_Card.h"
#include "classes/VLNMPCA_Container.h"
#include "classes/VLNMPCA_EthernetPort.h"
#include "classes/VLNMPCA_ProviderConfigSetting.h"
#include "fuzz/fuzz.h"

using namespace cimple;

extern "C" int LLVMFuzzerTestOneInput(const std::uint8_t* data, std::size_t size) {
    fuzz::listen_to_log();
    const std::string text = fuzz::Input(data, size).rest();
    for (const Meta_Class* meta_class :
         {&VLNMPCA_Card::static_meta_class, &VLNMPCA_Container::static_meta_class,
          &VLNMPCA_EthernetPort::static_meta_class,
          &VLNMPCA_ProviderConfigSetting::static_meta_class}) {
        const Ref<Instance> instance(model_path_to_instance(meta_class, text.c_str()));
        if (!instance)
            continue;
        FUZZ_CHECK(keys_all_set(instance.get()));
        String path;
        if (instance_to_model_path(instance.get(), path) != 0)
            continue;
        const Ref<Instance> again(model_path_to_instance(meta_class, path.c_str()));
        FUZZ_CHECK(again);
        FUZZ_CHECK(key_eq(instance.get(), again.get()));
    }
    return 0;
}
