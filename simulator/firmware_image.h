// Firmware images for simulated adapters, in a format of our own (docs/simulator.md).
#ifndef VLNSIM_FIRMWARE_IMAGE_H
#define VLNSIM_FIRMWARE_IMAGE_H

#include <cstddef>
#include <string>

namespace vlnsim {

struct Firmware_Image {
    enum class State { unreadable, no_image, damaged, whole };

    State state = State::unreadable;
    std::string model;   // of the adapters that it is for
    std::string version; // what they run then
};

// Reads a file to its end. model and version are known of a damaged image too.
Firmware_Image read_firmware(const char* path);

// An image with so many bytes behind its head. Throws std::invalid_argument for a model or version
// that does not fit into a line.
std::string firmware_image(const std::string& model, const std::string& version, std::size_t size);

} // namespace vlnsim

#endif // VLNSIM_FIRMWARE_IMAGE_H
