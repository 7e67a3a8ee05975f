// What a user may do. Reading is for everybody who has logged in.
#pragma once

#include <string>
#include <utility>

namespace qelo::server {

class Permissions {
public:
    // Methods, and whatever else changes something, are for root and the members of `group`
    // (empty: root alone).
    explicit Permissions(std::string group) : group_(std::move(group)) {}

    // `user` empty: nobody in particular.
    bool mayChange(const std::string& user) const;

private:
    const std::string group_;
};

} // namespace qelo::server
