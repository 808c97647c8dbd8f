#pragma once

#include <filesystem>
#include <fstream>
#include <initializer_list>
#include <stdexcept>
#include <string>
#include <utility>

#include "hosts/machine/facts.h"

namespace Machine {

// A made-up machine: a directory that stands in for "/" and goes away with the object.
class MadeUpTree {
 public:
  // Each file is a path, with a slash at its start, and a content.
  MadeUpTree(std::initializer_list<std::pair<std::string, std::string>> files = {}) {
    std::string pattern = (std::filesystem::temp_directory_path() / "machine-XXXXXX").string();
    if (mkdtemp(pattern.data()) == nullptr) throw std::runtime_error("no temporary directory");
    _root = pattern;
    for (const auto& [path, content] : files) Write(path, content);
  }
  ~MadeUpTree() {
    std::error_code error;
    std::filesystem::remove_all(_root, error);
  }
  MadeUpTree(const MadeUpTree&) = delete;
  MadeUpTree& operator=(const MadeUpTree&) = delete;

  void Write(const std::string& path, const std::string& content) {
    std::filesystem::create_directories(Inside(path).parent_path());
    std::ofstream(Inside(path), std::ios::binary) << content;
  }

  // A relative link, as the kernel makes them, to another path of the tree, which is made as a
  // directory.
  void Link(const std::string& path, const std::string& target) {
    const std::filesystem::path directory = Inside(path).parent_path();
    std::filesystem::create_directories(Inside(target));
    std::filesystem::create_directories(directory);
    std::filesystem::create_directory_symlink(std::filesystem::relative(Inside(target), directory),
                                              Inside(path));
  }

  Sources AsSources() const { return {_root}; }

 private:
  std::filesystem::path Inside(const std::string& path) const { return _root + path; }

  std::string _root;
};

}  // namespace Machine
