// What one compilation has gathered for one namespace, with the tables that find it by name.
#pragma once

#include "host/cim/names.h"
#include "host/mof/compiler.h"

#include <cstddef>
#include <map>
#include <string>
#include <string_view>

namespace velkhost::mof {

// Names declared so far, each with its place and its index among its like.
class NameTable {
  public:
    struct Entry {
        Position position;
        std::size_t index = 0;
    };

    // The earlier declaration of that name; nullptr when the name is new and now entered.
    const Entry *declare(std::string_view name, const Position &position) {
        const auto [place, added] =
            entries_.try_emplace(std::string{name}, Entry{position, entries_.size()});
        return added ? nullptr : &place->second;
    }

    [[nodiscard]] const Entry *find(std::string_view name) const {
        const auto found = entries_.find(name);
        return found == entries_.end() ? nullptr : &found->second;
    }

  private:
    std::map<std::string, Entry, cim::NameLess> entries_;
};

struct Unit {
    NamespaceUnit result;
    NameTable classes;     // known ones of the repository included, so their index says nothing
    NameTable qualifiers;  // index into result.qualifiers

    [[nodiscard]] const QualifierDecl *find_qualifier(std::string_view name) const {
        const NameTable::Entry *entry = qualifiers.find(name);
        return entry == nullptr ? nullptr : &result.qualifiers[entry->index];
    }
};

}  // namespace velkhost::mof
