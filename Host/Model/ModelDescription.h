#pragma once

#include <string>

class Component;
class ComponentParam;
class Project;
class Sequence;
class TrackItem;

// Canonical text of the model's state, one object a line, indented by ownership, for tests that
// compare states ("undo of everything restores the exact original"). It covers everything an
// edit can change and nothing that is not state (stations, the undo history, the clipboard).
// Ids are included, so an object replaced by an equal copy shows as a difference.
std::string DescribeForTest(const Project& project);
std::string DescribeForTest(const Sequence& sequence);
std::string DescribeForTest(const TrackItem& item);
std::string DescribeForTest(const Component& component);
std::string DescribeForTest(const ComponentParam& param);
