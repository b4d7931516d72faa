#include "host/registration.h"

#include "host/manager.h"

#include <algorithm>
#include <sstream>

namespace host {

namespace {

bool contains(const std::vector<std::string>& names, std::string_view name) {
    return std::any_of(names.begin(), names.end(),
                       [&](const std::string& each) { return same_name(each, name); });
}

} // namespace

void Registration::read(const std::string& path) {
    const auto text = mof::read_file(path);
    if (!text)
        throw Setup_Error(path + ": cannot be read");
    std::istringstream lines(*text);
    std::vector<std::string>* section = nullptr;
    std::size_t number = 0;
    for (std::string line, word; std::getline(lines, line);) {
        ++number;
        std::istringstream words(line);
        if (!(words >> word))
            continue;
        if (word.starts_with('[') && word.ends_with(']')) {
            section = &_name_spaces[word.substr(1, word.size() - 2)];
            continue;
        }
        if (!section || !word.ends_with(':'))
            throw Setup_Error(path + ":" + std::to_string(number) +
                              ": \"[Class]\" or \"word: value\" expected");
        if (word != "namespace:")
            continue;
        while (words >> word) {
            section->push_back(word);
            if (!contains(_all, word))
                _all.push_back(word);
        }
    }
}

Status Registration::check_name_space(std::string_view name_space) const {
    if (_name_spaces.empty() || contains(_all, name_space))
        return {};
    return {CMPI_RC_ERR_INVALID_NAMESPACE, "nothing is registered in namespace " +
                                               std::string(name_space) +
                                               did_you_mean(name_space, _all)};
}

Status Registration::check(std::string_view class_name, std::string_view name_space) const {
    if (Status status = check_name_space(name_space); !status.ok() || _name_spaces.empty())
        return status;
    const auto found = _name_spaces.find(class_name);
    if (found == _name_spaces.end())
        return {CMPI_RC_ERR_NOT_SUPPORTED, std::string(class_name) + " is not registered"};
    if (contains(found->second, name_space))
        return {};
    return {CMPI_RC_ERR_INVALID_CLASS, std::string(class_name) + " is not registered in " +
                                           std::string(name_space) + " but in " +
                                           join_or(found->second)};
}

} // namespace host
