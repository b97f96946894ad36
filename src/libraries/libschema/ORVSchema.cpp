#include "ORVSchema.h"

ORVSchema::ORVSchema() = default;

ORVSchema::~ORVSchema() = default;
