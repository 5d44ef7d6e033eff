#pragma once

#include "Descriptor.h"
#include "OutputFile.h"

#include <string>

/// A file that takes its place when it is whole. Until then it has no name, so that it vanishes with the
/// process, or, where the file system wants one, a hidden name in its folder, which the destructor removes.
/// All functions return errno or 0; the first failure ends the use of the object.
class NewFile {
public:
    explicit NewFile(const std::string& place) : m_Place(place) {}
    NewFile(const NewFile&) = delete;
    NewFile& operator=(const NewFile&) = delete;
    ~NewFile();

    int OpenUnnamed(mode_t mode);
    int OpenNamed(mode_t mode);
    /// Gives the file the mode, the access list and, as far as that is permitted, the owner of another one.
    int Resemble(const Descriptor& other);
    int Fill(const OutputWriter& write, Durability durability);
    /// Brings what was filled, and what else was set, to the disk if that is wanted.
    int Secure(Durability durability) const;
    /// Gives the hidden name to a file without name.
    int TakeName();
    /// Closes the file and puts it into its place. It must have a name.
    int TakePlace(Durability durability);

private:
    template <class Take> int FindName(const Take& take);
    int ChangePlaces();
    int RemoveOther();

    const std::string m_Place;
    Descriptor m_File;
    std::string m_Name; // empty if there is none
};
