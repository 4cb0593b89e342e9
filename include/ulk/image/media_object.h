// ulkMediaObject: the abstract base of every piece of media a host hands to an
// effect instance as an input or an output.
//
// A host instance keeps plain pointers to media objects per input and output
// index; it neither copies nor owns them. The only concrete media type of the
// library is ulkImage, whose ClassName answers "Image". Media objects derive
// from ulkNode so that they can be kept in a ulkList. Not thread-safe.
#ifndef ULK_IMAGE_MEDIA_OBJECT_H
#define ULK_IMAGE_MEDIA_OBJECT_H

#include "ulk/core/list.h"
#include "ulk/export.h"

/// Abstract media: a list node with a virtual destructor and a class name.
class ULK_API ulkMediaObject : public ulkNode {
  public:
    /// In no list.
    ulkMediaObject() {}
    /// There is nothing to copy but the node part; the copy is in no list.
    ulkMediaObject(const ulkMediaObject&) : ulkNode() {}
    /// Nothing to copy; this object stays in the list it is in.
    ulkMediaObject& operator=(const ulkMediaObject&) { return *this; }
    /// Destroys the most derived object; deleting through this base releases its memory.
    virtual ~ulkMediaObject();

    /// Static text naming the concrete type ("Image" for ulkImage); never released by the caller.
    virtual const char* ClassName() const = 0;
};

#endif  // ULK_IMAGE_MEDIA_OBJECT_H
