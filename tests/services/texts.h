// Inputs and properties as a text: "CMMode=3 LPVIDValues=2,0" .
#ifndef TESTS_SERVICES_TEXTS_H
#define TESTS_SERVICES_TEXTS_H

#include "host/manager.h"

#include <sstream>

namespace services {

// Names that end in Values are lists of 16-bit numbers, P0 and P1 the protocols of ports, which are
// lists of texts; all others are small numbers.
inline host::Named_Values inputs_of(const std::string& text) {
    host::Named_Values all;
    std::istringstream rows(text);
    for (std::string row; rows >> row;) {
        std::string name = row.substr(0, row.find('='));
        std::istringstream items(row.substr(name.size() + 1));
        const bool is_port = name == "P0" || name == "P1", is_list = name.ends_with("Values");
        const CMPIType type = is_port ? CMPI_string : is_list ? CMPI_uint16 : CMPI_uint8;
        host::Value::Array values;
        for (std::string item; std::getline(items, item, ',');)
            values.push_back(is_port ? host::Value::text(item)
                                     : host::Value::unsigned_number(type, std::stoul(item)));
        if (is_port)
            name = "ConfigPort" + name.substr(1);
        all.push_back({name, is_port || is_list ? host::Value::array(type, std::move(values))
                                                : values.at(0)});
    }
    return all;
}

} // namespace services

#endif // TESTS_SERVICES_TEXTS_H
