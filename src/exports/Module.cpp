// The module's own translation unit: the exported functions live beside it, one file per family.
