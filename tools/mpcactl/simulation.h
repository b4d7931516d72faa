// A simulated host for the module: the simulator's libraries, loaded so that the module finds them.
#ifndef MPCACTL_SIMULATION_H
#define MPCACTL_SIMULATION_H

#include "simulator/vlnsim.h"
#include "tools/mpcactl/settings.h"

#include <filesystem>
#include <string>
#include <vector>

namespace mpcactl {

// Lives longer than the module that uses it.
class Simulation {
public:
    // The scenario is a path, or the name of a scenario with or without ".json". The host's files
    // stand in the root folder given, in that of the kept state, or in a fresh temporary folder,
    // which goes with the simulation. Throws Usage_Error.
    explicit Simulation(const Session_Settings& settings);
    ~Simulation();
    Simulation(const Simulation&) = delete;
    Simulation& operator=(const Simulation&) = delete;

    // The module that is built for simulation.
    static std::string module_path();

    // The file with what is the platform's own; "" for none.
    std::string platform() const;
    // Changes a value of the hardware; a value that is neither null nor a JSON object is a text,
    // which numbers may be as well. Throws Usage_Error.
    void set_value(const std::string& port, const std::string& table, const std::string& name,
                   const std::string& value);
    // Starts the host anew.
    void reboot();
    void act(const std::string& port, vlnsim_action action); // Usage_Error: unknown port
    // Writes a line to the log of the host.
    void log(const std::string& line);
    // Writes a firmware image of so many bytes behind its head. Throws Usage_Error.
    void write_firmware(const std::string& file, const std::string& model,
                        const std::string& version, std::size_t size);
    // Breaches of the libraries' contract by the provider, from that of this number on.
    std::vector<std::string> violations(std::size_t from) const;
    // Writes the state that is to be kept, if any. Throws Usage_Error.
    void keep();

private:
    template <class Function>
    Function* function(const char* name) const;
    void open_kept(const std::filesystem::path& folder);
    void prepare_root(std::filesystem::path root);

    void* _library = nullptr;
    std::string _temporary_root; // "": the root is the user's
    std::string _state;          // the file of the kept state; "": none
    int _lock = -1;              // of the folder of the kept state
};

} // namespace mpcactl

#endif // MPCACTL_SIMULATION_H
