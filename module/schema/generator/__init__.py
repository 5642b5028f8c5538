"""Turns the MOF of the catalogue into C++: records, metadata tables, skeletons, registration, factories."""
