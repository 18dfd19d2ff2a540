// BArchivable: objects that can be put into a message and made anew from it.
#pragma once

#include <Message.h>

class BArchivable {
  public:
    BArchivable();
    // Reads what Archive() wrote; derived classes take their own fields out of `from`.
    explicit BArchivable(BMessage* from);
    virtual ~BArchivable();

    // Adds the object to `into`; the base class adds the name of the object's class to "class". `deep` asks
    // for the objects that belong to it too. B_BAD_VALUE for null.
    virtual status_t Archive(BMessage* into, bool deep = true) const;
    // A new object that the caller owns, or null. There is none of the base class.
    static BArchivable* Instantiate(BMessage* from);
    // Extension point; the base class answers B_NAME_NOT_FOUND.
    virtual status_t Perform(perform_code code, void* argument);
};

typedef BArchivable* (*instantiation_func)(BMessage*);

// The class whose name stands first among those of the archive and is registered makes a new object that the
// caller owns; null when none is or it refuses. Any thread.
BArchivable* instantiate_object(BMessage* from);
// Whether the archive is one of that class or of a class derived from it.
bool validate_instantiation(BMessage* from, const char* className);
// The function registered for a class, or null.
instantiation_func find_instantiation_func(const char* className);
instantiation_func find_instantiation_func(BMessage* archive);

// Makes `className` known to instantiate_object(). A later registration of the same name replaces the earlier
// one. Any thread.
void register_archivable(const char* className, instantiation_func function);

// Registers a class that has a static Instantiate(BMessage*); stands once in its source, outside functions.
#define REGISTER_ARCHIVABLE(Class)                                                                           \
    [[maybe_unused]] static const bool s##Class##IsRegistered =                                              \
        (register_archivable(#Class, &Class::Instantiate), true)
