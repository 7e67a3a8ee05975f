// The broker's knowledge of classes, from a repository.
#pragma once

#include "Hooks.h"

#include <schema/ClassRepository.h>

#include <memory>

namespace qelo::broker {

SchemaHooks schemaHooks(std::shared_ptr<const schema::ClassRepository> repository);

} // namespace qelo::broker
