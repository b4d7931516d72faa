// A simulated host for the module: the simulator's libraries, loaded so that the module finds them.
#ifndef MPCACTL_SIMULATION_H
#define MPCACTL_SIMULATION_H

#include "simulator/vlnsim.h"

#include <string>
#include <vector>

namespace mpcactl {

// Lives longer than the module that uses it.
class Simulation {
public:
    // scenario is a path, or the name of a scenario with or without ".json". An empty host_root
    // gives the host a fresh temporary folder, which goes with the simulation. Throws Usage_Error.
    Simulation(const std::string& scenario, const std::string& host_root, bool trace);
    ~Simulation();
    Simulation(const Simulation&) = delete;
    Simulation& operator=(const Simulation&) = delete;

    // The module that is built for simulation.
    static std::string module_path();
    // Breaches of the libraries' contract by the provider.
    std::vector<std::string> violations() const;

private:
    template <class Function>
    Function* function(const char* name) const;
    void prepare_root(const std::string& given);

    void* _library = nullptr;
    std::string _temporary_root; // "": the root is the user's
};

} // namespace mpcactl

#endif // MPCACTL_SIMULATION_H
